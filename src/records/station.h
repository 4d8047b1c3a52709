// How the following observations were made: the station set up on a point,
// the instrument in use and an eccentric offset (their type codes are in
// element_types.h).
#pragma once

#include <cstdio>

#include <carnet/cstring.h>
#include <carnet/txtwnd.h>
#include <carnet/undef.h>

class CStation {
protected:
    CString m_Np;
    double m_Hi = 0.0;
    double m_V0 = UNDEF_VALUE;  // grads
    CString m_Sy;

    static int m_DeciZ;
    static int m_DeciAng;

public:
    CStation() = default;
    CStation(const CString& np, double hi, double orientation, const CString& sy);
    CStation(const char* np, double hi, double orientation, const char* sy);
    CStation(const CStation&) = default;
    CStation& operator=(const CStation&) = default;
    ~CStation() = default;

    CString& Np() { return m_Np; }
    const CString& Np() const { return m_Np; }
    CString& Sy() { return m_Sy; }
    const CString& Sy() const { return m_Sy; }
    void setNp(const CString& np) { m_Np = np; }
    void setNp(const char* np) { m_Np = np; }
    void setSy(const CString& sy) { m_Sy = sy; }
    void setSy(const char* sy) { m_Sy = sy; }
    double Hi() const { return m_Hi; }
    double V0() const { return m_V0; }
    void setHi(double hi) { m_Hi = hi; }
    void setV0(double v0) { m_V0 = v0; }

    static int DeciZ() { return m_DeciZ; }
    static int DeciAng() { return m_DeciAng; }
    static void setDeciZ(int n) { m_DeciZ = n; }
    static void setDeciAng(int n) { m_DeciAng = n; }

    double FormHi() const { return formatZ(m_Hi); }
    double FormV0() const { return formatAng(m_V0); }

    int isOk() const;

    void Params(CString& out) const;
    // Writes an orientation that prints as 400 grads as 0, in the record too.
    void Infos(CString& out);
    void Print(CNorvexTxtWnd* wnd, int n);
    void Write(std::FILE* f, int n);

private:
    static double formatZ(double v);
    static double formatAng(double v);
};

class CAppareil {
protected:
    CString m_Name;
    double m_CollVert = 0.0;   // grads
    double m_CstePrism = 0.0;
    double m_SigmaAh = 0.005;  // grads
    double m_SigmaAv = 0.005;  // grads
    double m_SigmaDi = 0.05;
    double m_SigmaPpm = 5.0;

    static int m_DeciXY;
    static int m_DeciAng;

public:
    CAppareil() = default;
    CAppareil(const CString& name, double collVert, double cstePrism, double sigmaAh, double sigmaAv,
              double sigmaDi, double sigmaPpm);
    CAppareil(const CAppareil&) = default;
    CAppareil& operator=(const CAppareil&) = default;
    ~CAppareil() = default;

    double CollVert() const { return m_CollVert; }
    double CstePrism() const { return m_CstePrism; }
    double SigmaAh() const { return m_SigmaAh; }
    double SigmaAv() const { return m_SigmaAv; }
    double SigmaDi() const { return m_SigmaDi; }
    double SigmaPpm() const { return m_SigmaPpm; }
    void SetCollVert(double v) { m_CollVert = v; }
    void SetCstePrism(double v) { m_CstePrism = v; }
    void SetSigmaAh(double v) { m_SigmaAh = v; }
    void SetSigmaAv(double v) { m_SigmaAv = v; }
    void SetSigmaDi(double v) { m_SigmaDi = v; }
    void SetSigmaPpm(double v) { m_SigmaPpm = v; }

    static int DeciXY() { return m_DeciXY; }
    static int DeciAng() { return m_DeciAng; }
    static void setDeciXY(int n) { m_DeciXY = n; }
    static void setDeciAng(int n) { m_DeciAng = n; }

    double FormCollVert() const { return formatAng(m_CollVert); }
    double FormCstePrism() const { return formatXY(m_CstePrism); }
    double FormSigmaAh() const { return formatAng(m_SigmaAh); }
    double FormSigmaAv() const { return formatAng(m_SigmaAv); }
    double FormSigmaDi() const { return formatXY(m_SigmaDi); }

    void Params(CString& out) const;
    void Infos(CString& out) const;
    void Print(CNorvexTxtWnd* wnd, int n) const;
    void Write(std::FILE* f, int n) const;

private:
    static double formatXY(double v);
    static double formatAng(double v);
};

class CExcent {
protected:
    int m_Typ = -1;  // 0 radial, 1 tangential, 2 vertical, -1 not set
    double m_Val = 0.0;

public:
    CExcent() = default;
    CExcent(int typ, double val) : m_Typ(typ), m_Val(val) {}
    CExcent(const CExcent&) = default;
    CExcent& operator=(const CExcent&) = default;
    ~CExcent() = default;

    int getTyp() const { return m_Typ; }
    void setTyp(int typ) { m_Typ = typ; }
    double getVal() const { return m_Val; }
    void setVal(double val) { m_Val = val; }

    int isOk() const;
    int isTemp() const;

    // The keyword of the kind: "ExcentRad", "ExcentTan", "ExcentVer", or ""
    // for a kind that has none.
    const char* FileKeyword() const;

    void Params(CString& out) const;
    void Infos(CString& out) const;
    void Print(CNorvexTxtWnd* wnd, int n) const;
    void Write(std::FILE* f, int n) const;
};
