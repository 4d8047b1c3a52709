// The field-book line reader: cutting a line into its frame, and the context
// that each branch of the reader (records, drawing commands, options) gets.
#pragma once

#include <string_view>
#include <vector>

#include <carnet/ccarnet.h>
#include <carnet/cstring.h>
#include <carnet/element_types.h>
#include <carnet/txtwnd.h>

namespace carnet_reader {

// A line cut into keyword and words. The views point into the line given to
// CutLine, which must outlive the cut.
struct LineCut {
    std::string_view keyword;
    std::string_view rest;  // everything after the keyword and its white space

    // The rest cut into words (a word ends at a blank; white space after a
    // word is skipped), cut at the first call: the free-text keywords take
    // the rest whole, so a long comment is never cut into words.
    const std::vector<std::string_view>& Words() const;

private:
    friend bool CutLine(std::string_view line, LineCut& cut);
    mutable std::vector<std::string_view> m_words;
    mutable bool m_cut = false;
};

// Trims the line, drops a line-number prefix and takes the keyword. False
// when no keyword is left.
bool CutLine(std::string_view line, LineCut& cut);

// Everything a branch of the reader needs to build, store and report.
class ReadContext {
public:
    ReadContext(CCarnet& book, CNorvexTxtWnd* wnd, std::string_view line, int& index, int bAppend, LineCut& cut)
        : book(book), wnd(wnd), line(line), index(index), bAppend(bAppend), cut(cut) {}

    CCarnet& book;
    CNorvexTxtWnd* wnd;
    std::string_view line;  // as passed in, shown after every message
    int& index;
    int bAppend;
    LineCut& cut;

    size_t WordCount() const { return cut.Words().size(); }
    std::string_view WordAt(size_t i) const { return cut.Words()[i]; }
    CString Word(size_t i) const { return CString(std::string(WordAt(i))); }
    double Number(size_t i) const;

    // Stores a new element at the reader's position: appended when the
    // position is the book's length, else written over the entry there (the
    // old element is left to the caller). Returns p.
    void* Store(void* p, unsigned int code);

    // "commande <%s> incomplète": the words do not fit the keyword.
    void* Incomplete();
    // "commande <%s> incorrecte": the keyword is unknown here.
    void* Incorrect();
    // A message with the line number and the keyword, then " (%s)" with the line.
    void Report(const char* format);
};

// ReadLine on a line held anywhere (the loader reads into its own buffer).
void* ReadOneLine(CCarnet& book, CNorvexTxtWnd* wnd, std::string_view line, int& index, int bAppend);

// The reader of each element class, named by its class: the words of the
// line checked against the keyword, the element built and stored. Null when
// no element was made (the reader reported why, or the line is dropped).
// Declared here for every row of the type table; the records' readers are
// in read_records.cpp and read_path.cpp, the drawing commands' in
// read_drawing.cpp.
template <class T>
struct ElementTag {};
#define CARNET_DECLARE_READER(code, cls, ...) void* ReadElement(ReadContext& ctx, ElementTag<cls>);
CARNET_ELEMENT_TYPES(CARNET_DECLARE_READER)
#undef CARNET_DECLARE_READER

// Option lines: their values go to the stored parameters, never to the
// book. False when the keyword is not an option keyword.
bool ReadOptionLine(ReadContext& ctx);

}  // namespace carnet_reader
