#include <gtest/gtest.h>

#include <limits>

#include <carnet/carnet.h>

#include "records/record_texts.h"

namespace {

const double kNaN = std::numeric_limits<double>::quiet_NaN();
const std::string kStationS1 = "Station          S1                1.550000";

}  // namespace

TEST(Station, DisplayText) {
    struct Case { double hi, v0; const char* expected; };
    const Case cases[] = {
        {1.55, 12.3456789, "HI =   1.5500 , V0 =  12.34568"},
        {1.55, UNDEF_VALUE, "HI =   1.5500"},
        {0.0, -1.0, "HI =   0.0000"},
        {0.0, 0.0, "HI =   0.0000 , V0 =   0.00000"},
        {12.345678, 399.999996, "HI =  12.3457 , V0 = 400.00000"},
        {1.55, kNaN, "HI =   1.5500"},
    };
    for (const Case& c : cases) {
        CStation s("S1", c.hi, c.v0, "sy");
        EXPECT_EQ(ParamsOf(s), c.expected) << c.hi << " " << c.v0;
    }
}

TEST(Station, IsOkAtItsBoundaries) {
    struct Case { const char* np; double hi, v0; int ok; };
    const Case cases[] = {
        {"", 1.0, UNDEF_VALUE, 0},   {"S", 0.0, UNDEF_VALUE, 1}, {"S", -0.001, UNDEF_VALUE, 0},
        {"S", 1.0, 0.0, 1},          {"S", 1.0, 400.0, 1},       {"S", 1.0, 400.0000001, 0},
        {"S", 1.0, -1.0, 0},         {"S", 1.0, kNaN, 0},        {"S", kNaN, 10.0, 0},
        {"S", std::numeric_limits<double>::infinity(), 10.0, 0},
    };
    for (const Case& c : cases) EXPECT_EQ(CStation(c.np, c.hi, c.v0, nullptr).isOk(), c.ok) << c.hi << " " << c.v0;
    EXPECT_EQ(CStation().isOk(), 0);
    EXPECT_TRUE(IsUndef(CStation().V0()));
}

TEST(Station, FileLine) {
    CStation s("S1", 1.55, 12.3456789, "");
    EXPECT_EQ(InfosOf(s), kStationS1 + "  12.3456789" + Blanks(20));
    CStation noV0("S1", 1.55, UNDEF_VALUE, "");
    EXPECT_EQ(InfosOf(noV0), kStationS1 + "  -1.0000000" + Blanks(20));
    EXPECT_TRUE(IsUndef(noV0.V0()));

    CStation marked(nullptr, 0.0, 100.0, "mur nord");
    EXPECT_EQ(InfosOf(marked), "Station          ????????????????  0.000000 100.0000000" + Blanks(20) + "mur***nord");
    EXPECT_EQ(marked.Sy(), "mur***nord");  // the mark stays in the record

    CStation longName("ABCDEFGHIJKLMNOPQRST", 1.55, 1.0, "x");
    EXPECT_EQ(InfosOf(longName).substr(0, 38), "Station          ABCDEFGHIJKLMNOPQRST ");
}

TEST(Station, FullCircleIsStoredAsZero) {
    struct Case { double v0; const char* written; double kept; };
    const Case cases[] = {
        {400.0, "  0.0000000", 0.0},
        {399.99999996, "  0.0000000", 0.0},
        {400.00000004, "  0.0000000", 0.0},
        {399.9999999, "399.9999999", 399.9999999},
    };
    for (const Case& c : cases) {
        CStation s("S1", 1.55, c.v0, "");
        EXPECT_EQ(InfosOf(s).substr(44, 11), c.written) << c.v0;
        EXPECT_EQ(s.V0(), c.kept);
    }
}

TEST(Station, DecimalCountsShapeTextsSafely) {
    CStation s("S1", 1.55, 12.5, "x");
    {
        DeciGuard z(&CStation::DeciZ, &CStation::setDeciZ, 6), a(&CStation::DeciAng, &CStation::setDeciAng, 7);
        EXPECT_EQ(ParamsOf(s), "HI =   1.550000 , V0 =  12.5000000");
        EXPECT_EQ(InfosOf(s), kStationS1 + "  12.5000000" + Blanks(24) + "x");
    }
    DeciGuard z(&CStation::DeciZ, &CStation::setDeciZ, -3), a(&CStation::DeciAng, &CStation::setDeciAng, 40);
    EXPECT_EQ(CStation::DeciZ(), -3);  // stored as given
    EXPECT_EQ(ParamsOf(s), "HI =    2 , V0 =  12." + std::string(30, '0').replace(0, 1, "5"));
    EXPECT_EQ(InfosOf(s), kStationS1 + "  12.5000000" + Blanks(41) + "x");
    EXPECT_EQ(s.FormHi(), 2.0);
}

TEST(Appareil, DisplayText) {
    CAppareil noCv("", UNDEF_VALUE, 0.0, 0.005, 0.005, 0.05, 5.0);
    CAppareil noPpm("T", 0.0, 0.0, 0.005, 0.005, 0.05, UNDEF_VALUE);
    CAppareil named("TC 1200", -0.0012, 0.0175, 0.0003, 0.0003, 0.001, 1.5);
    EXPECT_EQ(ParamsOf(noPpm), "T , CV = 0.00000 , C0 = 0.0000 , PH = 0.00500 , PV = 0.00500");
    CAppareil def;
    EXPECT_EQ(ParamsOf(def), "CV = 0.00000 , C0 = 0.0000 , PH = 0.00500 , PV = 0.00500 , PD = 0.0500 + 5.0 ppm");
    EXPECT_EQ(ParamsOf(noCv), "C0 = 0.0000 , PH = 0.00500 , PV = 0.00500 , PD = 0.0500 + 5.0 ppm");
    EXPECT_EQ(ParamsOf(named),
              "TC 1200 , CV = -0.00120 , C0 = 0.0175 , PH = 0.00030 , PV = 0.00030 , PD = 0.0010 + 1.5 ppm");
}

TEST(Appareil, FileLine) {
    CAppareil named("TC 1200", -0.0012, 0.0175, 0.0003, 0.0003, 0.001, 1.5);
    EXPECT_EQ(InfosOf(named), "Appareil         -0.001200 0.017500 0.000300 0.000300 0.001000 1.5 TC 1200");
    // Without a name the line would lose its last word and not read back.
    for (const char* name : {"", "  "}) {
        CAppareil unnamed(name, 0.0, 0.0, 0.005, 0.005, 0.05, 5.0);
        EXPECT_EQ(InfosOf(unnamed), "Appareil         0.000000 0.000000 0.005000 0.005000 0.050000 5.0 ????????????????");
    }
}

TEST(Excent, TextsAndPredicates) {
    struct Case { int typ; double val; const char* params; const char* keyword; std::string line; int ok, temp; };
    const Case cases[] = {
        {0, 0.15, "ER =  0.1500", "ExcentRad", "ExcentRad       " + Blanks(17) + " 0.1500", 1, 0},
        {1, -0.25, "ET = -0.2500", "ExcentTan", "ExcentTan       " + Blanks(17) + "-0.2500", 1, 0},
        {2, 12.5, "EV = 12.5000", "ExcentVer", "ExcentVer       " + Blanks(17) + "12.5000", 1, 0},
        {1, 0.0, "ET =  0.0000", "ExcentTan", "ExcentTan       " + Blanks(17) + " 0.0000", 0, 0},
        {-1, 0.0, "EV =  0.0000", "", Blanks(17) + " 0.0000", 0, 1},
        {-1, 0.5, "EV =  0.5000", "", Blanks(17) + " 0.5000", 0, 0},
        {5, 0.25, "EV =  0.2500", "", Blanks(17) + " 0.2500", 0, 0},
    };
    for (const Case& c : cases) {
        const CExcent e(c.typ, c.val);
        EXPECT_EQ(ParamsOf(e), c.params) << c.typ;
        EXPECT_STREQ(e.FileKeyword(), c.keyword);
        EXPECT_EQ(InfosOf(e), c.line);
        EXPECT_EQ(e.isOk(), c.ok) << c.typ << " " << c.val;
        EXPECT_EQ(e.isTemp(), c.temp) << c.typ << " " << c.val;
    }
    EXPECT_EQ(CExcent(2, kNaN).isOk(), 0);
    const CExcent unset;
    EXPECT_EQ(unset.getTyp(), -1);
    EXPECT_EQ(unset.isTemp(), 1);
}
