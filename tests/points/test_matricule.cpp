#include <gtest/gtest.h>

#include <climits>
#include <string>
#include <vector>

#include <carnet/carnet.h>

namespace {

// Gives the tests the scratch text of matAt.
struct ScratchBook : CCarnet {
    const CString& scratch() const { return m_MatText; }
};

void AddPoint(CCarnet& book, const char* np) { book.append(new CPointGen(np, 1.0, 2.0, ""), 1006); }
void AddStation(CCarnet& book, const char* np) { book.append(new CStation(np, 1.5, 0.0, ""), 1001); }

struct Split {
    const char* np;
    const char* radical;
    int number;
    int dotted;
};

}  // namespace

TEST(PointNumber, SplitTable) {
    const Split table[] = {
        {"P12", "P", 12, 0},   {"12", "", 12, 0},     {"P", "P", 0, 0},      {"P007", "P", 7, 0},
        {"A.12", "A", 12, 1},  {"A.", "A", 0, 1},     {"A.1.2", "A", 1, 1},  {"A.12B", "A", 12, 1},
        {"A.*", "A", -1, 1},   {"A.1*", "A", -1, 1},  {"12.5", "12", 5, 1},  {".12", "", 12, 1},
        {"*", "*", -1, 0},     {"P*12", "P*", 12, 0}, {"", "", 0, 0},        {"P12B", "P12B", 0, 0},
        {"*P", "*P", -1, 0},   {"P 12", "P ", 12, 0},
        // Long digit runs saturate instead of wrapping into a wildcard.
        {"P99999999999", "P", INT_MAX, 0},   {"A.99999999999", "A", INT_MAX, 1},
        {"99999999999", "", INT_MAX, 0},
    };
    for (const Split& t : table) {
        SCOPED_TRACE(t.np);
        CString radical("junk");
        int number = 99, dotted = 99;
        CCarnet::extrMat(t.np, radical, number, dotted, 0);
        EXPECT_EQ(radical, t.radical);
        EXPECT_EQ(number, t.number);
        EXPECT_EQ(dotted, t.dotted);
        CString r3;
        int n3 = 99;
        CCarnet::extrMat(t.np, r3, n3);
        EXPECT_EQ(r3, t.radical);
        EXPECT_EQ(n3, t.number);
    }
}

TEST(PointNumber, SplitDroppingDots) {
    CString radical;
    int number = 0, dotted = 1;
    CCarnet::extrMat("A.1.2", radical, number, dotted, 1);
    EXPECT_EQ(radical, "A");
    EXPECT_EQ(number, 12);
    EXPECT_EQ(dotted, 0);
    // The text split may be the radical variable itself.
    CString same("B.7");
    CCarnet::extrMat(same, same, number, dotted, 0);
    EXPECT_EQ(same, "B");
    EXPECT_EQ(number, 7);
}

TEST(PointNumber, BuildTable) {
    struct Build {
        const char* radical;
        int number;
        int dottedIn;
        const char* out;
        int dottedOut;
    };
    const Build table[] = {
        {"P", 12, 0, "P12", 0}, {"P", 12, 1, "P.12", 1}, {"P", 0, 1, "P", 0},   {"P", -1, 1, "P.*", 1},
        {"P", -1, 0, "P*", 0},  {"*", -1, 0, "*", 0},    {"*", -1, 1, "*.*", 1}, {"**", 0, 0, "*", 0},
        {"*", 0, 1, "*", 0},    {"", 5, 1, "5", 0},      {"", -1, 1, "*", 0},   {"", 0, 1, "", 0},
        {"P", INT_MAX, 0, "P2147483647", 0},
    };
    for (const Build& t : table) {
        SCOPED_TRACE(std::string(t.radical) + " " + std::to_string(t.number));
        int dotted = t.dottedIn;
        CString out("junk");
        CCarnet::formMat(t.radical, t.number, dotted, out);
        EXPECT_EQ(out, t.out);
        EXPECT_EQ(dotted, t.dottedOut);
    }
}

TEST(PointNumber, NormaliseTable) {
    struct Norm {
        const char* typed;
        const char* withStars;
        const char* withoutStars;
    };
    const Norm table[] = {
        {"P 12", "P12", "P12"},   {"P-12", "P12", "P12"},   {"P;12", "P12", "P12"},  {"P007", "P7", "P7"},
        {"A.007", "A.7", "A.7"},  {"A.12", "A.12", "A.12"}, {"A.1.2", "A12", "A12"}, {"A.B12", "AB12", "AB12"},
        {"A.", "A", "A"},         {"A.0", "A", "A"},        {"A.*", "A.*", "A"},     {".12", "12", "12"},
        {"007", "7", "7"},        {"0", "", ""},            {"", "", ""},            {"*", "*", ""},
        {"*.*", "*.*", ""},       {"P*12", "P*12", "P12"},  {".B1", "B1", "B1"},     {"12(2)", "12(2)", "12(2)"},
        {" - ; ", "", ""},        {"A.1*", "A.*", "A.1"},
    };
    for (const Norm& t : table) {
        SCOPED_TRACE(t.typed);
        CString inPlace(t.typed);
        CCarnet::formMat(inPlace);
        EXPECT_EQ(inPlace, t.withStars);

        const CString typed(t.typed);
        CString copy("junk");
        CCarnet::formMat(typed, copy);
        EXPECT_EQ(copy, t.withStars);
        EXPECT_EQ(typed, t.typed);

        CString np(t.typed), radical;
        int number = 0, dotted = 0;
        CCarnet::formMat(np, radical, number, dotted, 0);
        EXPECT_EQ(np, t.withoutStars);

        // The written form is canonical: normalising it again changes nothing.
        CString again(inPlace);
        CCarnet::formMat(again);
        EXPECT_EQ(again, inPlace);
    }
}

TEST(PointNumber, NormaliseGivesItsValues) {
    struct Values {
        const char* typed;
        const char* radical;
        int number;
        int dotted;
    };
    const Values table[] = {
        {"A.007", "A", 7, 1}, {"A.1.2", "A", 12, 0}, {"A.B12", "AB", 12, 0}, {"A.", "A", 0, 0},
        {".12", "", 12, 0},   {"A.*", "A", -1, 1},   {"P 12", "P", 12, 0},
    };
    for (const Values& t : table) {
        SCOPED_TRACE(t.typed);
        CString np(t.typed);
        CString radical("stale");  // a dot in first place must not keep it
        int number = 99, dotted = 99;
        CCarnet::formMat(np, radical, number, dotted, 1);
        EXPECT_EQ(radical, t.radical);
        EXPECT_EQ(number, t.number);
        EXPECT_EQ(dotted, t.dotted);
    }
    CString same("P 0012");
    CCarnet::formMat(same, same);
    EXPECT_EQ(same, "P12");
}

TEST(PointNumber, StationReferenceSplit) {
    struct Ref {
        const char* ref;
        int dropDots;
        const char* radical;
        int number;
        int rep;
        int dotted;
    };
    const Ref table[] = {
        {"S12(2)", 0, "S", 12, 2, 0}, {" S.1 (3)", 0, "S", 1, 3, 1}, {"S12", 0, "S", 12, 1, 0},
        {"S12-2", 0, "S12-", 2, 1, 0}, {"(2)", 0, "", 0, 2, 0},      {"A.1(2)", 1, "A", 1, 2, 0},
        {"10(2", 0, "", 10, 2, 0},     {"10()", 0, "", 10, 0, 0},     {"", 0, "", 0, 1, 0},
    };
    for (const Ref& t : table) {
        SCOPED_TRACE(t.ref);
        CString radical;
        int number = 99, rep = 99, dotted = 99;
        CCarnet::extrStaRep(t.ref, radical, number, rep, dotted, t.dropDots);
        EXPECT_EQ(radical, t.radical);
        EXPECT_EQ(number, t.number);
        EXPECT_EQ(rep, t.rep);
        EXPECT_EQ(dotted, t.dotted);
    }
}

TEST(PointNumber, StationSetUps) {
    // S1 occupied at 4, 9 and 15; other stations and points between.
    CCarnet book;
    for (int i = 0; i < 16; ++i) {
        if (i == 4 || i == 9 || i == 15)
            AddStation(book, "S1");
        else if (i % 3 == 0)
            AddStation(book, "S2");
        else
            AddPoint(book, "S1");
    }
    struct Case {
        const char* ref;
        const char* station;
        int rep;
        int index;
    };
    const Case table[] = {
        {"S1(2)", "S1", 2, 9}, {"S1(4)", "S1", 4, -1}, {"S1-3", "S1", 3, 15}, {"S1", "S1", 1, 4},
        {" S1 (2)", "S1", 2, 9}, {"S1(0)", "S1", 0, -1}, {"S1(-1)", "S1", -1, -1}, {"S2(2)", "S2", 2, 3},
        {"S3", "S3", 1, -1},
    };
    for (const Case& t : table) {
        SCOPED_TRACE(t.ref);
        CString station("junk");
        int rep = 99;
        EXPECT_EQ(book.extrStaRep(t.ref, station, rep), t.index);
        EXPECT_EQ(station, t.station);
        EXPECT_EQ(rep, t.rep);
    }
    EXPECT_EQ(book.findStaRep("S1", 3), 15);
    EXPECT_EQ(book.findStaRep("S1 ", 1), -1);  // taken as given, no trimming
    EXPECT_EQ(book.findStaRep("S1", 0), -1);
    CCarnet empty;
    EXPECT_EQ(empty.findStaRep("S1", 1), -1);
}

TEST(PointNumber, FindMat) {
    CCarnet book;
    book.append(new CComment("debut"), 1000);
    AddPoint(book, "P1");
    AddStation(book, "S1");
    AddPoint(book, "S1");
    EXPECT_EQ(book.findMat(""), 0);
    EXPECT_EQ(book.findMat("S1"), 2);
    EXPECT_EQ(book.findMat("P1"), 1);
    EXPECT_EQ(book.findMat("p1"), -1);
    EXPECT_EQ(book.findMat("P1 "), -1);
}

TEST(PointNumber, LastIndex) {
    CCarnet book;
    for (const char* np : {"P3", "P.10", "P8", "Q20", "5", "12"}) AddPoint(book, np);
    book.append(new CComment("x"), 1000);
    EXPECT_EQ(book.lastInd("P"), 10);
    EXPECT_EQ(book.lastInd("Q"), 20);
    EXPECT_EQ(book.lastInd(""), 12);
    EXPECT_EQ(book.lastInd("R"), 0);
    EXPECT_EQ(book.lastInd("p"), 0);
}

TEST(PointNumber, LastAndNextOfABook) {
    struct Case {
        std::vector<const char*> points;
        unsigned int type;
        const char* last;
        int lastIndex;
        const char* next;
    };
    const Case table[] = {
        {{"P1", "P7", "A9"}, 1006, "P7", 1, "P8"},
        {{"P7", "P1", "P7"}, 1006, "P7", 0, "P8"},   // ties keep the earlier element
        {{"A.5", "A.2"}, 1006, "A.5", 0, "A.6"},
        {{"1"}, 1006, "1", 0, "2"},                  // plain 1 is a number in use
        {{"3", "P"}, 1006, "P", 1, "P1"},
        {{"", "0"}, 1006, "1", -1, "1"},             // nothing numbered
        {{}, 1006, "1", -1, "1"},
        {{}, 999, "1", -1, "1"},
        {{"P1"}, 1001, "1", -1, "1"},                // no element of that type
        {{"P2147483647"}, 1006, "P2147483647", 0, "P2147483647"},
    };
    for (const Case& t : table) {
        SCOPED_TRACE(t.last);
        ScratchBook book;
        for (const char* np : t.points) AddPoint(book, np);
        int index = 99;
        EXPECT_EQ(book.lastMat(t.type, index), t.last);
        EXPECT_EQ(index, t.lastIndex);
        EXPECT_EQ(book.scratch(), t.last);
        EXPECT_EQ(book.lastMat(t.type), t.last);
        index = 99;
        EXPECT_EQ(book.nextMat(t.type, index), t.next);
        EXPECT_EQ(index, t.lastIndex);
        EXPECT_EQ(book.scratch(), t.next);
        EXPECT_EQ(book.nextMat(t.type), t.next);
    }
}

TEST(PointNumber, LastByTypeAndAnyType) {
    CCarnet book;
    book.append(new CComment("x"), 1000);
    AddPoint(book, "P7");
    AddStation(book, "S2");
    AddPoint(book, "A9");
    int index = 0;
    EXPECT_EQ(book.lastMat(1006, index), "P7");
    EXPECT_EQ(index, 1);
    EXPECT_EQ(book.lastMat(1001, index), "S2");
    EXPECT_EQ(index, 2);
    EXPECT_EQ(book.nextMat(999, index), "S3");
    EXPECT_EQ(index, 2);
}

TEST(PointNumber, NextOfANumber) {
    const std::pair<const char*, const char*> table[] = {
        {"P12", "P13"}, {"A.5", "A.6"}, {"P", "P1"}, {"", "1"}, {"9", "10"},
        {"A.*", "A"},   {"P2147483647", "P2147483647"},
    };
    ScratchBook book;
    for (const auto& t : table) {
        SCOPED_TRACE(t.first);
        EXPECT_EQ(book.nextMat(t.first), t.second);
        EXPECT_EQ(book.scratch(), t.second);
    }
}
