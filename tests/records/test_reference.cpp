#include <gtest/gtest.h>

#include <limits>

#include <carnet/carnet.h>

#include "records/record_texts.h"

namespace {

const double U = UNDEF_VALUE;
const double kNaN = std::numeric_limits<double>::quiet_NaN();

}  // namespace

TEST(Reference, DisplayTextAndPredicates) {
    struct Case { const char* np; double hp, ah, av, di; const char* params; int ok, temp; };
    const Case cases[] = {
        {"R1", 1.6, 0.0, 100.1234, 123.456, "HP =   1.6000 , AH =   0.00000 , AV = 100.12340 , DI = 123.4560", 1, 0},
        {"R1", 0.0, 10.0, 100.0, 0.0, "HP =   0.0000 , AH =  10.00000 , AV = 100.00000 , DI =   0.0000", 1, 0},
        {"R2", U, 54.321, U, U, "AH =  54.32100", 1, 0},
        {"", 1.6, 0.0, 100.0, 12.0, "HP =   1.6000 , AH =   0.00000 , AV = 100.00000 , DI =  12.0000", 0, 0},
        {"R", U, 10.0, U, 5.0, "AH =  10.00000 , DI =   5.0000", 0, 0},
        {"R", 1.5, 10.0, U, U, "HP =   1.5000 , AH =  10.00000", 0, 0},
        {"R", U, 10.0, 100.0, U, "AH =  10.00000 , AV = 100.00000", 0, 0},
        {"R", 1.5, U, U, U, "HP =   1.5000", 0, 1},
        {"R", U, U, U, U, "", 0, 1},
        {"R", U, kNaN, U, U, nullptr, 0, 0},
        {"R", 1.6, 10.0, 100.0, kNaN, nullptr, 0, 0},
    };
    for (const Case& c : cases) {
        CReference r(c.np, c.hp, c.ah, c.av, c.di, "");
        CMesure m(c.np, c.hp, c.ah, c.av, c.di, "");
        if (c.params) {
            EXPECT_EQ(ParamsOf(r), c.params);
            EXPECT_EQ(ParamsOf(m), c.params);
        }
        EXPECT_EQ(r.isOk(), c.ok) << c.params;
        EXPECT_EQ(r.isTemp(), c.temp) << c.params;
        EXPECT_EQ(m.isOk(), c.ok);
    }
    const CReference direction("R2", 54.321, nullptr);
    EXPECT_TRUE(IsUndef(direction.Hp()) && IsUndef(direction.Av()) && IsUndef(direction.Di()));
    EXPECT_EQ(direction.FormAh(), 54.321);
}

TEST(Reference, FileLinesDifferOnlyInTheKeyword) {
    CReference r("R1", 1.6, 0.0, 100.1234, 123.456, "borne a");
    EXPECT_EQ(InfosOf(r), "Reference        R1                1.600000   0.0000000 100.1234000 123.456000 borne***a");
    EXPECT_EQ(r.Sy(), "borne***a");

    CMesure m("R1", 1.6, 0.0, 100.1234, 123.456, "borne a");
    const std::string mline = InfosOf(m);
    EXPECT_EQ(mline.substr(0, 16), "Mesure          ");
    EXPECT_EQ(mline.substr(16), InfosOf(r).substr(16));

    CMesure direction("M1", 54.321, "");
    EXPECT_EQ(InfosOf(direction), "Mesure           M1                         54.3210000" + Blanks(20));
    CReference partial("R3", 1.5, 54.321, U, U, "");
    EXPECT_EQ(InfosOf(partial), "Reference        R3                1.500000  54.3210000" + Blanks(20));
}

TEST(Reference, AbsentColumnsFollowTheReferenceCounts) {
    DeciGuard xy(&CReference::DeciXY, &CReference::setDeciXY, -5);
    DeciGuard ang(&CMesure::DeciAng, &CMesure::setDeciAng, 10);  // one set for both classes
    EXPECT_EQ(CReference::DeciAng(), 10);
    CMesure m("M1", 54.321, "x");
    EXPECT_EQ(InfosOf(m), "Mesure" + Blanks(11) + "M1" + Blanks(14) + " " + Blanks(8) + "  54.3210000" + " " +
                              Blanks(14) + " " + Blanks(4) + " x");
    EXPECT_EQ(ParamsOf(m), "AH =  54.3210000000");
}
