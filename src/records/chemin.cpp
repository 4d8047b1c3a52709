#include <carnet/chemin.h>

#include <carnet/ccarnet.h>
#include <carnet/element_types.h>
#include <carnet/numconv.h>
#include <carnet/station.h>

#include "core/line_internal.h"

namespace {

constexpr unsigned int kStationType = TypeCode<CStation>::value;
constexpr int kEntriesPerLine = 8;

// One entry as given to add, insertAt or setAt, or a refusal.
struct Entry {
    bool ok = false;
    CString mat;
    int rep = 1;
};

// "NUMBER-INDEX": the number is the text before the first hyphen, the index
// what follows it when that reads as 1 or more, else 1. A text without a
// hyphen is a number alone (index 1); a text that begins with one has no
// number and is refused.
Entry ParseEntry(const CString& text) {
    Entry e;
    const int hyphen = text.Find('-');
    if (hyphen == 0) return e;
    e.ok = true;
    if (hyphen < 0) {
        e.mat = text;
        return e;
    }
    e.mat = text.Left(hyphen);
    const int rep = numconv::Atoi(text.GetString() + hyphen + 1);
    e.rep = rep >= 1 ? rep : 1;
    return e;
}

// The rank, counted from 1 in element order, of a station among the stations
// of the book that bear its number; the station is told by its element index
// or by its object. A station object that is not in the book gets the number
// of stations found (0 when there is none).
int StationRank(CCarnet& book, const CString& np, int element, const CStation* station) {
    int count = 0;
    for (int j = book.Find(kStationType, np, 0, 0); j >= 0; j = book.Find(kStationType, np, j + 1, 0)) {
        ++count;
        if (j == element || (station && book.ptrAt(j) == station)) break;
    }
    return count;
}

Entry EntryOfElement(int element, CCarnet* book) {
    Entry e;
    // An index outside the book is refused rather than read out of bounds.
    if (!book || element < 0 || element >= book->length() || book->typAt(element) != kStationType) return e;
    e.ok = true;
    e.mat = book->matAt(element);
    e.rep = StationRank(*book, e.mat, element, nullptr);
    return e;
}

Entry EntryOfStation(const CStation* station, CCarnet* book) {
    Entry e;
    if (!station || !book) return e;
    e.ok = true;
    e.mat = station->Np();
    e.rep = StationRank(*book, e.mat, -1, station);
    return e;
}

}  // namespace

CChemin::CChemin(const CString& np) : m_Np(np) {}
CChemin::CChemin(const char* np) : m_Np(np) {}

void CChemin::getAt(int i, CString& mat, int& rep) const {
    assert(isValid(i));
    mat = m_Mats.GetAt(i);
    rep = m_Reps.GetAt(i);
}

int CChemin::add(const CString& mat, int rep) {
    // Copied first: `mat` may be one of this path's own entries, which the
    // array moves when it grows.
    const CString copy(mat);  // NOLINT(performance-unnecessary-copy-initialization)
    m_Reps.Add(rep);
    return m_Mats.Add(copy);
}

int CChemin::add(const CString& text) {
    const Entry e = ParseEntry(text);
    return e.ok ? add(e.mat, e.rep) : -1;
}

int CChemin::add(int element, CCarnet* book) {
    const Entry e = EntryOfElement(element, book);
    return e.ok ? add(e.mat, e.rep) : -1;
}

int CChemin::add(CStation* station, CCarnet* book) {
    const Entry e = EntryOfStation(station, book);
    return e.ok ? add(e.mat, e.rep) : -1;
}

CChemin& CChemin::insertAt(int i, const CString& mat, int rep) {
    assert(i >= 0);
    const CString copy(mat);  // NOLINT(performance-unnecessary-copy-initialization): as in add
    m_Mats.InsertAt(i, copy);
    m_Reps.InsertAt(i, rep);
    return *this;
}

CChemin& CChemin::insertAt(int i, const CString& text) {
    const Entry e = ParseEntry(text);
    return e.ok ? insertAt(i, e.mat, e.rep) : *this;
}

CChemin& CChemin::insertAt(int i, int element, CCarnet* book) {
    const Entry e = EntryOfElement(element, book);
    return e.ok ? insertAt(i, e.mat, e.rep) : *this;
}

CChemin& CChemin::insertAt(int i, CStation* station, CCarnet* book) {
    const Entry e = EntryOfStation(station, book);
    return e.ok ? insertAt(i, e.mat, e.rep) : *this;
}

void CChemin::setAt(int i, const CString& mat, int rep) {
    assert(isValid(i));
    m_Mats.SetAt(i, mat);
    m_Reps.SetAt(i, rep);
}

void CChemin::setAt(int i, const CString& text) {
    const Entry e = ParseEntry(text);
    if (e.ok) setAt(i, e.mat, e.rep);
}

void CChemin::setAt(int i, int element, CCarnet* book) {
    const Entry e = EntryOfElement(element, book);
    if (e.ok) setAt(i, e.mat, e.rep);
}

void CChemin::setAt(int i, CStation* station, CCarnet* book) {
    const Entry e = EntryOfStation(station, book);
    if (e.ok) setAt(i, e.mat, e.rep);
}

CChemin& CChemin::removeAt(int i) {
    assert(isValid(i));
    m_Mats.RemoveAt(i);
    m_Reps.RemoveAt(i);
    return *this;
}

CChemin& CChemin::removeAll() {
    m_Mats.RemoveAll();
    m_Reps.RemoveAll();
    return *this;
}

int CChemin::isClosed() const {
    return length() > 0 && m_Mats.GetAt(0) == m_Mats.GetAt(length() - 1) ? 1 : 0;
}

void CChemin::setClosed(int closed) {
    if (length() < 2) return;
    const bool isNow = isClosed() != 0;
    if (isNow && !closed)
        removeAt(length() - 1);
    else if (!isNow && closed)
        add(m_Mats.GetAt(0), m_Reps.GetAt(0));
}

int CChemin::isOk() const { return !m_Np.IsEmpty() && length() >= 2 ? 1 : 0; }

const char* CChemin::FileKeyword() const {
    // The type table holds the antenna keyword first, the framed one second.
    const CarnetElementType* row = CarnetTypeInfo(TypeCode<CChemin>::value);
    return row->keywords[m_bAntenne ? 0 : 1];
}

void CChemin::Params(CString& out) const {
    out.Empty();
    for (int i = 0; i < length(); ++i) {
        if (i > 0) out += " , ";
        out.AppendFormat("%s-%d", m_Mats.GetAt(i).GetString(), static_cast<int>(m_Reps.GetAt(i)));
    }
}

void CChemin::Infos(CStringArray& lines) const {
    CString line;
    for (int i = 0; i < length(); ++i) {
        if (i % kEntriesPerLine == 0) {
            line.Empty();
            carnet_line::AppendKeyword(line, FileKeyword());
            line += ' ';
            carnet_line::AppendName(line, m_Np);
        }
        line.AppendFormat(" %s-%d", m_Mats.GetAt(i).GetString(), static_cast<int>(m_Reps.GetAt(i)));
        if (i % kEntriesPerLine == kEntriesPerLine - 1 || i == length() - 1) lines.Add(line);
    }
}

void CChemin::Print(CNorvexTxtWnd* wnd, int n) const {
    if (!wnd) return;
    CStringArray lines;
    Infos(lines);
    for (int i = 0; i < lines.GetSize(); ++i) carnet_line::Emit(wnd, n, lines.GetAt(i));
}

void CChemin::Write(std::FILE* f, int n) const {
    CStringArray lines;
    Infos(lines);
    for (int i = 0; i < lines.GetSize(); ++i) carnet_line::Emit(f, n, lines.GetAt(i));
}
