#include <carnet/point.h>

#include <cmath>

#include <carnet/numconv.h>

#include "core/line_internal.h"
#include "records/record_internal.h"

int CPointGen::m_DeciXY = 4;
int CPointGen::m_DeciZ = 4;
int CPointGen::m_bSwapXY = 0;

CPointGen::CPointGen(const CString& np, double x, double y, double z, const CString& sy)
    : m_X(x), m_Y(y), m_Z(z), m_Np(np), m_Sy(sy) {}
CPointGen::CPointGen(const CString& np, double x, double y, const CString& sy)
    : m_X(x), m_Y(y), m_Np(np), m_Sy(sy) {}
CPointGen::CPointGen(const CString& np, double z, const CString& sy) : m_Z(z), m_Np(np), m_Sy(sy) {}
CPointGen::CPointGen(const char* np, double x, double y, double z, const char* sy)
    : m_X(x), m_Y(y), m_Z(z), m_Np(np), m_Sy(sy) {}
CPointGen::CPointGen(const char* np, double x, double y, const char* sy) : m_X(x), m_Y(y), m_Np(np), m_Sy(sy) {}
CPointGen::CPointGen(const char* np, double z, const char* sy) : m_Z(z), m_Np(np), m_Sy(sy) {}

int CPointGen::setPt(double x, double y, double z, int force) {
    if (!force && (m_bXConst || m_bZConst)) return 0;
    m_X = x;
    m_Y = y;
    m_Z = z;
    return 1;
}

int CPointGen::setPt(double x, double y, int force) {
    if (!force && m_bXConst) return 0;
    m_X = x;
    m_Y = y;
    return 1;
}

int CPointGen::setPt(double z, int force) {
    if (!force && m_bZConst) return 0;
    m_Z = z;
    return 1;
}

int CPointGen::hasXYZ() const { return !IsUndef(m_X) && !IsUndef(m_Y) && !IsUndef(m_Z) ? 1 : 0; }
int CPointGen::hasXY() const { return !IsUndef(m_X) && !IsUndef(m_Y) ? 1 : 0; }
int CPointGen::hasZ() const { return !IsUndef(m_Z) ? 1 : 0; }
int CPointGen::is3D() const { return isNamed() && hasXYZ() ? 1 : 0; }
int CPointGen::is2D() const { return isNamed() && hasXY() && !hasZ() ? 1 : 0; }
int CPointGen::is1D() const { return isNamed() && IsUndef(m_X) && IsUndef(m_Y) && hasZ() ? 1 : 0; }

int CPointGen::isOk() const {
    if (!isNamed()) return 0;
    const bool x = !IsUndef(m_X), y = !IsUndef(m_Y), z = !IsUndef(m_Z);
    // A given coordinate must be a number: NaN or an infinity would be
    // written as a word that does not read back as a coordinate.
    for (double v : {m_X, m_Y, m_Z})
        if (!IsUndef(v) && !std::isfinite(v)) return 0;
    if (x && y) return 1;             // 3D or 2D
    if (!x && !y && z) return 1;      // 1D
    if (!x && !y && !z && m_bZConst) return 1;  // placeholder kept for its height lock
    return 0;
}

int CPointGen::isTemp() const { return IsUndef(m_X) && IsUndef(m_Y) && IsUndef(m_Z) && !m_bZConst ? 1 : 0; }

double CPointGen::formatXY(double v) { return numconv::Round(v, m_DeciXY); }
double CPointGen::formatZ(double v) { return numconv::Round(v, m_DeciZ); }

void CPointGen::Params(CString& out) {
    out.Empty();
    const int dxy = numconv::SafeDecimals(m_DeciXY);
    const int dz = numconv::SafeDecimals(m_DeciZ);
    auto item = [&out](const char* label, int width, int decimals, double v) {
        if (!out.IsEmpty()) out += " , ";
        out.AppendFormat("%s = %*.*f", label, width, decimals, v);
    };
    if (!IsUndef(m_X)) item(m_bSwapXY ? "Y" : "X", dxy + 8, dxy, formatXY(m_X));
    if (!IsUndef(m_Y)) item(m_bSwapXY ? "X" : "Y", dxy + 8, dxy, formatXY(m_Y));
    if (!IsUndef(m_Z)) item("Z", dz + 6, dz, formatZ(m_Z));
    if (m_bXConst || m_bZConst) {
        if (!out.IsEmpty()) out += " , ";
        out.AppendFormat("CP = %d", LockCode());
    }
}

void CPointGen::Infos(CString& out) {
    out.Empty();
    carnet_line::AppendKeyword(out, "Point");
    out += ' ';
    carnet_line::AppendName(out, m_Np);
    carnet_line::MarkSpaces(m_Sy);  // the mark stays in the record
    out.AppendFormat(" %1.1d %14.6f %14.6f %12.6f %s", LockCode(), m_X, m_Y, m_Z, m_Sy.GetString());
}

void CPointGen::Print(CNorvexTxtWnd* wnd, int n) { carnet_record::PrintLine(*this, wnd, n); }
void CPointGen::Write(std::FILE* f, int n) { carnet_record::WriteLine(*this, f, n); }
