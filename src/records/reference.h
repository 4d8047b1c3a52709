// Observations made from a station: a reference to a known point and a
// measure of a point to be determined. Both hold the same fields; they
// differ only in the keyword of their file line.
#pragma once

#include <cstdio>

#include <carnet/cstring.h>
#include <carnet/txtwnd.h>
#include <carnet/undef.h>

class CReference {
protected:
    CString m_Np;
    double m_Hp = UNDEF_VALUE;  // target height
    double m_Ah = UNDEF_VALUE;  // horizontal angle, grads
    double m_Av = UNDEF_VALUE;  // vertical angle from the zenith, grads
    double m_Di = UNDEF_VALUE;  // slope distance
    CString m_Sy;

    static int m_DeciXY;
    static int m_DeciZ;
    static int m_DeciAng;

public:
    CReference() = default;
    // A complete observation.
    CReference(const CString& np, double hp, double ah, double av, double di, const CString& sy);
    CReference(const char* np, double hp, double ah, double av, double di, const char* sy);
    // A direction only.
    CReference(const CString& np, double ah, const CString& sy);
    CReference(const char* np, double ah, const char* sy);
    CReference(const CReference&) = default;
    CReference& operator=(const CReference&) = default;
    ~CReference() = default;

    CString& Np() { return m_Np; }
    const CString& Np() const { return m_Np; }
    CString& Sy() { return m_Sy; }
    const CString& Sy() const { return m_Sy; }
    void setNp(const CString& np) { m_Np = np; }
    void setNp(const char* np) { m_Np = np; }
    void setSy(const CString& sy) { m_Sy = sy; }
    void setSy(const char* sy) { m_Sy = sy; }
    double Hp() const { return m_Hp; }
    double Ah() const { return m_Ah; }
    double Av() const { return m_Av; }
    double Di() const { return m_Di; }
    void setHp(double v) { m_Hp = v; }
    void setAh(double v) { m_Ah = v; }
    void setAv(double v) { m_Av = v; }
    void setDi(double v) { m_Di = v; }

    static int DeciXY() { return m_DeciXY; }
    static int DeciZ() { return m_DeciZ; }
    static int DeciAng() { return m_DeciAng; }
    static void setDeciXY(int n) { m_DeciXY = n; }
    static void setDeciZ(int n) { m_DeciZ = n; }
    static void setDeciAng(int n) { m_DeciAng = n; }

    double FormHp() const { return formatZ(m_Hp); }
    double FormAh() const { return formatAng(m_Ah); }
    double FormAv() const { return formatAng(m_Av); }
    double FormDi() const { return formatXY(m_Di); }

    // Complete (HP, AH, AV, DI) or a direction only (AH alone), with a number.
    int isOk() const;
    // AH, AV and DI all absent.
    int isTemp() const;

    void Params(CString& out) const;
    void Infos(CString& out);
    void Print(CNorvexTxtWnd* wnd, int n);
    void Write(std::FILE* f, int n);

protected:
    static double formatXY(double v);
    static double formatZ(double v);
    static double formatAng(double v);

    // The file line under the given type code's keyword.
    void InfosAs(CString& out, unsigned int typeCode);
};

class CMesure : public CReference {
public:
    using CReference::CReference;
    CMesure() = default;
    CMesure(const CMesure&) = default;
    CMesure& operator=(const CMesure&) = default;
    ~CMesure() = default;

    void Infos(CString& out);
    void Print(CNorvexTxtWnd* wnd, int n);
    void Write(std::FILE* f, int n);
};
