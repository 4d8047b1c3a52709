#include <gtest/gtest.h>

#include <carnet/carnet.h>

#include "save_fixture.h"

namespace {

// A small book: a station, a reference, a point, a path, a comment.
struct ConvertBook : ::testing::Test {
    CCarnet book;
    CNorvexTxtWnd wnd;
    void SetUp() override {
        book.append(new CStation("S1", 1.55, 12.3456789, "pilier"), 1001);
        book.append(new CReference("R1", 1.6, 0.0, 100.1234, 123.456, "borne a"), 1002);
        auto* p = new CPointGen("P12", 1000.25, 2000.5, 101.125, "arbre");
        p->setXConst(1);
        book.append(p, 1006);
        auto* path = new CChemin("C1");
        path->add("S1-1");
        path->add("S2-1");
        book.append(path, 1007);
        book.append(new CComment("remarque libre"), 1000);
    }
};


std::string LineOf(CCarnet& book, int i) {
    CNorvexTxtWnd w;
    book.printAt(&w, i, 0);
    return w.Texts().empty() ? std::string() : w.Texts()[0];
}

}  // namespace

TEST_F(ConvertBook, ObjectToCommentAndBack) {
    for (int i : {0, 1, 2}) {
        const unsigned int type = book.typAt(i);
        const CString params = book.parAt(i);
        const CString mat = book.matAt(i);
        const std::string line = LineOf(book, i);
        book.changeObjectIntoComment(&wnd, i);
        ASSERT_EQ(book.typAt(i), 1000u) << i;
        EXPECT_EQ(std::string(book.parAt(i).GetString()), line) << i;
        book.changeCommentIntoObject(&wnd, i);
        ASSERT_EQ(book.typAt(i), type) << i;
        EXPECT_EQ(book.parAt(i), params) << i;
        EXPECT_EQ(book.matAt(i), mat) << i;
    }
    EXPECT_TRUE(wnd.Texts().empty());
    EXPECT_EQ(book.length(), 5);
    // The point keeps its lock and its symbol through the round trip.
    auto* p = static_cast<CPointGen*>(book.ptrAt(2));
    EXPECT_EQ(p->m_bXConst, 1);
    EXPECT_EQ(p->m_bZConst, 0);
    EXPECT_EQ(p->m_Sy, "arbre");
    EXPECT_EQ(book.symAt(1), "borne a");
}

TEST_F(ConvertBook, RefusalsLeaveTheElement) {
    void* path = book.ptrAt(3);
    book.changeObjectIntoComment(&wnd, 3);  // paths are not converted
    book.changeObjectIntoComment(&wnd, 4);  // nor comments
    EXPECT_EQ(book.ptrAt(3), path);
    EXPECT_EQ(book.typAt(3), 1007u);
    EXPECT_EQ(book.parAt(4), "remarque libre");
    EXPECT_TRUE(wnd.Texts().empty());

    // A free remark is an unknown command, reported with the element's position.
    void* comment = book.ptrAt(4);
    book.changeCommentIntoObject(&wnd, 4);
    EXPECT_EQ(book.ptrAt(4), comment);
    ASSERT_EQ(wnd.Texts().size(), 2u);
    EXPECT_EQ(wnd.Texts()[0], "Erreur ligne 5 : commande <remarque> incorrecte !");
    EXPECT_EQ(wnd.Texts()[1], " (remarque libre)");

    book.changeCommentIntoObject(&wnd, 0);  // not a comment: nothing happens
    EXPECT_EQ(book.typAt(0), 1001u);

    // A comment holding a comment line becomes that comment.
    static_cast<CComment*>(book.ptrAt(4))->setStr("Commentaire  encore un mot ");
    book.changeCommentIntoObject(nullptr, 4);
    EXPECT_EQ(book.typAt(4), 1000u);
    EXPECT_EQ(book.parAt(4), "encore un mot");

    // An empty comment line is refused.
    static_cast<CComment*>(book.ptrAt(4))->setStr("Commentaire ");
    book.changeCommentIntoObject(nullptr, 4);
    EXPECT_EQ(book.parAt(4), "Commentaire ");
}

TEST_F(ConvertBook, PathLineInACommentKeepsTheComment) {
    // A path read from a comment is appended, never put in the comment's
    // place: the comment must stay in the book, alive.
    static_cast<CComment*>(book.ptrAt(4))->setStr("CheminEncadre C9 A-1 B-1");
    void* comment = book.ptrAt(4);
    book.changeCommentIntoObject(nullptr, 4);
    EXPECT_EQ(book.ptrAt(4), comment);
    EXPECT_EQ(book.parAt(4), "CheminEncadre C9 A-1 B-1");
    ASSERT_EQ(book.length(), 6);
    EXPECT_EQ(book.typAt(5), 1007u);
}

class ConvertOptions : public save_test::BookFileTest {};

TEST_F(ConvertOptions, OptionLineInACommentGoesToTheStore) {
    CCarnet book;
    book.m_ParamFile = Path("params.ini").c_str();
    book.append(new CComment("Option_Projec Projection Lambert Zone II"), 1000);
    void* comment = book.ptrAt(0);
    book.changeCommentIntoObject(nullptr, 0);
    EXPECT_EQ(book.ptrAt(0), comment);  // no element made: the comment stays
    CString stored;
    GetParamString(book.m_ParamFile, "Options_Corrections", "Projection", "Aucune", &stored);
    EXPECT_EQ(stored, "Projection Lambert Zone II");
}
