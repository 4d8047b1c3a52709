// ReadLine on arbitrary lines against a book that already holds elements of
// every kind, appending at the end or writing in place of an entry, with and
// without option lines allowed.
//
// Input: a run of lines separated by '\n', each preceded by one choice byte:
// bits 0-1 zero append at the end, otherwise bits 2-6 pick the entry to
// re-read in place; bit 7 is the append flag of ReadLine (no option lines).
//
// Properties: a line adds at most one element; null means the book did not
// change; an element returned is where the storing rules put it (appended,
// in place of the entry, or the path that the line continues); every element
// can be listed, written and queried; the same lines read without a text
// window give the same book; writing is stable, a copy of the book writes
// the same bytes, and so does the book once every element has been turned
// into a comment and back.
#include <string>
#include <utility>
#include <vector>

#include "fuzz_support.h"

namespace {

using carnet_fuzz::Input;
using carnet_fuzz::Written;

const char* const kBookLines[] = {
    "Commentaire Lev\xE9 du 12 mars",
    "Appareil 0.0012 0 0.0003 0.0003 0.002 2 TS 06",
    "Station S1 1.550 12.3456789 borne***OGE",
    "Reference R1 1.6 0.0 100.1234 123.456 clou",
    "Reference R2 54.3210000",
    "ExcentRad 0.1500",
    "Mesure M1 1.3 201.2201 100.4150 35.412 arbre",
    "NivLectAR S1 1.4321 35.20 rep\xE8re",
    "NivLectAV M1 1.8790 41.75",
    "Point P1 3 1000.250 2000.500 10.000 arbre",
    "Point P2 2 152.310",
    "Point S1 1 601234.512 2428765.331",
    "Station S1 1.6 0.0",
    "CheminEncadre C1 S1-1 S2-1 S3-1",
    "Commande Calcul %s",
    "Sym_2Pts ARB 1.500",
    "Texte_1Pt TXT un  texte",
    "Cercle_R CER L12 2.500",
    "CheminAntenne C2 S1-2 S4-1",
};

using Entries = std::vector<std::pair<void*, unsigned int>>;

Entries Snapshot(const CCarnet& book) {
    Entries out;
    for (int i = 0; i < book.length(); ++i) out.emplace_back(book.ptrAt(i), book.typAt(i));
    return out;
}

void FillBook(CCarnet& book, CNorvexTxtWnd* wnd) {
    for (const char* line : kBookLines) {
        int index = book.length();
        book.ReadLine(wnd, line, index, 0);
    }
}

// Reads every line of the input into the book, checking each outcome.
void ReadAll(CCarnet& book, const uint8_t* data, size_t size, CNorvexTxtWnd* wnd) {
    Input in(data, size);
    while (!in.Empty()) {
        const unsigned int choice = in.Byte();
        const std::string line(in.Until('\n'));
        const int length = book.length();
        const bool inPlace = (choice & 3) != 0 && length > 0;
        const int slot = inPlace ? static_cast<int>((choice >> 2) & 31) % length : length;
        const int bAppend = (choice & 0x80) ? 1 : 0;
        const Entries before = Snapshot(book);

        int index = slot;
        void* made = book.ReadLine(wnd, CString(line), index, bAppend);
        const Entries after = Snapshot(book);

        if (!made) {
            FUZZ_CHECK(after == before);
            FUZZ_CHECK(index == slot);
        } else if (after.size() == before.size() + 1) {
            // Appended: the earlier entries are untouched.
            FUZZ_CHECK(std::equal(before.begin(), before.end(), after.begin()));
            FUZZ_CHECK(after.back().first == made);
            FUZZ_CHECK(index == slot);
        } else if (after == before) {
            // A line that continues the last path adds to it and moves the
            // loader's counter back.
            FUZZ_CHECK(made == after.back().first && after.back().second == 1007);
            FUZZ_CHECK(index == slot - 1);
        } else {
            // In place: only the entry at the slot changed, and its old
            // element is the caller's to destroy.
            FUZZ_CHECK(inPlace && after.size() == before.size());
            for (size_t i = 0; i < after.size(); ++i)
                if (static_cast<int>(i) != slot) FUZZ_CHECK(after[i] == before[i]);
            FUZZ_CHECK(after[static_cast<size_t>(slot)].first == made);
            FUZZ_CHECK(index == slot);
            CCarnet trash;
            trash.append(before[static_cast<size_t>(slot)].first, before[static_cast<size_t>(slot)].second);
        }
        for (const auto& entry : after) {
            FUZZ_CHECK(entry.first != nullptr);
            FUZZ_CHECK(entry.second >= CARNET_FIRST_TYPE && entry.second <= CARNET_LAST_TYPE);
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    auto& scratch = carnet_fuzz::Scratch::Get();
    const std::string params = scratch.Path("params.ini");

    scratch.ResetStores();
    CCarnet book;
    book.m_ParamFile = params;
    CNorvexTxtWnd wnd;
    FillBook(book, &wnd);
    ReadAll(book, data, size, &wnd);
    carnet_fuzz::QueryEveryElement(book);
    const std::string text = Written(book, 1);
    FUZZ_CHECK_SAME(Written(book, 1), text);

    CCarnet copy;
    copy = book;
    FUZZ_CHECK_SAME(Written(copy, 1), text);

    // Every element switched off into a comment and on again comes back as
    // it was: the book writes the same bytes.
    for (int i = 0; i < copy.length(); ++i) {
        const unsigned int type = copy.typAt(i);
        if (type == 1000 || type == 1007) continue;
        copy.changeObjectIntoComment(&wnd, i);
        FUZZ_CHECK(copy.typAt(i) == 1000);
        copy.changeCommentIntoObject(&wnd, i);
        FUZZ_CHECK(copy.typAt(i) == type);
    }
    FUZZ_CHECK_SAME(Written(copy, 1), text);

    // Without a window nothing is printed and the book comes out the same.
    scratch.ResetStores();
    CCarnet quiet;
    quiet.m_ParamFile = params;
    FillBook(quiet, nullptr);
    ReadAll(quiet, data, size, nullptr);
    FUZZ_CHECK_SAME(Written(quiet, 1), text);
    return 0;
}
