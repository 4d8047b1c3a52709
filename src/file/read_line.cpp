#include <string>
#include <unordered_map>

#include <carnet/cp1252.h>
#include <carnet/numconv.h>

#include "file/file_texts_internal.h"
#include "file/reader_internal.h"

namespace carnet_reader {
namespace {

bool IsSpace(char c) { return cp1252::IsSpace(static_cast<unsigned char>(c)); }

// Takes the word at the front of s (up to the first blank) and skips the
// white space after it. White space at the end of the word (a tab or a
// carriage return before the blank) goes with the blank: a word never ends
// with white space, as it never begins with some, so that a word that a
// writer puts last on its line (a symbol) does not lose it when read back.
std::string_view TakeWord(std::string_view& s) {
    size_t end = s.find(' ');
    std::string_view word = s.substr(0, end);
    while (!word.empty() && IsSpace(word.back())) word.remove_suffix(1);
    size_t next = end == std::string_view::npos ? s.size() : end;
    while (next < s.size() && IsSpace(s[next])) ++next;
    s.remove_prefix(next);
    return word;
}

bool AllDigits(std::string_view w) {
    if (w.empty()) return false;
    for (char c : w)
        if (!cp1252::IsDigit(static_cast<unsigned char>(c))) return false;
    return true;
}

// Keyword to type code, built once from the type table.
const std::unordered_map<std::string_view, unsigned int>& Keywords() {
    static const std::unordered_map<std::string_view, unsigned int> map = [] {
        std::unordered_map<std::string_view, unsigned int> m;
        for (unsigned int code = CARNET_FIRST_TYPE; code <= CARNET_LAST_TYPE; ++code)
            for (const char* kw : CarnetTypeInfo(code)->keywords)
                if (kw) m.emplace(kw, code);
        return m;
    }();
    return map;
}

// The reader of each type code, built from the type table.
using Reader = void* (*)(ReadContext& ctx);
#define CARNET_READER_ROW(code, cls, ...) [](ReadContext& ctx) { return ReadElement(ctx, ElementTag<cls>{}); },
constexpr Reader kReaders[] = {CARNET_ELEMENT_TYPES(CARNET_READER_ROW)};
#undef CARNET_READER_ROW

}  // namespace

const std::vector<std::string_view>& LineCut::Words() const {
    if (!m_cut) {
        m_cut = true;
        for (std::string_view s = rest; !s.empty();) m_words.push_back(TakeWord(s));
    }
    return m_words;
}

bool CutLine(std::string_view line, LineCut& cut) {
    size_t b = 0, e = line.size();
    while (b < e && IsSpace(line[b])) ++b;
    while (e > b && IsSpace(line[e - 1])) --e;
    std::string_view s = line.substr(b, e - b);
    cut.m_words.clear();
    cut.m_cut = false;
    cut.keyword = {};
    cut.rest = {};
    std::string_view probe = s;
    if (AllDigits(TakeWord(probe))) s = probe;
    if (s.empty()) return false;
    cut.keyword = TakeWord(s);
    cut.rest = s;
    return true;
}

double ReadContext::Number(size_t i) const {
    return numconv::Atof(WordAt(i));
}

void* ReadContext::Store(void* p, unsigned int code) {
    if (index >= book.length()) {
        book.append(p, code);
    } else {
        book.setPtrAt(index, p);
        book.setTypAt(index, code);
    }
    return p;
}

void ReadContext::Report(const char* format) {
    if (!wnd) return;
    wnd->Printf(1, format, index + 1, std::string(cut.keyword).c_str());
    wnd->Printf(1, carnet_texts::kShowLine, std::string(line).c_str());
}

void* ReadContext::Incomplete() {
    Report(carnet_texts::kIncomplete);
    return nullptr;
}

void* ReadContext::Incorrect() {
    Report(carnet_texts::kIncorrect);
    return nullptr;
}

void* ReadOneLine(CCarnet& book, CNorvexTxtWnd* wnd, std::string_view line, int& index, int bAppend) {
    if (line.empty()) return nullptr;
    assert(index >= 0 && index <= book.length());
    // A NUL byte ends every text of the library and the host, so the bytes
    // after one would be lost on saving: the line is damaged, shown with its
    // NUL bytes written \0.
    if (line.find('\0') != std::string_view::npos) {
        if (wnd) {
            std::string shown;
            for (char c : line) shown += c ? std::string(1, c) : std::string("\\0");
            wnd->Printf(1, carnet_texts::kDamaged, index + 1);
            wnd->Printf(1, carnet_texts::kShowLine, shown.c_str());
        }
        return nullptr;
    }
    // One cut for every line read, so that its words keep their room.
    static LineCut cut;
    ReadContext ctx(book, wnd, line, index, bAppend, cut);
    if (!CutLine(line, ctx.cut)) {
        if (wnd) {
            wnd->Printf(1, carnet_texts::kNoCommand, index + 1);
            wnd->Printf(1, carnet_texts::kShowLine, std::string(line).c_str());
        }
        return nullptr;
    }
    const auto& keywords = Keywords();
    auto it = keywords.find(ctx.cut.keyword);
    if (it == keywords.end()) {
        // Option lines only come from a whole file, never while appending.
        if (!bAppend && ReadOptionLine(ctx)) return nullptr;
        return ctx.Incorrect();
    }
    return kReaders[it->second - CARNET_FIRST_TYPE](ctx);
}

}  // namespace carnet_reader

void* CCarnet::ReadLine(CNorvexTxtWnd* pWnd, CString line, int& index, int bAppend) {
    return carnet_reader::ReadOneLine(*this, pWnd, line.str(), index, bAppend);
}
