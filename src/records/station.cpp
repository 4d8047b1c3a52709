#include <carnet/station.h>

#include <string_view>

#include <carnet/element_types.h>
#include <carnet/numconv.h>

#include "records/record_internal.h"

// ---- CStation ----

int CStation::m_DeciZ = 4;
int CStation::m_DeciAng = 5;

CStation::CStation(const CString& np, double hi, double orientation, const CString& sy)
    : m_Np(np), m_Hi(hi), m_V0(orientation), m_Sy(sy) {}
CStation::CStation(const char* np, double hi, double orientation, const char* sy)
    : m_Np(np), m_Hi(hi), m_V0(orientation), m_Sy(sy) {}

double CStation::formatZ(double v) { return numconv::Round(v, m_DeciZ); }
double CStation::formatAng(double v) { return numconv::Round(v, m_DeciAng); }

int CStation::isOk() const {
    if (m_Np.IsEmpty()) return 0;
    if (!(m_Hi >= 0.0) || !std::isfinite(m_Hi)) return 0;  // NaN fails the comparison
    if (IsUndef(m_V0)) return 1;
    return m_V0 >= 0.0 && m_V0 <= 400.0 ? 1 : 0;
}

void CStation::Params(CString& out) const {
    out.Empty();
    carnet_record::AppendItem(out, "HI", m_DeciZ, 4, formatZ(m_Hi));
    // An absent V0 is negative; a NaN one is not shown either.
    if (m_V0 >= 0.0) carnet_record::AppendItem(out, "V0", m_DeciAng, 4, formatAng(m_V0));
}

void CStation::Infos(CString& out) {
    carnet_record::StartLine(out, TypeCode<CStation>::value, m_Np);
    out.AppendFormat(" %9.6f ", m_Hi);
    // The file has no blank column for a missing orientation: -1 stands for it.
    const size_t v0At = out.str().size();
    out.AppendFormat("%11.7f", IsUndef(m_V0) ? -1.0 : m_V0);
    if (!IsUndef(m_V0) && numconv::Atof(std::string_view(out.str()).substr(v0At)) == 400.0) {
        m_V0 = 0.0;  // a full circle is kept as 0
        out.str().resize(v0At);
        out.AppendFormat("%11.7f", m_V0);
    }
    carnet_record::AppendBlanks(out, numconv::SafeDecimals(m_DeciZ) + numconv::SafeDecimals(m_DeciAng) + 11);
    carnet_line::MarkSpaces(m_Sy);  // the mark stays in the record
    out += m_Sy;
}

void CStation::Print(CNorvexTxtWnd* wnd, int n) { carnet_record::PrintLine(*this, wnd, n); }
void CStation::Write(std::FILE* f, int n) { carnet_record::WriteLine(*this, f, n); }

// ---- CAppareil ----

int CAppareil::m_DeciXY = 4;
int CAppareil::m_DeciAng = 5;

CAppareil::CAppareil(const CString& name, double collVert, double cstePrism, double sigmaAh, double sigmaAv,
                     double sigmaDi, double sigmaPpm)
    : m_Name(name),
      m_CollVert(collVert),
      m_CstePrism(cstePrism),
      m_SigmaAh(sigmaAh),
      m_SigmaAv(sigmaAv),
      m_SigmaDi(sigmaDi),
      m_SigmaPpm(sigmaPpm) {}

double CAppareil::formatXY(double v) { return numconv::Round(v, m_DeciXY); }
double CAppareil::formatAng(double v) { return numconv::Round(v, m_DeciAng); }

void CAppareil::Params(CString& out) const {
    out = m_Name;
    if (!IsUndef(m_CollVert)) carnet_record::AppendItem(out, "CV", m_DeciAng, 2, formatAng(m_CollVert));
    if (!IsUndef(m_CstePrism)) carnet_record::AppendItem(out, "C0", m_DeciXY, 2, formatXY(m_CstePrism));
    if (!IsUndef(m_SigmaAh)) carnet_record::AppendItem(out, "PH", m_DeciAng, 2, formatAng(m_SigmaAh));
    if (!IsUndef(m_SigmaAv)) carnet_record::AppendItem(out, "PV", m_DeciAng, 2, formatAng(m_SigmaAv));
    if (!IsUndef(m_SigmaDi) && !IsUndef(m_SigmaPpm)) {
        carnet_record::AppendItem(out, "PD", m_DeciXY, 2, formatXY(m_SigmaDi));
        out.AppendFormat(" + %.1f ppm", m_SigmaPpm);
    }
}

void CAppareil::Infos(CString& out) const {
    out.Empty();
    carnet_line::AppendKeyword(out, CarnetKeyword(TypeCode<CAppareil>::value));
    out.AppendFormat(" %.6f %.6f %.6f %.6f %.6f %.1f ", m_CollVert, m_CstePrism, m_SigmaAh, m_SigmaAv, m_SigmaDi,
                     m_SigmaPpm);
    // The name is the last word of the line and the reader needs one: an
    // instrument without a name is written under sixteen '?', like a point.
    CString trimmed(m_Name);
    if (trimmed.Trim().IsEmpty())
        carnet_line::AppendName(out, CString());
    else
        out += m_Name;
}

void CAppareil::Print(CNorvexTxtWnd* wnd, int n) const { carnet_record::PrintLine(*this, wnd, n); }
void CAppareil::Write(std::FILE* f, int n) const { carnet_record::WriteLine(*this, f, n); }

// ---- CExcent ----

int CExcent::isOk() const {
    return m_Typ >= 0 && m_Typ <= 2 && m_Val != 0.0 && std::isfinite(m_Val) ? 1 : 0;
}

int CExcent::isTemp() const { return m_Typ == -1 && m_Val == 0.0 ? 1 : 0; }

const char* CExcent::FileKeyword() const {
    if (m_Typ < 0 || m_Typ > 2) return "";
    return CarnetTypeInfo(TypeCode<CExcent>::value)->keywords[m_Typ];
}

void CExcent::Params(CString& out) const {
    const char* label = m_Typ == 0 ? "ER" : (m_Typ == 1 ? "ET" : "EV");
    out.Format("%s = %7.4f", label, m_Val);
}

void CExcent::Infos(CString& out) const {
    out.Empty();
    const char* keyword = FileKeyword();
    if (*keyword) carnet_line::AppendKeyword(out, keyword);
    // The blanks stand where the other records have their point number.
    carnet_record::AppendBlanks(out, 17);
    out.AppendFormat("%7.4f", m_Val);
}

void CExcent::Print(CNorvexTxtWnd* wnd, int n) const { carnet_record::PrintLine(*this, wnd, n); }
void CExcent::Write(std::FILE* f, int n) const { carnet_record::WriteLine(*this, f, n); }
