#include <gtest/gtest.h>

#include <carnet/carnet.h>

namespace {

// A book of points (type 1006) and comments-by-unknown-code placeholders.
struct FindBook : ::testing::Test {
    CCarnet book;
    void SetUp() override {
        // 0..8: P0 X1 X2 P1 X4 X5 X6 P1 p1
        const char* names[] = {"P0", "X1", "X2", "P1", "X4", "X5", "X6", "P1", "p1"};
        for (const char* n : names) book.append(new CPointGen(n, 1.0, 2.0, ""), 1006);
    }
};

}  // namespace

TEST_F(FindBook, DirectionsAndRanges) {
    EXPECT_EQ(book.Find(1006, "P1", 0, 0), 3);
    EXPECT_EQ(book.Find(1006, "P1", 4, 6), -1);
    EXPECT_EQ(book.Find(1006, "P1", 4, 7), 7);
    EXPECT_EQ(book.Find(1006, "P1", 8, -1), 7);
    EXPECT_EQ(book.Find(1006, "P1", 6, -1), 3);
    EXPECT_EQ(book.Find(1006, "P1", 2, -1), -1);
    EXPECT_EQ(book.Find(1006, "P0", 0, -1), 0);
    EXPECT_EQ(book.Find(1006, "P0", -1, -1), -1);  // backwards from below 0
    EXPECT_EQ(book.Find(1006, "P1", 5, 4), -1);    // forward, first above the end
    EXPECT_EQ(book.Find(1006, "P1", 9, 0), -1);    // forward from past the last element
}

TEST_F(FindBook, NamesAreExactAndEmptyMatchesAll) {
    EXPECT_EQ(book.Find(1006, "p1", 0, 0), 8);
    EXPECT_EQ(book.Find(1006, "P1 ", 0, 0), -1);
    EXPECT_EQ(book.Find(1006, "", 4, 0), 4);
    EXPECT_EQ(book.Find(1006, "", 8, -1), 8);
    EXPECT_EQ(book.Find(1001, "", 0, 0), -1);
    EXPECT_EQ(book.Find(1011, "P1", 0, 0), -1);
}

TEST_F(FindBook, TextReaders) {
    book.append(::operator new(8), 1066);
    EXPECT_EQ(book.matAt(3), "P1");
    EXPECT_EQ(book.cmdAt(3), "Point");
    EXPECT_EQ(book.cmdAt(9), "");
    EXPECT_EQ(book.matAt(9), "");
    EXPECT_EQ(book.parAt(9), "");
    static_cast<CPointGen*>(book.ptrAt(0))->m_Sy = "arbre";
    EXPECT_EQ(book.symAt(0), "arbre");
    CString held = book.parAt(0);
    EXPECT_EQ(held, "X =       1.0000 , Y =       2.0000");
    book.parAt(1);
    EXPECT_EQ(held, "X =       1.0000 , Y =       2.0000");  // a copy, not the scratch text
}
