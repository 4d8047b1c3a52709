#include <gtest/gtest.h>

#include <carnet/carnet.h>

#include "records/record_texts.h"

TEST(Command, SetCmdTellsWhetherTheTextChanged) {
    CCommand c;
    EXPECT_FALSE(c.setCmd(""));
    EXPECT_FALSE(c.setCmd(static_cast<const char*>(nullptr)));  // null reads as ""
    EXPECT_TRUE(c.setCmd("a b"));
    EXPECT_FALSE(c.setCmd(CString("a b")));
    EXPECT_TRUE(c.setCmd("a B"));
    EXPECT_TRUE(c.setCmd(static_cast<const char*>(nullptr)));
    EXPECT_EQ(c.getCmd(), "");
}

TEST(Command, AddCmdJoinsWordsWithOneBlank) {
    CCommand c;
    c.addCmd("w1");
    EXPECT_EQ(c.getCmd(), "w1");
    c.addCmd(CString("w2"));
    EXPECT_EQ(c.getCmd(), "w1 w2");
    c.addCmd("");
    EXPECT_EQ(c.getCmd(), "w1 w2 ");
    CCommand n(static_cast<const char*>(nullptr));
    n.addCmd(static_cast<const char*>(nullptr));
    EXPECT_EQ(n.getCmd(), "");
}

TEST(Comment, LinesKeepTheTextAsItIs) {
    CComment empty;
    EXPECT_EQ(InfosOf(empty), "Commentaire      ");
    CComment percent("100% %s  d\xE9j\xE0 ");
    EXPECT_EQ(InfosOf(percent), "Commentaire      100% %s  d\xE9j\xE0 ");
    EXPECT_EQ(ParamsOf(percent), "100% %s  d\xE9j\xE0 ");
    CNorvexTxtWnd w;
    percent.Print(&w, 7);
    ASSERT_EQ(w.Texts().size(), 1u);
    EXPECT_EQ(w.Texts()[0], "000007  Commentaire      100% %s  d\xE9j\xE0 ");

    CCommand cmd("  a  b ");
    EXPECT_EQ(InfosOf(cmd), "Commande           a  b ");
    EXPECT_EQ(ParamsOf(cmd), "  a  b ");
}
