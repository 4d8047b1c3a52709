#include <carnet/reference.h>

#include <carnet/element_types.h>
#include <carnet/numconv.h>

#include "records/record_internal.h"

using carnet_record::IsUsable;

int CReference::m_DeciXY = 4;
int CReference::m_DeciZ = 4;
int CReference::m_DeciAng = 5;

CReference::CReference(const CString& np, double hp, double ah, double av, double di, const CString& sy)
    : m_Np(np), m_Hp(hp), m_Ah(ah), m_Av(av), m_Di(di), m_Sy(sy) {}
CReference::CReference(const char* np, double hp, double ah, double av, double di, const char* sy)
    : m_Np(np), m_Hp(hp), m_Ah(ah), m_Av(av), m_Di(di), m_Sy(sy) {}
CReference::CReference(const CString& np, double ah, const CString& sy) : m_Np(np), m_Ah(ah), m_Sy(sy) {}
CReference::CReference(const char* np, double ah, const char* sy) : m_Np(np), m_Ah(ah), m_Sy(sy) {}

double CReference::formatXY(double v) { return numconv::Round(v, m_DeciXY); }
double CReference::formatZ(double v) { return numconv::Round(v, m_DeciZ); }
double CReference::formatAng(double v) { return numconv::Round(v, m_DeciAng); }

int CReference::isOk() const {
    if (m_Np.IsEmpty() || !IsUsable(m_Ah)) return 0;
    const bool complete = IsUsable(m_Hp) && IsUsable(m_Av) && IsUsable(m_Di);
    const bool direction = IsUndef(m_Hp) && IsUndef(m_Av) && IsUndef(m_Di);
    return complete || direction ? 1 : 0;
}

int CReference::isTemp() const { return IsUndef(m_Ah) && IsUndef(m_Av) && IsUndef(m_Di) ? 1 : 0; }

void CReference::Params(CString& out) const {
    out.Empty();
    if (!IsUndef(m_Hp)) carnet_record::AppendItem(out, "HP", m_DeciZ, 4, formatZ(m_Hp));
    if (!IsUndef(m_Ah)) carnet_record::AppendItem(out, "AH", m_DeciAng, 4, formatAng(m_Ah));
    if (!IsUndef(m_Av)) carnet_record::AppendItem(out, "AV", m_DeciAng, 4, formatAng(m_Av));
    if (!IsUndef(m_Di)) carnet_record::AppendItem(out, "DI", m_DeciXY, 4, formatXY(m_Di));
}

void CReference::InfosAs(CString& out, unsigned int typeCode) {
    using numconv::SafeDecimals;
    carnet_record::StartLine(out, typeCode, m_Np);
    if (!IsUndef(m_Hp) && !IsUndef(m_Ah) && !IsUndef(m_Av) && !IsUndef(m_Di)) {
        // The usual complete observation: its four columns in one go.
        out.AppendFormat(" %9.6f %11.7f %11.7f %10.6f", m_Hp, m_Ah, m_Av, m_Di);
    } else {
        carnet_record::AppendColumn(out, m_Hp, 9, 6, SafeDecimals(m_DeciZ) + 4);
        carnet_record::AppendColumn(out, m_Ah, 11, 7, SafeDecimals(m_DeciAng) + 4);
        carnet_record::AppendColumn(out, m_Av, 11, 7, SafeDecimals(m_DeciAng) + 4);
        carnet_record::AppendColumn(out, m_Di, 10, 6, SafeDecimals(m_DeciXY) + 4);
    }
    carnet_line::MarkSpaces(m_Sy);  // the mark stays in the record
    out += ' ';
    out += m_Sy;
}

void CReference::Infos(CString& out) { InfosAs(out, TypeCode<CReference>::value); }
void CReference::Print(CNorvexTxtWnd* wnd, int n) { carnet_record::PrintLine(*this, wnd, n); }
void CReference::Write(std::FILE* f, int n) { carnet_record::WriteLine(*this, f, n); }

void CMesure::Infos(CString& out) { InfosAs(out, TypeCode<CMesure>::value); }
void CMesure::Print(CNorvexTxtWnd* wnd, int n) { carnet_record::PrintLine(*this, wnd, n); }
void CMesure::Write(std::FILE* f, int n) { carnet_record::WriteLine(*this, f, n); }
