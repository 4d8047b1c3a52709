#include <gtest/gtest.h>

#include <string>
#include <vector>

#include <carnet/carnet.h>

#include "core/dispatch_internal.h"
#include "records/record_texts.h"

namespace {

// One element of every survey record class but the traverse path, in the
// order of a short field book.
void FillBook(CCarnet& book) {
    book.append(new CStation("S1", 1.55, 12.3456789, ""), 1001);
    book.append(new CReference("R1", 1.6, 0.0, 100.1234, 123.456, "borne a"), 1002);
    book.append(new CMesure("M1", 54.321, ""), 1003);
    auto* point = new CPointGen("P1", 1000.25, 2000.5, "arbre");
    point->setXConst(1);
    book.append(point, 1006);
    book.append(new CComment("Lev\xE9 du 12 mars"), 1000);
    book.append(new CAppareil("TC1", 0.0, 0.0, 0.005, 0.005, 0.05, 5.0), 1008);
    book.append(new CLectAR("B1", 1.234, 45.6, "rep\xE8re"), 1004);
    book.append(new CLectAV("B2", 0.987, UNDEF_VALUE, ""), 1005);
    book.append(new CCommand("cmd a"), 1009);
    book.append(new CExcent(1, 0.15), 1010);
}

const std::vector<std::string> kListing = {
    "000001  Station          S1                1.550000  12.3456789" + Blanks(20),
    "000002  Reference        R1                1.600000   0.0000000 100.1234000 123.456000 borne***a",
    "000003  Mesure           M1                         54.3210000" + Blanks(20),
    "000004  Point            P1               1    1000.250000    2000.500000 -999999.000000 arbre",
    "000005  Commentaire      Lev\xE9 du 12 mars",
    "000006  Appareil         0.000000 0.000000 0.005000 0.005000 0.050000 5.0 TC1",
    "000007  NivLectAR        B1                1.234000  45.600000 rep\xE8re",
    "000008  NivLectAV        B2                0.987000" + Blanks(10),
    "000009  Commande         cmd a",
    "000010  ExcentTan       " + Blanks(17) + " 0.1500",
};

}  // namespace

TEST(Listing, BookOfEveryRecordPrintsAndWritesItsLines) {
    CCarnet book;
    FillBook(book);
    CNorvexTxtWnd w;
    book.Print(&w, 1);
    EXPECT_EQ(w.Texts(), kListing);

    std::FILE* f = std::tmpfile();
    ASSERT_NE(f, nullptr);
    for (int i = 0; i < book.length(); ++i) book.writeAt(i, f, i + 1);
    std::rewind(f);
    std::string text;
    for (int c; (c = std::fgetc(f)) != EOF;) text += static_cast<char>(c);
    std::fclose(f);
    std::string expected;
    for (const std::string& line : kListing) expected += line + "\n";
    EXPECT_EQ(text, expected);

    CCarnet copy;
    copy = book;  // every record copied by its own class
    CNorvexTxtWnd w2;
    copy.Print(&w2, 1);
    EXPECT_EQ(w2.Texts(), kListing);
}

TEST(Listing, DispatchReachesTheRecordsMembers) {
    CCarnet book;
    FillBook(book);
    struct Case { int index; const char* np; const char* sy; std::string params; };
    const Case cases[] = {
        {0, "S1", "", "HI =   1.5500 , V0 =  12.34568"},
        {1, "R1", "borne a", "HP =   1.6000 , AH =   0.00000 , AV = 100.12340 , DI = 123.4560"},
        {2, "M1", "", "AH =  54.32100"},
        {4, nullptr, nullptr, "Lev\xE9 du 12 mars"},
        {6, "B1", "rep\xE8re", "LM =  1.2340" + std::string(15, ' ') + " , DH =  45.6000"},
        {7, "B2", "", "               LM =  0.9870"},
        {8, nullptr, nullptr, "cmd a"},
        {9, nullptr, nullptr, "ET =  0.1500"},
    };
    for (const Case& c : cases) {
        const ElementOps* ops = ElementOpsFor(book.typAt(c.index));
        ASSERT_NE(ops, nullptr) << c.index;
        if (c.np) {
            ASSERT_TRUE(ops->np && ops->sy) << c.index;
            EXPECT_EQ(*ops->np(book.ptrAt(c.index)), c.np);
            EXPECT_EQ(*ops->sy(book.ptrAt(c.index)), c.sy);
        } else {
            EXPECT_EQ(ops->np, nullptr) << c.index;
        }
        ASSERT_NE(ops->params, nullptr) << c.index;
        CString params;
        ops->params(book.ptrAt(c.index), params);
        EXPECT_EQ(params, c.params) << c.index;
    }
    const ElementOps* excent = ElementOpsFor(1010);
    ASSERT_TRUE(excent && excent->keyword);
    EXPECT_STREQ(excent->keyword(book.ptrAt(9)), "ExcentTan");
    EXPECT_EQ(ElementOpsFor(1008)->np, nullptr);  // an instrument has a name, not a point number
}
