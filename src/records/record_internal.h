// Pieces shared by the survey record classes: display items, value columns of
// the file line, and the Print/Write pair built on each class's Infos.
#pragma once

#include <cmath>
#include <cstdio>

#include <carnet/cstring.h>
#include <carnet/txtwnd.h>
#include <carnet/undef.h>

#include "core/line_internal.h"

namespace carnet_record {

// A value that a record can keep: present, and a real number (NaN or an
// infinity would be written as text that reads back as something else).
inline bool IsUsable(double v) { return !IsUndef(v) && std::isfinite(v); }

// Appends "LABEL = value" to a display text, with " , " before it when the
// text is not empty. The value is printed with `decimals` decimals in a field
// of `decimals` + `extraWidth` characters (the count made safe first).
void AppendItem(CString& out, const char* label, int decimals, int extraWidth, double v);

// Starts a record line: the keyword of the type code, one blank, the point
// number (sixteen '?' when empty).
void StartLine(CString& out, unsigned int typeCode, const CString& np);

// Appends `count` blanks (nothing for a count of 0 or less).
void AppendBlanks(CString& out, int count);

// Appends one blank, then the value printed "%W.Pf" or, when it is absent,
// the `blanksIfAbsent` blanks that stand for it in the file line.
void AppendColumn(CString& out, double v, int width, int precision, int blanksIfAbsent);

// The line of a record sent to the text window (nothing for a null window)
// or to a file, numbered when n > 0.
template <class R>
void PrintLine(R& record, CNorvexTxtWnd* wnd, int n) {
    if (!wnd) return;
    CString line;
    record.Infos(line);
    carnet_line::Emit(wnd, n, line);
}

// The text in which the writers build each line, kept from one line to the
// next (one per thread), so that writing a book allocates nothing per line.
CString& LineBuffer();

template <class R>
void WriteLine(R& record, std::FILE* f, int n) {
    CString& line = LineBuffer();
    record.Infos(line);
    carnet_line::Emit(f, n, line);
}

}  // namespace carnet_record
