#include <gtest/gtest.h>

#include <climits>

#include <carnet/numconv.h>

TEST(NumConv, AtofReadsDecimalFormsOnly) {
    EXPECT_DOUBLE_EQ(numconv::Atof("  -12.50xyz"), -12.5);
    EXPECT_DOUBLE_EQ(numconv::Atof("+3.25"), 3.25);
    EXPECT_DOUBLE_EQ(numconv::Atof(".5"), 0.5);
    EXPECT_DOUBLE_EQ(numconv::Atof("1e3"), 1000.0);
    EXPECT_DOUBLE_EQ(numconv::Atof("1e"), 1.0);
    EXPECT_DOUBLE_EQ(numconv::Atof("2E-2m"), 0.02);
    EXPECT_EQ(numconv::Atof("inf"), 0.0);
    EXPECT_EQ(numconv::Atof("nan"), 0.0);
    EXPECT_EQ(numconv::Atof("-infinity"), 0.0);
    EXPECT_EQ(numconv::Atof("0x1A"), 0.0);
    EXPECT_EQ(numconv::Atof("."), 0.0);
    EXPECT_EQ(numconv::Atof(nullptr), 0.0);
}

TEST(NumConv, AtoiSaturates) {
    EXPECT_EQ(numconv::Atoi(" 42abc"), 42);
    EXPECT_EQ(numconv::Atoi("-7"), -7);
    EXPECT_EQ(numconv::Atoi("99999999999999999999"), INT_MAX);
    EXPECT_EQ(numconv::Atoi("-99999999999999999999"), INT_MIN);
    EXPECT_EQ(numconv::Atoi("x1"), 0);
}

TEST(NumConv, DecimalCountsAreMadeSafe) {
    EXPECT_EQ(numconv::Fixed(1.5, -3), "2");
    EXPECT_EQ(numconv::Fixed(0.25, 2), "0.25");
    EXPECT_EQ(numconv::Fixed(1.0, 1000).size(), 32u);  // "1." and 30 decimals
    EXPECT_DOUBLE_EQ(numconv::Round(399.999996, 5), 400.0);
    EXPECT_DOUBLE_EQ(numconv::Round(1234.56789, 4), 1234.5679);
    EXPECT_EQ(numconv::Round(-999999.0, 4), -999999.0);
}
