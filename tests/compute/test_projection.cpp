#include <gtest/gtest.h>

#include <carnet/carnet.h>

#include "file/load_fixture.h"

TEST(Projection, FirstProjectionLineWins) {
    TempDir dir;
    struct Case {
        const char* file;
        const char* expected;
    };
    const Case cases[] = {
        {"Commentaire x\n        Cal_Cor  1 600000 2200000 150 6366\n"
         "        Option_Projec  Projection Lambert Zone IV\n",
         "Projection Lambert Zone II"},
        {"Cal_Cor 1 2 3 4\nCal_Cor 5 1 2 3 4\nOption_Projec\n000001  Option_Projec   Ma   projection  \n",
         "Ma   projection"},
        {"Station S1 1.5\n", ""},
        {"", ""},
        {"Cal_Cor 0 1 2 3 4", "Projection Lambert Zone I"},
        {"        Option_Projec                    Aucune\n", "Aucune"},
    };
    for (const Case& c : cases) {
        std::string path = dir.File("p.geo", c.file);
        CCarnet book;
        CString name("stale");
        book.Projection(path.c_str(), name);
        EXPECT_EQ(name, c.expected) << c.file;
        EXPECT_EQ(book.length(), 0);
    }
}

TEST(Projection, UnreadableFileAndDialog) {
    TempDir dir;
    BoxCapture boxes;
    CCarnet book;
    CString name("stale");
    std::string missing = dir.path() + "/none.geo";
    book.Projection(missing.c_str(), name);
    EXPECT_TRUE(name.IsEmpty());
    ASSERT_EQ(boxes.boxes.size(), 1u);
    EXPECT_EQ(boxes.boxes[0], "|Impossible d'ouvrir la Sitebook :\n" + missing + " !");
    {
        DialogAnswer cancel(false, "");
        book.Projection("", name);
        EXPECT_TRUE(name.IsEmpty());
        EXPECT_EQ(cancel.requests.size(), 1u);
    }
    {
        std::string chosen = dir.File("c.geo", "Option_Projec Projection Lambert Zone III\n");
        DialogAnswer pick(true, chosen);
        book.Projection("", name);
        EXPECT_EQ(name, "Projection Lambert Zone III");
        EXPECT_EQ(book.m_FileName, chosen.c_str());
    }
}
