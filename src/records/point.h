// A point given by its coordinates (keyword "Point").
#pragma once

#include <cstdio>

#include <carnet/cstring.h>
#include <carnet/txtwnd.h>
#include <carnet/undef.h>

class CPointGen {
public:
    double m_X = UNDEF_VALUE;
    double m_Y = UNDEF_VALUE;
    double m_Z = UNDEF_VALUE;
    CString m_Np;
    CString m_Sy;
    int m_bXConst = 0;
    int m_bZConst = 0;

protected:
    static int m_DeciXY;
    static int m_DeciZ;
    static int m_bSwapXY;

public:
    CPointGen() = default;
    CPointGen(const CString& np, double x, double y, double z, const CString& sy);
    CPointGen(const CString& np, double x, double y, const CString& sy);
    CPointGen(const CString& np, double z, const CString& sy);
    CPointGen(const char* np, double x, double y, double z, const char* sy);
    CPointGen(const char* np, double x, double y, const char* sy);
    CPointGen(const char* np, double z, const char* sy);
    CPointGen(const CPointGen&) = default;
    CPointGen& operator=(const CPointGen&) = default;
    ~CPointGen() = default;

    CString& Np() { return m_Np; }
    const CString& Np() const { return m_Np; }
    CString& Sy() { return m_Sy; }
    const CString& Sy() const { return m_Sy; }
    void setNp(const CString& np) { m_Np = np; }
    void setNp(const char* np) { m_Np = np; }
    void setSy(const CString& sy) { m_Sy = sy; }
    void setSy(const char* sy) { m_Sy = sy; }

    void setXConst(int b) { m_bXConst = b; }
    void setZConst(int b) { m_bZConst = b; }
    void setPConst(int b) { m_bXConst = m_bZConst = b; }
    int isXConst() const { return m_bXConst; }
    int isZConst() const { return m_bZConst; }
    int isPConst() const { return m_bXConst && m_bZConst ? 1 : 0; }

    int setPt(double x, double y, double z, int force);
    int setPt(double x, double y, int force);
    int setPt(double z, int force);

    int hasXYZ() const;
    int hasXY() const;
    int hasZ() const;
    int is3D() const;
    int is2D() const;
    int is1D() const;
    int isOk() const;
    int isTemp() const;

    static int DeciXY() { return m_DeciXY; }
    static int DeciZ() { return m_DeciZ; }
    static void setDeciXY(int n) { m_DeciXY = n; }
    static void setDeciZ(int n) { m_DeciZ = n; }
    static void setSwapXY(int b) { m_bSwapXY = b; }
    static int SwapXY() { return m_bSwapXY; }

    double Formx() const { return formatXY(m_X); }
    double Formy() const { return formatXY(m_Y); }
    double Formz() const { return formatZ(m_Z); }

    void Params(CString& out);
    void Infos(CString& out);
    void Print(CNorvexTxtWnd* wnd, int n);
    void Write(std::FILE* f, int n);

    // The lock code of the display text and the file line: 1 planimetric,
    // 2 altimetric, 3 both.
    int LockCode() const { return (m_bXConst ? 1 : 0) + (m_bZConst ? 2 : 0); }

protected:
    static double formatXY(double v);
    static double formatZ(double v);

private:
    int isNamed() const { return m_Np.IsEmpty() ? 0 : 1; }
};
