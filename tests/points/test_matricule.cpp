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

}  // namespace

TEST(PointNumber, SplitTable) {
    struct Split {
        const char* np;
        const char* radical;
        int number, dotted;
    };
    const Split table[] = {
        {"P12", "P", 12, 0}, {"12", "", 12, 0},    {"P", "P", 0, 0},     {"P007", "P", 7, 0},   {"A.12", "A", 12, 1},
        {"A.", "A", 0, 1},   {"A.1.2", "A", 1, 1}, {"A.12B", "A", 12, 1}, {"A.*", "A", -1, 1},  {"A.1*", "A", -1, 1},
        {"12.5", "12", 5, 1}, {".12", "", 12, 1},  {"*", "*", -1, 0},    {"P*12", "P*", 12, 0}, {"", "", 0, 0},
        {"P 12", "P ", 12, 0},
        // Long digit runs saturate instead of wrapping into a wildcard.
        {"P99999999999", "P", INT_MAX, 0}, {"A.99999999999", "A", INT_MAX, 1},
    };
    for (const Split& t : table) {
        SCOPED_TRACE(t.np);
        CString radical("junk");
        int number = 99, dotted = 99;
        CCarnet::extrMat(t.np, radical, number, dotted, 0);
        EXPECT_EQ(radical, t.radical);
        EXPECT_EQ(number, t.number);
        EXPECT_EQ(dotted, t.dotted);
        CCarnet::extrMat(t.np, radical, number);
        EXPECT_EQ(radical, t.radical);
    }
    CString same("A.1.2");  // the text split may be the radical variable itself
    int number = 0, dotted = 1;
    CCarnet::extrMat(same, same, number, dotted, 1);
    EXPECT_TRUE(same == "A" && number == 12 && dotted == 0);
}

TEST(PointNumber, BuildTable) {
    struct Build {
        const char* radical;
        int number, dottedIn;
        const char* out;
        int dottedOut;
    };
    const Build table[] = {
        {"P", 12, 0, "P12", 0}, {"P", 12, 1, "P.12", 1}, {"P", 0, 1, "P", 0},   {"P", -1, 1, "P.*", 1},
        {"P", -1, 0, "P*", 0},  {"*", -1, 0, "*", 0},    {"*", -1, 1, "*.*", 1}, {"**", 0, 0, "*", 0},
        {"", 5, 1, "5", 0},     {"", -1, 1, "*", 0},     {"", 0, 1, "", 0},
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
        const char *typed, *withStars, *withoutStars;
    };
    const Norm table[] = {
        {"P 12", "P12", "P12"},  {"P-12", "P12", "P12"},   {"P;12", "P12", "P12"},   {"P007", "P7", "P7"},
        {"A.007", "A.7", "A.7"}, {"A.12", "A.12", "A.12"}, {"A.1.2", "A12", "A12"},  {"A.B12", "AB12", "AB12"},
        {"A.", "A", "A"},        {"A.0", "A", "A"},        {"A.*", "A.*", "A"},      {".12", "12", "12"},
        {"007", "7", "7"},       {"0", "", ""},            {"", "", ""},             {"*", "*", ""},
        {"*.*", "*.*", ""},      {"P*12", "P*12", "P12"},  {"12(2)", "12(2)", "12(2)"}, {"A.1*", "A.*", "A.1"},
    };
    for (const Norm& t : table) {
        SCOPED_TRACE(t.typed);
        const CString typed(t.typed);
        CString copy("junk");
        CCarnet::formMat(typed, copy);
        EXPECT_EQ(copy, t.withStars);
        CCarnet::formMat(copy);  // the written form is canonical
        EXPECT_EQ(copy, t.withStars);
        CString np(t.typed), radical;
        int number = 0, dotted = 0;
        CCarnet::formMat(np, radical, number, dotted, 0);
        EXPECT_EQ(np, t.withoutStars);
    }
    // The three values, and a dot in first place leaves no stale radical.
    CString np(".12"), radical("stale");
    int number = 0, dotted = 1;
    CCarnet::formMat(np, radical, number, dotted, 1);
    EXPECT_TRUE(radical == "" && number == 12 && dotted == 0);
    np = "A.007";
    CCarnet::formMat(np, radical, number, dotted, 1);
    EXPECT_TRUE(np == "A.7" && radical == "A" && number == 7 && dotted == 1);
}

TEST(PointNumber, StationReferences) {
    CString radical;
    int number = 0, rep = 0, dotted = 0;
    CCarnet::extrStaRep(" S.1 (3)", radical, number, rep, dotted, 0);
    EXPECT_TRUE(radical == "S" && number == 1 && rep == 3 && dotted == 1);
    CCarnet::extrStaRep("S12-2", radical, number, rep, dotted, 0);  // no hyphen in this form
    EXPECT_TRUE(radical == "S12-" && number == 2 && rep == 1 && dotted == 0);
    CCarnet::extrStaRep("A.1(2)", radical, number, rep, dotted, 1);
    EXPECT_TRUE(radical == "A" && number == 1 && rep == 2 && dotted == 0);

    // S1 set up at 4, 9 and 15, other stations and points of the same number between.
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
        const char *ref, *station;
        int rep, index;
    };
    const Case table[] = {
        {"S1(2)", "S1", 2, 9}, {"S1(4)", "S1", 4, -1},   {"S1-3", "S1", 3, 15},    {"S1", "S1", 1, 4},
        {" S1 (2)", "S1", 2, 9}, {"S1(0)", "S1", 0, -1}, {"S2(2)", "S2", 2, 3},
    };
    for (const Case& t : table) {
        SCOPED_TRACE(t.ref);
        CString station("junk");
        EXPECT_EQ(book.extrStaRep(t.ref, station, rep), t.index);
        EXPECT_EQ(station, t.station);
        EXPECT_EQ(rep, t.rep);
    }
    EXPECT_EQ(book.findStaRep("S1", 3), 15);
    EXPECT_EQ(book.findStaRep("S1 ", 1), -1);  // taken as given, no trimming
}

TEST(PointNumber, FindMatAndLastInd) {
    CCarnet book;
    book.append(new CComment("debut"), 1000);
    for (const char* np : {"P3", "P.10", "S1", "P8", "12"}) AddPoint(book, np);
    AddStation(book, "S1");
    EXPECT_EQ(book.findMat(""), 0);
    EXPECT_EQ(book.findMat("S1"), 3);
    EXPECT_EQ(book.findMat("p3"), -1);
    EXPECT_EQ(book.lastInd("P"), 10);
    EXPECT_EQ(book.lastInd(""), 12);
    EXPECT_EQ(book.lastInd("Q"), 0);
}

TEST(PointNumber, LastAndNextOfABook) {
    struct Case {
        std::vector<const char*> points;
        unsigned int type;
        const char *last;
        int lastIndex;
        const char* next;
    };
    const Case table[] = {
        {{"P1", "P7", "A9"}, 1006, "P7", 1, "P8"},
        {{"P7", "P1", "P7"}, 1006, "P7", 0, "P8"},  // ties keep the earlier element
        {{"A.5", "A.2"}, 999, "A.5", 0, "A.6"},
        {{"1"}, 1006, "1", 0, "2"},                 // plain 1 is a number in use
        {{"3", "P"}, 1006, "P", 1, "P1"},
        {{"", "0"}, 1006, "1", -1, "1"},            // nothing numbered
        {{}, 999, "1", -1, "1"},
        {{"P1"}, 1001, "1", -1, "1"},               // no element of that type
        {{"P2147483647"}, 1006, "P2147483647", 0, "P2147483647"},
    };
    for (const Case& t : table) {
        SCOPED_TRACE(t.next);
        ScratchBook book;
        for (const char* np : t.points) AddPoint(book, np);
        int index = 99;
        EXPECT_EQ(book.lastMat(t.type, index), t.last);
        EXPECT_EQ(index, t.lastIndex);
        EXPECT_EQ(book.scratch(), t.last);
        index = 99;
        EXPECT_EQ(book.nextMat(t.type, index), t.next);
        EXPECT_EQ(index, t.lastIndex);
        EXPECT_EQ(book.scratch(), t.next);
        EXPECT_EQ(book.nextMat(t.type), t.next);
    }
    ScratchBook book;
    for (const auto& t : {std::pair{"P12", "P13"}, {"A.5", "A.6"}, {"P", "P1"}, {"", "1"}, {"A.*", "A"}}) {
        EXPECT_EQ(book.nextMat(CString(t.first)), t.second);
        EXPECT_EQ(book.scratch(), t.second);
    }
}
