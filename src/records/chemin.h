// A traverse path: a named, ordered list of the stations
// that a traverse runs through, of the antenna kind ("CheminAntenne") or the
// framed kind ("CheminEncadre").
#pragma once

#include <cassert>
#include <cstdint>
#include <cstdio>

#include <carnet/carray.h>
#include <carnet/cstring.h>
#include <carnet/txtwnd.h>

class CCarnet;
class CStation;

class CChemin {
protected:
    CString m_Np;
    // Entry i is the pair (m_Mats[i], m_Reps[i]): a station's point number and
    // which of the stations set up on that point it is, counted from 1 in
    // element order. The two arrays always have the same length.
    CStringArray m_Mats;
    CArrayT<std::int32_t> m_Reps;
    int m_bAntenne = 1;

public:
    CChemin() = default;
    explicit CChemin(const CString& np);
    explicit CChemin(const char* np);
    CChemin(const CChemin&) = default;
    CChemin& operator=(const CChemin&) = default;
    ~CChemin() = default;

    CString& Np() { return m_Np; }
    const CString& Np() const { return m_Np; }
    void setNp(const CString& np) { m_Np = np; }
    void setNp(const char* np) { m_Np = np; }
    void setAntenne(int bAntenne) { m_bAntenne = bAntenne ? 1 : 0; }
    int isAntenne() const { return m_bAntenne; }

    int length() const { return m_Mats.GetSize(); }
    CString& matAt(int i) { assert(isValid(i)); return m_Mats.ElementAt(i); }
    const CString& matAt(int i) const { assert(isValid(i)); return m_Mats.GetAt(i); }
    int repAt(int i) const { assert(isValid(i)); return m_Reps.GetAt(i); }
    void getAt(int i, CString& mat, int& rep) const;

    // An entry is given as a pair, as its text form "NUMBER-INDEX", as the
    // index of a station element of a book, or as a station object of a book.
    // add returns the index of the new entry, or -1 when the entry is refused;
    // insertAt and setAt leave the path unchanged for a refused entry.
    int add(const CString& mat, int rep);
    int add(const CString& text);
    int add(int element, CCarnet* book);
    int add(CStation* station, CCarnet* book);
    // A position beyond the end extends the path with empty entries.
    CChemin& insertAt(int i, const CString& mat, int rep);
    CChemin& insertAt(int i, const CString& text);
    CChemin& insertAt(int i, int element, CCarnet* book);
    CChemin& insertAt(int i, CStation* station, CCarnet* book);
    void setAt(int i, const CString& mat, int rep);
    void setAt(int i, const CString& text);
    void setAt(int i, int element, CCarnet* book);
    void setAt(int i, CStation* station, CCarnet* book);
    CChemin& removeAt(int i);
    CChemin& removeAll();

    // Closed: at least one entry, and the first and last point numbers equal
    // (the repetition indexes are not compared).
    int isClosed() const;
    // On a path of 2 entries or more, closing appends a copy of the first
    // entry and opening removes the last one; shorter paths are left alone.
    void setClosed(int closed);
    int isOk() const;

    // "CheminAntenne" or "CheminEncadre", as the kind says.
    const char* FileKeyword() const;

    void Params(CString& out) const;
    // Appends the file lines (eight entries a line, each line repeating the
    // keyword and the name) to `lines`; a path without entries gives none.
    void Infos(CStringArray& lines) const;
    void Print(CNorvexTxtWnd* wnd, int n) const;
    void Write(std::FILE* f, int n) const;

protected:
    int isValid(int i) const { return i >= 0 && i < length() ? 1 : 0; }
};
