#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <utility>
#include <vector>

#include <carnet/carnet.h>

namespace {

using Entries = std::vector<std::pair<std::string, int>>;

Entries EntriesOf(const CChemin& c) {
    Entries out;
    for (int i = 0; i < c.length(); ++i) {
        CString mat;
        int rep = -7;
        c.getAt(i, mat, rep);
        EXPECT_EQ(mat, c.matAt(i));
        EXPECT_EQ(rep, c.repAt(i));
        out.emplace_back(mat.GetString(), rep);
    }
    return out;
}

CChemin PathOf(const char* name, std::initializer_list<const char*> texts) {
    CChemin c(name);
    for (const char* t : texts) EXPECT_GE(c.add(CString(t)), 0) << t;
    return c;
}

std::vector<std::string> LinesOf(const CChemin& c) {
    CStringArray lines;
    c.Infos(lines);
    std::vector<std::string> out;
    for (int i = 0; i < lines.GetSize(); ++i) out.push_back(lines[i].GetString());
    return out;
}

// The heading of every line of a path named C1: keyword and name, each in 16.
std::string Head(const char* keyword) { return std::string(keyword) + std::string(16 - std::string(keyword).size(), ' ') + " C1              "; }

}  // namespace

TEST(Chemin, NewPathIsAnEmptyAntenna) {
    const CChemin c;
    EXPECT_EQ(c.isAntenne(), 1);
    EXPECT_EQ(c.length(), 0);
    EXPECT_EQ(c.isClosed(), 0);
    EXPECT_EQ(c.isOk(), 0);
    EXPECT_TRUE(LinesOf(c).empty());
    CString params("stale");
    c.Params(params);
    EXPECT_EQ(params, "");
    EXPECT_EQ(CChemin(static_cast<const char*>(nullptr)).Np(), "");
    EXPECT_EQ(CChemin(CString("C2")).Np(), "C2");
}

TEST(Chemin, TextFormOfAnEntry) {
    struct Case {
        const char* text;
        const char* mat;
        int rep;
    } cases[] = {
        {"A-0", "A", 1},  {"A-", "A", 1},    {"A-x", "A", 1},   {"A-12", "A", 12}, {"A-B-2", "A", 1},
        {"", "", 1},      {"A", "A", 1},     {"A--3", "A", 1},  {"S 1-2", "S 1", 2}, {"P.7-3x", "P.7", 3},
    };
    for (const Case& k : cases) {
        CChemin c("C1");
        EXPECT_EQ(c.add(CString(k.text)), 0) << k.text;
        EXPECT_EQ(EntriesOf(c), (Entries{{k.mat, k.rep}})) << k.text;
    }
}

TEST(Chemin, RefusedTextLeavesThePathUnchanged) {
    CChemin c = PathOf("C1", {"A-1", "B-2"});
    EXPECT_EQ(c.add(CString("-1")), -1);
    EXPECT_EQ(c.add(CString("-")), -1);
    EXPECT_EQ(&c.insertAt(0, CString("-4")), &c);
    c.setAt(1, CString("-B"));
    EXPECT_EQ(EntriesOf(c), (Entries{{"A", 1}, {"B", 2}}));
}

TEST(Chemin, InsertSetAndRemoveKeepBothArraysInStep) {
    CChemin c = PathOf("C1", {"A-1", "B-2"});
    EXPECT_EQ(c.add(CString("C"), 5), 2);
    c.insertAt(1, CString("X-4")).insertAt(0, CString("W"), 9);
    EXPECT_EQ(EntriesOf(c), (Entries{{"W", 9}, {"A", 1}, {"X", 4}, {"B", 2}, {"C", 5}}));
    c.setAt(2, CString("Y-3"));
    c.setAt(0, CString("V"), 8);
    c.removeAt(1);
    EXPECT_EQ(EntriesOf(c), (Entries{{"V", 8}, {"Y", 3}, {"B", 2}, {"C", 5}}));
    // Beyond the end: both arrays grow with empty entries up to the position.
    c.insertAt(6, CString("Z-2"));
    EXPECT_EQ(EntriesOf(c), (Entries{{"V", 8}, {"Y", 3}, {"B", 2}, {"C", 5}, {"", 0}, {"", 0}, {"Z", 2}}));
    // An entry given from the path itself.
    c.add(c.matAt(0), c.repAt(0));
    c.insertAt(0, c.matAt(3), 1);
    EXPECT_EQ(c.matAt(0), "C");
    EXPECT_EQ(c.matAt(c.length() - 1), "V");
    EXPECT_EQ(&c.removeAll(), &c);
    EXPECT_EQ(c.length(), 0);
}

TEST(Chemin, ClosingAndOpening) {
    CChemin c = PathOf("C1", {"A-4", "B-1", "C-2"});
    c.setClosed(0);  // already open
    EXPECT_EQ(c.length(), 3);
    c.setClosed(1);
    EXPECT_EQ(EntriesOf(c), (Entries{{"A", 4}, {"B", 1}, {"C", 2}, {"A", 4}}));
    EXPECT_EQ(c.isClosed(), 1);
    c.setClosed(1);  // already closed
    EXPECT_EQ(c.length(), 4);
    c.setClosed(0);
    EXPECT_EQ(EntriesOf(c), (Entries{{"A", 4}, {"B", 1}, {"C", 2}}));
    EXPECT_EQ(c.isClosed(), 0);

    // The indexes are not compared.
    EXPECT_EQ(PathOf("C1", {"A-1", "B-1", "A-2"}).isClosed(), 1);
    // One entry counts as closed, and is too short to be changed either way.
    CChemin one = PathOf("C1", {"A-1"});
    EXPECT_EQ(one.isClosed(), 1);
    one.setClosed(0);
    one.setClosed(1);
    EXPECT_EQ(EntriesOf(one), (Entries{{"A", 1}}));
    // Two equal entries: opening leaves one.
    CChemin two = PathOf("C1", {"A-1", "A-1"});
    two.setClosed(0);
    EXPECT_EQ(EntriesOf(two), (Entries{{"A", 1}}));
}

TEST(Chemin, ValidityNeedsANameAndTwoEntries) {
    EXPECT_EQ(PathOf("C1", {"A", "B"}).isOk(), 1);
    EXPECT_EQ(PathOf("C1", {"A"}).isOk(), 0);
    EXPECT_EQ(PathOf("", {"A", "B"}).isOk(), 0);
}

TEST(Chemin, ParamsJoinsTheEntries) {
    const CChemin c = PathOf("C1", {"S1-1", "S2-3", "S1"});
    CString out("stale");
    c.Params(out);
    EXPECT_EQ(out, "S1-1 , S2-3 , S1-1");
}

TEST(Chemin, FileLinesHoldEightEntries) {
    struct Case {
        int entries;
        std::vector<int> perLine;
    } cases[] = {{1, {1}}, {8, {8}}, {9, {8, 1}}, {16, {8, 8}}, {20, {8, 8, 4}}};
    for (const Case& k : cases) {
        CChemin c("C1");
        std::vector<std::string> expected;
        for (int i = 0; i < k.entries; ++i) c.add(CString("S") + CString(std::to_string(i).c_str()), i + 1);
        int next = 0;
        for (int count : k.perLine) {
            std::string line = Head("CheminAntenne");
            for (int j = 0; j < count; ++j, ++next) line += " S" + std::to_string(next) + "-" + std::to_string(next + 1);
            expected.push_back(line);
        }
        EXPECT_EQ(LinesOf(c), expected) << k.entries;
    }
}

TEST(Chemin, FileLinesAreAppendedUnderTheKindsKeyword) {
    CChemin c = PathOf("C1", {"A-1", "B-2"});
    c.setAntenne(0);
    EXPECT_EQ(c.isAntenne(), 0);
    EXPECT_STREQ(c.FileKeyword(), "CheminEncadre");
    CStringArray lines;
    lines.Add(CString("kept"));
    c.Infos(lines);
    ASSERT_EQ(lines.GetSize(), 2);
    EXPECT_EQ(lines[0], "kept");
    EXPECT_EQ(lines[1], Head("CheminEncadre") + " A-1 B-2");
    c.setAntenne(5);
    EXPECT_EQ(c.isAntenne(), 1);
    EXPECT_STREQ(c.FileKeyword(), "CheminAntenne");
}

TEST(Chemin, NamesAreWrittenWholeOrAsQuestionMarks) {
    CChemin longName = PathOf("CHEMIN_DE_VINGT_CAR", {"A", "B"});
    EXPECT_EQ(LinesOf(longName), (std::vector<std::string>{"CheminAntenne    CHEMIN_DE_VINGT_CAR A-1 B-1"}));
    CChemin unnamed = PathOf("", {"A", "B"});
    EXPECT_EQ(LinesOf(unnamed), (std::vector<std::string>{"CheminAntenne    ???????????????? A-1 B-1"}));
}

TEST(Chemin, PrintAndWriteNumberEveryLine) {
    CChemin c("C1");
    for (int i = 0; i < 9; ++i) c.add(CString("P"), i + 1);
    const std::vector<std::string> lines = LinesOf(c);
    ASSERT_EQ(lines.size(), 2u);

    CNorvexTxtWnd wnd;
    c.Print(&wnd, 12);
    c.Print(&wnd, 0);
    c.Print(nullptr, 12);
    EXPECT_EQ(wnd.Texts(), (std::vector<std::string>{"000012  " + lines[0], "000012  " + lines[1], lines[0], lines[1]}));

    std::FILE* f = std::tmpfile();
    ASSERT_NE(f, nullptr);
    c.Write(f, 12);
    c.Write(f, 0);
    std::rewind(f);
    std::string written;
    for (int ch; (ch = std::fgetc(f)) != EOF;) written += static_cast<char>(ch);
    std::fclose(f);
    EXPECT_EQ(written, "000012  " + lines[0] + "\n000012  " + lines[1] + "\n" + lines[0] + "\n" + lines[1] + "\n");
}

TEST(Chemin, CopyAndAssignmentTakeEverything) {
    CChemin c = PathOf("C1", {"A-1", "B-2"});
    c.setAntenne(0);
    const CChemin copy(c);
    CChemin assigned("other");
    assigned.add(CString("Z-9"));
    assigned = c;
    c.setNp("changed");
    c.setAt(0, CString("Q-5"));
    c.setAntenne(1);
    for (const CChemin* k : {&copy, static_cast<const CChemin*>(&assigned)}) {
        EXPECT_EQ(k->Np(), "C1");
        EXPECT_EQ(k->isAntenne(), 0);
        EXPECT_EQ(EntriesOf(*k), (Entries{{"A", 1}, {"B", 2}}));
    }
}

// Stations of a book: S1 at 0, P at 1, 3 and 6, with other elements between.
struct StationBook : ::testing::Test {
    CCarnet book;
    CStation* third = nullptr;
    void SetUp() override {
        book.append(new CStation("S1", 1.5, 0.0, ""), 1001);
        book.append(new CStation("P", 1.5, 0.0, ""), 1001);
        book.append(new CPointGen("P", 1.0, 2.0, 3.0, ""), 1006);
        book.append(new CStation("P", 1.6, 0.0, ""), 1001);
        book.append(new CStation("S1", 1.5, 0.0, ""), 1001);
        book.append(new CComment("vu"), 1000);
        third = new CStation("P", 1.7, 0.0, "");
        book.append(third, 1001);
    }
};

TEST_F(StationBook, EntriesFromElementIndexes) {
    CChemin c("C1");
    EXPECT_EQ(c.add(6, &book), 0);
    EXPECT_EQ(c.add(1, &book), 1);
    EXPECT_EQ(c.add(4, &book), 2);
    EXPECT_EQ(EntriesOf(c), (Entries{{"P", 3}, {"P", 1}, {"S1", 2}}));
    // Refused: not a station, no book, an index outside the book.
    for (int element : {2, 5, -1, 7}) EXPECT_EQ(c.add(element, &book), -1) << element;
    EXPECT_EQ(c.add(0, static_cast<CCarnet*>(nullptr)), -1);
    c.insertAt(0, 3, &book);
    c.insertAt(0, 2, &book);
    c.setAt(1, 0, &book);
    c.setAt(2, 5, &book);
    EXPECT_EQ(EntriesOf(c), (Entries{{"P", 2}, {"S1", 1}, {"P", 1}, {"S1", 2}}));
}

TEST_F(StationBook, EntriesFromStationObjects) {
    CChemin c("C1");
    EXPECT_EQ(c.add(third, &book), 0);
    CStation outside("P", 1.0, 0.0, "");
    CStation unknown("Q", 1.0, 0.0, "");
    EXPECT_EQ(c.add(&outside, &book), 1);  // not in the book: the count of P stations
    EXPECT_EQ(c.add(&unknown, &book), 2);
    EXPECT_EQ(c.add(static_cast<CStation*>(nullptr), &book), -1);
    EXPECT_EQ(c.add(third, nullptr), -1);
    EXPECT_EQ(EntriesOf(c), (Entries{{"P", 3}, {"P", 3}, {"Q", 0}}));
    c.setAt(1, static_cast<CStation*>(book.ptrAt(4)), &book);
    c.insertAt(0, static_cast<CStation*>(book.ptrAt(1)), &book);
    EXPECT_EQ(EntriesOf(c), (Entries{{"P", 1}, {"P", 3}, {"S1", 2}, {"Q", 0}}));
}

TEST_F(StationBook, TheBookPrintsWritesCopiesAndFreesItsPaths) {
    CChemin* c = new CChemin("C1");
    for (int element : {0, 1, 3, 4, 6}) c->add(element, &book);
    c->setAntenne(0);
    const int at = book.append(c, 1007);
    EXPECT_EQ(book.cmdAt(at), "CheminEncadre");
    EXPECT_EQ(book.matAt(at), "C1");
    EXPECT_EQ(book.symAt(at), "");
    EXPECT_EQ(book.parAt(at), "S1-1 , P-1 , P-2 , S1-2 , P-3");

    CNorvexTxtWnd wnd;
    book.printAt(&wnd, at, 3);
    EXPECT_EQ(wnd.Texts(), (std::vector<std::string>{"000003  " + Head("CheminEncadre") + " S1-1 P-1 P-2 S1-2 P-3"}));

    CCarnet other;
    other = book;
    ASSERT_EQ(other.length(), book.length());
    ASSERT_NE(other.ptrAt(at), book.ptrAt(at));
    const CChemin* copy = static_cast<const CChemin*>(other.ptrAt(at));
    EXPECT_EQ(copy->isAntenne(), 0);
    EXPECT_EQ(EntriesOf(*copy), EntriesOf(*c));
    // Both books free their own path when they go (checked by the sanitizer build).
}
