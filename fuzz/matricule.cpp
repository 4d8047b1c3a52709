// Point numbers: an arbitrary text normalised, split and rebuilt, read as a
// station reference, and the next number proposed, on a book that holds
// stations, points and a path.
//
// Properties: normalising is idempotent, with and without the stars; a
// normalised number splits into values that build it again; the values of
// the normalising form are those of its result; the next number of a
// normalised one is not smaller; the station references and the
// book-wide members take any text.
#include <string>

#include "fuzz_support.h"

namespace {

const char* const kBookLines[] = {
    "Station S1 1.5 0.0",   "Station 12 1.5",     "Point P7 3 1.000 2.000 3.000", "Station S1 1.6",
    "Mesure A.12 54.321",    "Point P.3 2 5.000",  "CheminEncadre C1 S1-1 S1-2",   "Station S1(2) 1.7",
    "Commentaire sans nom", "Station A.1 1.5 10.0",
};

CCarnet& Book() {
    static CCarnet* book = [] {
        auto* b = new CCarnet;
        for (const char* line : kBookLines) {
            int index = b->length();
            b->ReadLine(nullptr, line, index, 1);
        }
        return b;
    }();
    return *book;
}

void CheckNormalising(const CString& typed, int keepStars) {
    CString once = typed;
    CString radical;
    int number = 0, dotted = 0;
    CCarnet::formMat(once, radical, number, dotted, keepStars);
    FUZZ_CHECK(dotted == 0 || dotted == 1);

    // The values returned are those of the normalised text.
    CString rebuilt;
    int flag = dotted;
    CCarnet::formMat(radical, number, flag, rebuilt);
    FUZZ_CHECK_SAME(rebuilt.str(), once.str());

    CString twice = once;
    CString radical2;
    int number2 = 0, dotted2 = 0;
    CCarnet::formMat(twice, radical2, number2, dotted2, keepStars);
    FUZZ_CHECK_SAME(twice.str(), once.str());

    // Splitting the normalised text and building it again gives it back.
    CString r;
    int n = 0, d = 0;
    CCarnet::extrMat(once, r, n, d, 0);
    CString built;
    CCarnet::formMat(r, n, d, built);
    FUZZ_CHECK_SAME(built.str(), once.str());
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    // A typed text: it ends at a NUL, as every text of a dialog does.
    const CString typed{std::string(reinterpret_cast<const char*>(data), size).c_str()};
    CheckNormalising(typed, 1);
    CheckNormalising(typed, 0);

    CString out;
    CCarnet::formMat(typed, out);
    CString inPlace = typed;
    CCarnet::formMat(inPlace);
    FUZZ_CHECK_SAME(inPlace.str(), out.str());

    CString radical;
    int number = 0, dotted = 0, rep = 0;
    for (int drop = 0; drop <= 1; ++drop) {
        CCarnet::extrMat(typed, radical, number, dotted, drop);
        CCarnet::extrStaRep(typed, radical, number, rep, dotted, drop);
    }
    CCarnet::extrMat(typed, radical, number);

    CCarnet& book = Book();
    CString station;
    const int at = book.extrStaRep(typed, station, rep);
    FUZZ_CHECK(at == -1 || (at >= 0 && at < book.length() && book.typAt(at) == 1001));
    book.findStaRep(typed, static_cast<int>(size % 4));
    book.findMat(typed);
    book.lastInd(typed);

    // The number after a normalised one never goes back.
    CCarnet::extrMat(out, radical, number, dotted, 0);
    CString next = book.nextMat(out);
    CString nextRadical;
    int nextNumber = 0;
    CCarnet::extrMat(next, nextRadical, nextNumber);
    if (number >= 0 && !radical.IsEmpty() && radical.Find('*') < 0 && nextRadical == radical)
        FUZZ_CHECK(nextNumber >= number);
    return 0;
}
