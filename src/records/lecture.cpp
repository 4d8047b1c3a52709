#include <carnet/lecture.h>

#include <carnet/element_types.h>
#include <carnet/numconv.h>

#include "records/record_internal.h"

using carnet_record::IsUsable;

template <class Self, bool Foresight>
double CLectNiv<Self, Foresight>::formatZ(double v) {
    return numconv::Round(v, m_DeciZ);
}

template <class Self, bool Foresight>
double CLectNiv<Self, Foresight>::formatXY(double v) {
    return numconv::Round(v, m_DeciXY);
}

template <class Self, bool Foresight>
int CLectNiv<Self, Foresight>::isOk() const {
    if (m_Np.IsEmpty() || !IsUsable(m_Lm)) return 0;
    return IsUndef(m_Dh) || IsUsable(m_Dh) ? 1 : 0;
}

template <class Self, bool Foresight>
int CLectNiv<Self, Foresight>::isTemp() const {
    return IsUndef(m_Lm) && IsUndef(m_Dh) ? 1 : 0;
}

// The staff reading is always shown, even absent; backsights start at column
// 0 and foresights are indented, and with the default decimals both put the
// distance at the same column.
template <class Self, bool Foresight>
void CLectNiv<Self, Foresight>::Params(CString& out) const {
    using numconv::SafeDecimals;
    out.Empty();
    if (Foresight) carnet_record::AppendBlanks(out, SafeDecimals(m_DeciZ) + 11);
    CString lm;  // its own text, so that the indent takes no separator
    carnet_record::AppendItem(lm, "LM", m_DeciZ, 3, m_Lm);
    out += lm;
    if (!(m_Dh >= 0.0)) return;  // absent (negative) or NaN
    if (!Foresight) carnet_record::AppendBlanks(out, SafeDecimals(m_DeciXY) + 11);
    carnet_record::AppendItem(out, "DH", m_DeciXY, 4, m_Dh);  // after " , "
}

template <class Self, bool Foresight>
void CLectNiv<Self, Foresight>::Infos(CString& out) const {
    using numconv::SafeDecimals;
    carnet_record::StartLine(out, TypeCode<Self>::value, m_Np);
    carnet_record::AppendColumn(out, m_Lm, 9, 6, SafeDecimals(m_DeciZ) + 3);
    carnet_record::AppendColumn(out, m_Dh, 10, 6, SafeDecimals(m_DeciXY) + 4);
    out += ' ';
    carnet_line::AppendMarkedSymbol(out, m_Sy);
}

template <class Self, bool Foresight>
void CLectNiv<Self, Foresight>::Print(CNorvexTxtWnd* wnd, int n) const {
    carnet_record::PrintLine(*this, wnd, n);
}

template <class Self, bool Foresight>
void CLectNiv<Self, Foresight>::Write(std::FILE* f, int n) const {
    carnet_record::WriteLine(*this, f, n);
}

template class CLectNiv<CLectAR, false>;
template class CLectNiv<CLectAV, true>;
