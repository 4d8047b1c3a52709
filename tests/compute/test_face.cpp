#include <gtest/gtest.h>

#include <cmath>

#include <carnet/carnet.h>

TEST(FaceReduction, FunctionalPairReducesOnlyAboveTheHalfTurn) {
    EXPECT_DOUBLE_EQ(CCarnet::avCD(300.0), 100.0);
    EXPECT_DOUBLE_EQ(CCarnet::avCD(200.0), 200.0);
    EXPECT_DOUBLE_EQ(CCarnet::avCD(150.0), 150.0);
    EXPECT_DOUBLE_EQ(CCarnet::avCD(450.0), -50.0);  // no upper limit
    EXPECT_TRUE(std::isnan(CCarnet::avCD(NAN)));
    EXPECT_DOUBLE_EQ(CCarnet::ahCD(350.0, 300.0), 150.0);
    EXPECT_DOUBLE_EQ(CCarnet::ahCD(50.0, 300.0), 250.0);
    EXPECT_DOUBLE_EQ(CCarnet::ahCD(50.0, 100.0), 50.0);
    EXPECT_DOUBLE_EQ(CCarnet::ahCD(-250.0, 300.0), -50.0);  // fmod keeps the sign
    // No special case for an unobserved angle in the pair.
    EXPECT_DOUBLE_EQ(CCarnet::ahCD(UNDEF_VALUE, 300.0), std::fmod(UNDEF_VALUE + 200.0, 400.0));
}

TEST(FaceReduction, InPlaceReductionIsClosedAtBothEnds) {
    struct Case {
        double ah, av;
        int result;
        double ahAfter, avAfter;
    };
    const Case cases[] = {
        {350.0, 300.0, 1, 150.0, 100.0}, {10.0, 200.0, 1, 210.0, 200.0}, {10.0, 400.0, 1, 210.0, 0.0},
        {10.0, 401.0, 0, 10.0, 401.0},   {10.0, 199.9, 0, 10.0, 199.9},
        {UNDEF_VALUE, 250.0, 1, UNDEF_VALUE, 150.0},
    };
    for (const Case& c : cases) {
        double ah = c.ah, av = c.av;
        EXPECT_EQ(CCarnet::setCD(ah, av), c.result) << c.ah << " " << c.av;
        EXPECT_DOUBLE_EQ(ah, c.ahAfter) << c.ah << " " << c.av;
        EXPECT_DOUBLE_EQ(av, c.avAfter) << c.ah << " " << c.av;
    }
    double ah = 1.0, av = NAN;
    EXPECT_EQ(CCarnet::setCD(ah, av), 0);
}
