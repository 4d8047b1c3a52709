// Code-page-1252 text helpers in place of the multibyte runtime functions of
// the Windows C runtime. Code page 1252 is single-byte, so "multibyte"
// comparison is plain unsigned byte comparison.
#pragma once

namespace cp1252 {

// _ismbcspace: tab, line feed, vertical tab, form feed, carriage return, blank.
inline bool IsSpace(unsigned int c) { return c == 0x20 || (c >= 0x09 && c <= 0x0D); }
// _ismbcdigit: the ASCII digits only.
inline bool IsDigit(unsigned int c) { return c >= '0' && c <= '9'; }

// Case mapping of code page 1252 letters (ASCII and the accented Latin-1 range).
unsigned int ToUpper(unsigned int c);
unsigned int ToLower(unsigned int c);

// _mbscmp: unsigned byte comparison; a null pointer reads as "".
int Compare(const char* a, const char* b);
// _mbsicmp: the same after folding both sides to lower case.
int CompareNoCase(const char* a, const char* b);
// _mbschr / _mbsstr: first occurrence, or null.
const char* FindChar(const char* s, unsigned int c);
const char* FindText(const char* s, const char* sub);

}  // namespace cp1252
