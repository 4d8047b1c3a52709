#include <gtest/gtest.h>

#include <carnet/carnet.h>

#include "free_tracker.h"

namespace {

CPointGen* NewPoint(const char* name) { return new CPointGen(name, 1.0, 2.0, 3.0, ""); }

std::vector<std::string> Names(const CCarnet& book) {
    std::vector<std::string> out;
    for (int i = 0; i < book.length(); ++i) out.push_back(static_cast<CPointGen*>(book.ptrAt(i))->m_Np.GetString());
    return out;
}

}  // namespace

TEST(Container, AppendInsertSwapKeepPointersWithTheirCodes) {
    CCarnet book;
    EXPECT_EQ(book.isEmpty(), 1);
    EXPECT_EQ(book.m_FileName, "Sitebook.geo");
    EXPECT_TRUE(book.m_ParamFile.IsEmpty());
    EXPECT_EQ(book.append(NewPoint("A"), 1006), 0);
    for (const char* n : {"B", "C", "D", "E"}) book.append(NewPoint(n), 1006);
    EXPECT_EQ(book.append(NewPoint("F"), 1006), 5);
    book.insertAt(0, NewPoint("Z"), 1006);
    EXPECT_EQ(&book.insertAt(book.length(), NewPoint("Y"), 1006), &book);
    EXPECT_EQ(Names(book), (std::vector<std::string>{"Z", "A", "B", "C", "D", "E", "F", "Y"}));

    void* unknown = ::operator new(16);
    book.append(unknown, 999);
    book.swapElements(0, 8);
    EXPECT_EQ(book.ptrAt(0), unknown);
    EXPECT_EQ(book.typAt(0), 999u);
    EXPECT_EQ(book.typAt(8), 1006u);
    void* first = book.ptrAt(1);
    book.swapElements(1, 1);
    EXPECT_EQ(book.ptrAt(1), first);
    EXPECT_EQ(book.typFirst(), 999u);
    EXPECT_EQ(book.typLast(), 1006u);
    book.typLast() = 1006;
    EXPECT_EQ(book.ptrLast(), book.ptrAt(8));
}

TEST(Container, RemoveWithAndWithoutDestruction) {
    CCarnet book;
    CPointGen* a = NewPoint("A");
    CPointGen* b = NewPoint("B");
    CPointGen* c = NewPoint("C");
    book.append(a, 1006);
    book.append(b, 1006);
    book.append(c, 1006);

    FreeTracker::Reset();
    book.removeAt(1, 0);  // handed back: still alive and ours
    EXPECT_FALSE(FreeTracker::WasFreed(b));
    EXPECT_EQ(b->m_Np, "B");
    EXPECT_EQ(book.length(), 2);
    EXPECT_EQ(book.ptrAt(1), c);

    book.removeFirst(1);
    EXPECT_TRUE(FreeTracker::WasFreed(a));
    EXPECT_EQ(book.ptrFirst(), c);

    book.removeAll(0);
    EXPECT_EQ(book.length(), 0);
    EXPECT_FALSE(FreeTracker::WasFreed(c));

    // Unknown codes are freed without a destructor; null pointers ignored.
    void* raw = ::operator new(8);
    book.append(raw, 1066);
    book.append(nullptr, 1006);
    book.append(b, 1006);
    book.append(c, 1006);
    FreeTracker::Reset();
    book.removeAll(1);
    EXPECT_EQ(book.length(), 0);
    EXPECT_TRUE(FreeTracker::WasFreed(raw));
    EXPECT_TRUE(FreeTracker::WasFreed(b));
    EXPECT_TRUE(FreeTracker::WasFreed(c));
}

TEST(Container, DestructorDestroysEveryElement) {
    CPointGen* p = NewPoint("P");
    FreeTracker::Reset();
    {
        CCarnet book;
        book.append(p, 1006);
        book.removeElement(nullptr, 1006);
    }
    EXPECT_TRUE(FreeTracker::WasFreed(p));
}

TEST(Container, SizedConstructionHoldsNullEntries) {
    CCarnet book(3, 4);
    ASSERT_EQ(book.length(), 3);
    EXPECT_EQ(book.ptrAt(2), nullptr);
    EXPECT_EQ(book.typAt(2), 0u);
    CNorvexTxtWnd w;
    book.Print(&w, 1);
    EXPECT_TRUE(w.Texts().empty());
}

TEST(Listing, NumbersAndUnknownCodes) {
    CCarnet book;
    book.append(new CPointGen("P1", 1000.25, 2000.5, "arbre"), 1006);
    book.append(::operator new(8), 999);
    book.append(::operator new(8), 1066);
    book.append(new CPointGen("100%", 12.5, "a%sb"), 1006);

    CNorvexTxtWnd w;
    book.Print(&w, 10);
    ASSERT_EQ(w.Texts().size(), 2u);
    EXPECT_EQ(w.Texts()[0],
              "000010  Point            P1               0    1000.250000    2000.500000 -999999.000000 arbre");
    // The fourth element keeps its own number; '%' prints as itself.
    EXPECT_EQ(w.Texts()[1],
              "000013  Point            100%             0 -999999.000000 -999999.000000    12.500000 a%sb");

    w.Clear();
    book.Print(&w, 0);
    ASSERT_EQ(w.Texts().size(), 2u);
    EXPECT_EQ(w.Texts()[0].substr(0, 6), "Point ");

    w.Clear();
    book.printAt(&w, 1, 5);
    book.printAt(nullptr, 0, 5);
    EXPECT_TRUE(w.Texts().empty());

    std::FILE* f = std::tmpfile();
    book.writeAt(2, f, 1);
    book.writeAt(0, f, 1);
    std::rewind(f);
    std::string all;
    for (int ch; (ch = std::fgetc(f)) != EOF;) all += static_cast<char>(ch);
    std::fclose(f);
    EXPECT_EQ(all,
              "000001  Point            P1               0    1000.250000    2000.500000 -999999.000000 arbre\n");
}

TEST(Rounding, BookDecimalCounts) {
    EXPECT_EQ(CCarnet::DeciXY(), 4);
    EXPECT_EQ(CCarnet::DeciZ(), 4);
    EXPECT_EQ(CCarnet::DeciAng(), 5);
    EXPECT_DOUBLE_EQ(CCarnet::formatXY(1234.56789), 1234.5679);
    EXPECT_DOUBLE_EQ(CCarnet::formatAng(399.999996), 400.0);
    EXPECT_EQ(CCarnet::formatXY(-999999.0), -999999.0);
    EXPECT_EQ(CCarnet::formatZ(-999999.0), -999999.0);
    CCarnet::setDeciZ(1);
    EXPECT_DOUBLE_EQ(CCarnet::formatZ(12.345), 12.3);
    CCarnet::setDeciZ(-4);  // stored as given, formats as 0 decimals
    EXPECT_EQ(CCarnet::DeciZ(), -4);
    EXPECT_DOUBLE_EQ(CCarnet::formatZ(12.6), 13.0);
    CCarnet::setDeciZ(4);
}

TEST(TypeTable, CodesClassesAndKeywords) {
    EXPECT_EQ(CarnetTypeInfo(999), nullptr);
    EXPECT_EQ(CarnetTypeInfo(1066), nullptr);
    EXPECT_STREQ(CarnetTypeInfo(1006)->className, "CPointGen");
    EXPECT_STREQ(CarnetKeyword(1013), "D\xE9" "f_Ori_PT");
    EXPECT_STREQ(CarnetKeyword(1033), "Sym_Entr\xE9" "e");
    EXPECT_STREQ(CarnetKeyword(1064), "Sym\xE9" "trique");
    EXPECT_STREQ(CarnetTypeInfo(1007)->keywords[2], "Cheminement");
    EXPECT_EQ(CarnetTypeInfo(1008)->keywords[1], nullptr);
    EXPECT_STREQ(CarnetTypeInfo(1065)->className, "CInterDist");
    for (unsigned code = CARNET_FIRST_TYPE; code <= CARNET_LAST_TYPE; ++code) {
        EXPECT_EQ(CarnetTypeInfo(code)->code, code);
        EXPECT_LE(std::string(CarnetKeyword(code)).size(), 16u) << code;
    }
}
