#include <gtest/gtest.h>

#include <carnet/carnet.h>

namespace {

// One element of most families, with values, in a known order.
void Fill(CCarnet& book) {
    book.append(new CComment("levé"), 1000);
    book.append(new CStation("S1", 1.55, 12.5, "pilier"), 1001);
    book.append(new CReference("R1", 1.6, 10.0, 100.0, 50.0, "borne"), 1002);
    book.append(new CMesure("M1", 54.321, ""), 1003);
    book.append(new CLectAR("B1", 1.234, 45.6, "mire"), 1004);
    auto* p = new CPointGen("P1", 1.0, 2.0, 3.0, "arbre");
    p->setZConst(1);
    book.append(p, 1006);
    auto* path = new CChemin("C1");
    path->setAntenne(0);
    path->add("S1-2");
    path->add("S2-1");
    path->add("S1-3");
    book.append(path, 1007);
    book.append(new CAppareil("T2", 0.1, 0.2, 0.005, 0.005, 0.05, 5.0), 1008);
    book.append(new CExcent(1, 0.25), 1010);
    book.append(new CSymSansOri(), 1017);
}

std::vector<std::string> Listing(CCarnet& book) {
    CNorvexTxtWnd w;
    book.Print(&w, 1);
    return w.Texts();
}

}  // namespace

TEST(CopyElement, PlacementRules) {
    CCarnet book;
    Fill(book);
    const int n = book.length();
    void* second = book.ptrAt(2);
    EXPECT_EQ(book.copyElement(2, 2), nullptr);
    EXPECT_EQ(book.length(), n);

    void* atEnd = book.copyElement(0, book.length());
    EXPECT_EQ(book.length(), n + 1);
    EXPECT_EQ(book.ptrLast(), atEnd);
    EXPECT_EQ(book.typLast(), 1000u);

    void* first = book.copyElement(2, 0);
    EXPECT_EQ(book.ptrAt(0), first);
    EXPECT_EQ(book.ptrAt(3), second);  // the source moved up by one
    EXPECT_EQ(book.parAt(0), book.parAt(3));
    EXPECT_EQ(book.symAt(0), "borne");

    const int before = book.length();
    auto* detached = static_cast<CPointGen*>(book.copyElement(6, -1));
    EXPECT_EQ(book.length(), before);
    ASSERT_NE(detached, nullptr);
    EXPECT_EQ(detached->m_Np, "P1");
    EXPECT_EQ(detached->m_bZConst, 1);
    EXPECT_EQ(detached->m_bXConst, 0);
    detached->m_X = 99.0;  // independent of the source
    EXPECT_EQ(static_cast<CPointGen*>(book.ptrAt(6))->m_X, 1.0);
    delete detached;

    // A path keeps its kind, its entries and their repetition indexes.
    auto* path = static_cast<CChemin*>(book.copyElement(7, -1));
    ASSERT_EQ(path->length(), 3);
    EXPECT_EQ(path->isAntenne(), 0);
    EXPECT_EQ(path->repAt(0), 2);
    EXPECT_EQ(path->repAt(2), 3);
    delete path;

    // An unknown code is copied as a null pointer with its code.
    book.append(::operator new(8), 1066);
    EXPECT_EQ(book.copyElement(book.length() - 1, book.length()), nullptr);
    EXPECT_EQ(book.typLast(), 1066u);
}

TEST(Assignment, DeepCopyBetweenBooksAndToItself) {
    CCarnet a, b;
    Fill(b);
    b.append(::operator new(8), 999);  // left out of the copy
    b.m_FileName = "chantier.geo";
    b.m_ParamFile = "params.ini";
    a.append(new CComment("old"), 1000);

    a = b;
    ASSERT_EQ(a.length(), b.length() - 1);
    for (int i = 0; i < a.length(); ++i) {
        EXPECT_EQ(a.typAt(i), b.typAt(i));
        EXPECT_NE(a.ptrAt(i), b.ptrAt(i));
    }
    EXPECT_EQ(a.m_FileName, "chantier.geo");
    EXPECT_EQ(a.m_ParamFile, "params.ini");
    EXPECT_EQ(Listing(a), Listing(b));

    static_cast<CStation*>(a.ptrAt(1))->setHi(9.0);
    EXPECT_DOUBLE_EQ(static_cast<CStation*>(b.ptrAt(1))->Hi(), 1.55);

    const std::vector<std::string> own = Listing(a);
    const CCarnet& self = a;
    a = self;
    EXPECT_EQ(Listing(a), own);

    b.removeAll(1);  // a's elements are its own
    EXPECT_EQ(Listing(a), own);
}
