#include <gtest/gtest.h>

#include <limits>

#include <carnet/carnet.h>

#include "records/record_texts.h"

namespace {

const double U = UNDEF_VALUE;

}  // namespace

TEST(Lecture, DisplayTextColumns) {
    struct Case { double lm, dh; std::string backsight, foresight; };
    const Case cases[] = {
        {U, U, "LM = -999999.0000", Blanks(15) + "LM = -999999.0000"},
        {1.2345, U, "LM =  1.2345", Blanks(15) + "LM =  1.2345"},
        {1.2345, 45.6, "LM =  1.2345" + Blanks(15) + " , DH =  45.6000", Blanks(15) + "LM =  1.2345 , DH =  45.6000"},
        {1.2345, 0.0, "LM =  1.2345" + Blanks(15) + " , DH =   0.0000", Blanks(15) + "LM =  1.2345 , DH =   0.0000"},
        {1.2345, -1.0, "LM =  1.2345", Blanks(15) + "LM =  1.2345"},
        {12.34567, 3.0, "LM = 12.3457" + Blanks(15) + " , DH =   3.0000", Blanks(15) + "LM = 12.3457 , DH =   3.0000"},
    };
    for (const Case& c : cases) {
        CLectAR ar("B1", c.lm, c.dh, "");
        CLectAV av("B1", c.lm, c.dh, "");
        EXPECT_EQ(ParamsOf(ar), c.backsight);
        EXPECT_EQ(ParamsOf(av), c.foresight);
        if (c.dh >= 0.0) {
            EXPECT_EQ(ParamsOf(ar).find("DH"), 30u);
            EXPECT_EQ(ParamsOf(av).find("DH"), 30u);
        }
    }
}

TEST(Lecture, Predicates) {
    struct Case { const char* np; double lm, dh; int ok, temp; };
    const Case cases[] = {
        {"B1", 1.2345, U, 1, 0}, {"B1", 1.0, 0.0, 1, 0}, {"B1", U, 45.6, 0, 0}, {"", 1.0, U, 0, 0},
        {"B1", U, U, 0, 1},      {"B1", std::numeric_limits<double>::quiet_NaN(), U, 0, 0},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(CLectAR(c.np, c.lm, c.dh, nullptr).isOk(), c.ok) << c.lm << " " << c.dh;
        EXPECT_EQ(CLectAV(c.np, c.lm, c.dh, nullptr).isOk(), c.ok);
        EXPECT_EQ(CLectAV(c.np, c.lm, c.dh, nullptr).isTemp(), c.temp);
    }
    EXPECT_EQ(CLectAR().isTemp(), 1);
    EXPECT_EQ(CLectAR().isOk(), 0);
}

TEST(Lecture, FileLines) {
    CLectAR ar("B1", 1.234, 45.6, "rep\xE8re 2");
    EXPECT_EQ(InfosOf(ar), "NivLectAR" + Blanks(8) + "B1" + Blanks(14) + "  1.234000  45.600000 rep\xE8re***2");
    EXPECT_EQ(ar.Sy(), "rep\xE8re 2");  // marked in the line only
    CLectAV av(nullptr, U, U, nullptr);
    EXPECT_EQ(InfosOf(av), "NivLectAV" + Blanks(8) + "????????????????" + " " + Blanks(7) + " " + Blanks(8) + " ");
}

TEST(Lecture, TwinsKeepTheirOwnDecimalCounts) {
    DeciGuard z(&CLectAR::DeciZ, &CLectAR::setDeciZ, 2), xy(&CLectAR::DeciXY, &CLectAR::setDeciXY, 1);
    EXPECT_EQ(CLectAV::DeciZ(), 4);
    EXPECT_EQ(CLectAV::DeciXY(), 4);
    CLectAR ar("B1", 1.2345, 45.6, "");
    CLectAV av("B1", 1.2345, 45.6, "");
    EXPECT_EQ(ParamsOf(ar), "LM =  1.23" + Blanks(12) + " , DH =  45.6");
    EXPECT_EQ(ParamsOf(av), Blanks(15) + "LM =  1.2345 , DH =  45.6000");
    EXPECT_EQ(ar.FormLm(), 1.23);
    EXPECT_EQ(av.FormLm(), 1.2345);
    ar.setLm(U);
    av.setLm(U);
    EXPECT_EQ(InfosOf(ar).substr(33), " " + Blanks(5) + "  45.600000 ");
    EXPECT_EQ(InfosOf(av).substr(33), " " + Blanks(7) + "  45.600000 ");
}
