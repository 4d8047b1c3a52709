// Pieces of the field-book line frame shared by every element class.
#pragma once

#include <cstdio>

#include <carnet/cstring.h>
#include <carnet/txtwnd.h>

namespace carnet_line {

// The keyword, left-aligned in 16 characters ("%-16.16s").
void AppendKeyword(CString& out, const char* keyword);
// A point number or name, padded to 16 characters and never cut (a cut name
// could merge two points); an empty one is written as sixteen '?'.
void AppendName(CString& out, const CString& name);
// The symbol with every blank written as "***".
void AppendMarkedSymbol(CString& out, const CString& symbol);
// Replaces every blank of a symbol by "***" in place.
void MarkSpaces(CString& symbol);
// Replaces every "***" of a symbol word by a blank in place.
void UnmarkSpaces(CString& symbol);

// Sends one line to the text window, with the "%06d  " prefix when n > 0; the
// text is passed as a value, so a '%' in it prints as itself. A null window
// prints nothing.
void Emit(CNorvexTxtWnd* wnd, int n, const CString& line);
// Writes one line to a file, with the same prefix rule, followed by "\n".
void Emit(std::FILE* f, int n, const CString& line);

}  // namespace carnet_line
