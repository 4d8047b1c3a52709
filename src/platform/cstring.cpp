#include <carnet/cstring.h>

#include <algorithm>
#include <cstring>

#include <carnet/cp1252.h>
#include <carnet/numconv.h>

namespace {

size_t clampPos(int i, size_t size) {
    if (i < 0) return 0;
    return std::min(static_cast<size_t>(i), size);
}

}  // namespace

int CString::Compare(const char* s) const { return cp1252::Compare(m_s.c_str(), s ? s : ""); }

int CString::CompareNoCase(const char* s) const { return cp1252::CompareNoCase(m_s.c_str(), s ? s : ""); }

int CString::Find(char ch, int start) const {
    if (start < 0) start = 0;
    if (static_cast<size_t>(start) >= m_s.size()) return -1;
    size_t p = m_s.find(ch, static_cast<size_t>(start));
    return p == std::string::npos ? -1 : static_cast<int>(p);
}

int CString::Find(const char* sub, int start) const {
    if (!sub) return -1;
    if (start < 0) start = 0;
    if (static_cast<size_t>(start) > m_s.size()) return -1;
    size_t p = m_s.find(sub, static_cast<size_t>(start));
    return p == std::string::npos ? -1 : static_cast<int>(p);
}

int CString::ReverseFind(char ch) const {
    size_t p = m_s.rfind(ch);
    return p == std::string::npos ? -1 : static_cast<int>(p);
}

CString CString::Left(int count) const { return CString(m_s.substr(0, clampPos(count, m_s.size()))); }

CString CString::Mid(int first) const { return CString(m_s.substr(clampPos(first, m_s.size()))); }

CString CString::Mid(int first, int count) const {
    size_t f = clampPos(first, m_s.size());
    size_t n = clampPos(count, m_s.size() - f);
    return CString(m_s.substr(f, n));
}

CString CString::Right(int count) const {
    size_t n = clampPos(count, m_s.size());
    return CString(m_s.substr(m_s.size() - n));
}

int CString::Replace(const char* oldText, const char* newText) {
    if (!oldText || !*oldText) return 0;
    const size_t oldLen = std::strlen(oldText);
    const char* repl = newText ? newText : "";
    if (m_s.find(oldText) == std::string::npos) return 0;
    std::string out;
    out.reserve(m_s.size());
    int count = 0;
    size_t pos = 0;
    for (;;) {
        size_t hit = m_s.find(oldText, pos);
        if (hit == std::string::npos) break;
        out.append(m_s, pos, hit - pos);
        out += repl;
        pos = hit + oldLen;
        ++count;
    }
    out.append(m_s, pos, std::string::npos);
    m_s.swap(out);
    return count;
}

int CString::Replace(char oldCh, char newCh) {
    int count = 0;
    for (char& c : m_s) {
        if (c == oldCh) {
            c = newCh;
            ++count;
        }
    }
    return count;
}

int CString::Remove(char ch) {
    const size_t before = m_s.size();
    m_s.erase(std::remove(m_s.begin(), m_s.end(), ch), m_s.end());
    return static_cast<int>(before - m_s.size());
}

int CString::Insert(int index, char ch) {
    m_s.insert(clampPos(index, m_s.size()), 1, ch);
    return GetLength();
}

int CString::Insert(int index, const char* s) {
    if (s) m_s.insert(clampPos(index, m_s.size()), s);
    return GetLength();
}

int CString::Delete(int index, int count) {
    size_t f = clampPos(index, m_s.size());
    size_t n = clampPos(count, m_s.size() - f);
    m_s.erase(f, n);
    return GetLength();
}

CString& CString::TrimLeft() {
    size_t i = 0;
    while (i < m_s.size() && cp1252::IsSpace(static_cast<unsigned char>(m_s[i]))) ++i;
    m_s.erase(0, i);
    return *this;
}

CString& CString::TrimRight() {
    size_t n = m_s.size();
    while (n > 0 && cp1252::IsSpace(static_cast<unsigned char>(m_s[n - 1]))) --n;
    m_s.resize(n);
    return *this;
}

CString& CString::Trim() { return TrimRight().TrimLeft(); }

CString& CString::TrimLeft(char ch) {
    size_t i = 0;
    while (i < m_s.size() && m_s[i] == ch) ++i;
    m_s.erase(0, i);
    return *this;
}

CString& CString::TrimRight(char ch) {
    size_t n = m_s.size();
    while (n > 0 && m_s[n - 1] == ch) --n;
    m_s.resize(n);
    return *this;
}

CString& CString::MakeUpper() {
    for (char& c : m_s) c = static_cast<char>(cp1252::ToUpper(static_cast<unsigned char>(c)));
    return *this;
}

CString& CString::MakeLower() {
    for (char& c : m_s) c = static_cast<char>(cp1252::ToLower(static_cast<unsigned char>(c)));
    return *this;
}

void CString::Format(const char* format, ...) {
    va_list args;
    va_start(args, format);
    FormatV(format, args);
    va_end(args);
}

void CString::AppendFormat(const char* format, ...) {
    va_list args;
    va_start(args, format);
    AppendFormatV(format, args);
    va_end(args);
}

void CString::FormatV(const char* format, va_list args) {
    m_s.clear();
    AppendFormatV(format, args);
}

void CString::AppendFormatV(const char* format, va_list args) { numconv::AppendFormatV(m_s, format, args); }

CString operator+(const CString& a, const CString& b) { CString r(a); r += b; return r; }
CString operator+(const CString& a, const char* b) { CString r(a); r += b; return r; }
CString operator+(const char* a, const CString& b) { CString r(a); r += b; return r; }
CString operator+(const CString& a, char b) { CString r(a); r += b; return r; }
CString operator+(char a, const CString& b) { CString r(a, 1); r += b; return r; }

bool operator==(const CString& a, const CString& b) { return a.str() == b.str(); }
bool operator==(const CString& a, const char* b) { return a.Compare(b) == 0; }
bool operator==(const char* a, const CString& b) { return b.Compare(a) == 0; }
bool operator!=(const CString& a, const CString& b) { return !(a == b); }
bool operator!=(const CString& a, const char* b) { return !(a == b); }
bool operator!=(const char* a, const CString& b) { return !(a == b); }
bool operator<(const CString& a, const CString& b) { return a.Compare(b) < 0; }
bool operator<(const CString& a, const char* b) { return a.Compare(b) < 0; }
bool operator<(const char* a, const CString& b) { return b.Compare(a) > 0; }
bool operator>(const CString& a, const CString& b) { return a.Compare(b) > 0; }
bool operator>(const CString& a, const char* b) { return a.Compare(b) > 0; }
bool operator>(const char* a, const CString& b) { return b.Compare(a) < 0; }
bool operator<=(const CString& a, const CString& b) { return a.Compare(b) <= 0; }
bool operator<=(const CString& a, const char* b) { return a.Compare(b) <= 0; }
bool operator<=(const char* a, const CString& b) { return b.Compare(a) >= 0; }
bool operator>=(const CString& a, const CString& b) { return a.Compare(b) >= 0; }
bool operator>=(const CString& a, const char* b) { return a.Compare(b) >= 0; }
bool operator>=(const char* a, const CString& b) { return b.Compare(a) <= 0; }
