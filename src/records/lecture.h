// Levelling staff readings: a backsight (CLectAR) and a foresight (CLectAV).
// The two are twins built on one template over the class itself; each has
// its own decimal counts, its own type code and keyword from the type table,
// and the foresight's display text is indented.
#pragma once

#include <cstdio>

#include <carnet/cstring.h>
#include <carnet/element_types.h>
#include <carnet/txtwnd.h>
#include <carnet/undef.h>

template <class Self, bool Foresight>
class CLectNiv {
protected:
    CString m_Np;
    double m_Lm = UNDEF_VALUE;  // staff reading
    double m_Dh = UNDEF_VALUE;  // horizontal distance from the level to the staff
    CString m_Sy;

    // One set per reading class.
    inline static int m_DeciZ = 4;
    inline static int m_DeciXY = 4;

public:
    CLectNiv() = default;
    CLectNiv(const CString& np, double lm, double dh, const CString& sy) : m_Np(np), m_Lm(lm), m_Dh(dh), m_Sy(sy) {}
    CLectNiv(const char* np, double lm, double dh, const char* sy) : m_Np(np), m_Lm(lm), m_Dh(dh), m_Sy(sy) {}

    CString& Np() { return m_Np; }
    const CString& Np() const { return m_Np; }
    CString& Sy() { return m_Sy; }
    const CString& Sy() const { return m_Sy; }
    void setNp(const CString& np) { m_Np = np; }
    void setNp(const char* np) { m_Np = np; }
    void setSy(const CString& sy) { m_Sy = sy; }
    void setSy(const char* sy) { m_Sy = sy; }
    double Lm() const { return m_Lm; }
    double Dh() const { return m_Dh; }
    void setLm(double v) { m_Lm = v; }
    void setDh(double v) { m_Dh = v; }

    static int DeciZ() { return m_DeciZ; }
    static int DeciXY() { return m_DeciXY; }
    static void setDeciZ(int n) { m_DeciZ = n; }
    static void setDeciXY(int n) { m_DeciXY = n; }

    double FormLm() const { return formatZ(m_Lm); }
    double FormDh() const { return formatXY(m_Dh); }

    // A number and a reading; the distance is optional.
    int isOk() const;
    // Neither reading nor distance.
    int isTemp() const;

    void Params(CString& out) const;
    // The symbol's blanks are marked "***" in the line only.
    void Infos(CString& out) const;
    void Print(CNorvexTxtWnd* wnd, int n) const;
    void Write(std::FILE* f, int n) const;

protected:
    static double formatZ(double v);
    static double formatXY(double v);
};

extern template class CLectNiv<CLectAR, false>;
extern template class CLectNiv<CLectAV, true>;

class CLectAR : public CLectNiv<CLectAR, false> {
public:
    using CLectNiv::CLectNiv;
};

class CLectAV : public CLectNiv<CLectAV, true> {
public:
    using CLectNiv::CLectNiv;
};
