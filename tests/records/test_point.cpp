#include <gtest/gtest.h>

#include <carnet/carnet.h>

namespace {

// Exposes the protected rounding members.
struct PointProbe : CPointGen {
    using CPointGen::formatXY;
    using CPointGen::formatZ;
};

std::string Params(CPointGen& p) {
    CString s;
    p.Params(s);
    return s.GetString();
}

std::string Infos(CPointGen& p) {
    CString s;
    p.Infos(s);
    return s.GetString();
}

}  // namespace

TEST(Point, ConstructionForms) {
    CPointGen d;
    EXPECT_TRUE(IsUndef(d.m_X) && IsUndef(d.m_Y) && IsUndef(d.m_Z));
    EXPECT_EQ(d.isOk(), 0);
    EXPECT_EQ(d.isTemp(), 1);
    EXPECT_EQ(d.hasXY(), 0);
    EXPECT_EQ(d.hasZ(), 0);
    EXPECT_EQ(Params(d), "");

    CPointGen p2(static_cast<const char*>(nullptr), 1.0, 2.0, static_cast<const char*>(nullptr));
    EXPECT_TRUE(p2.m_Np.IsEmpty());
    EXPECT_TRUE(IsUndef(p2.m_Z));
    CString np("N1"), sy("s");
    CPointGen p1(np, 5.5, sy);
    EXPECT_TRUE(IsUndef(p1.m_X));
    EXPECT_EQ(p1.m_Z, 5.5);
    EXPECT_EQ(p1.is1D(), 1);
    CPointGen copy(p1);
    copy.m_Np = "other";
    EXPECT_EQ(p1.m_Np, "N1");
}

TEST(Point, PredicatesAtTheirBoundaries) {
    CPointGen zero("P", 0.0, 0.0, "");
    EXPECT_EQ(zero.hasXY(), 1);
    EXPECT_EQ(zero.is2D(), 1);
    EXPECT_EQ(zero.isOk(), 1);

    CPointGen nearly("P", -999999.0000001, 1.0, "");
    EXPECT_EQ(nearly.hasXY(), 1);

    CPointGen halfPlan("P", 1.0, UNDEF_VALUE, "");
    EXPECT_EQ(halfPlan.is2D(), 0);
    EXPECT_EQ(halfPlan.is1D(), 0);
    EXPECT_EQ(halfPlan.isOk(), 0);
    EXPECT_EQ(halfPlan.isTemp(), 0);

    CPointGen halfWithZ("P", 1.0, UNDEF_VALUE, 3.0, "");
    EXPECT_EQ(halfWithZ.isOk(), 0);

    CPointGen unnamed("", 1.0, 2.0, 3.0, "");
    EXPECT_EQ(unnamed.hasXYZ(), 1);
    EXPECT_EQ(unnamed.is3D(), 0);
    EXPECT_EQ(unnamed.isOk(), 0);

    CPointGen placeholder;
    placeholder.setNp("P");
    EXPECT_EQ(placeholder.isOk(), 0);
    EXPECT_EQ(placeholder.isTemp(), 1);
    placeholder.setZConst(1);
    EXPECT_EQ(placeholder.isOk(), 1);
    EXPECT_EQ(placeholder.isTemp(), 0);
    placeholder.setZConst(0);
    placeholder.setXConst(1);  // the planimetric lock does not count
    EXPECT_EQ(placeholder.isOk(), 0);
    EXPECT_EQ(placeholder.isTemp(), 1);
}

TEST(Point, LocksRefuseUnforcedChanges) {
    CPointGen p("P", 1.0, 2.0, 3.0, "");
    p.setZConst(1);
    EXPECT_EQ(p.setPt(10.0, 20.0, 30.0, 0), 0);  // refused as a whole
    EXPECT_EQ(p.m_X, 1.0);
    EXPECT_EQ(p.setPt(10.0, 20.0, 0), 1);
    EXPECT_EQ(p.m_X, 10.0);
    EXPECT_EQ(p.setPt(30.0, 0), 0);
    EXPECT_EQ(p.setPt(30.0, 1), 1);
    EXPECT_EQ(p.m_Z, 30.0);
    EXPECT_EQ(p.setPt(UNDEF_VALUE, UNDEF_VALUE, UNDEF_VALUE, 1), 1);
    EXPECT_EQ(p.hasXY(), 0);

    p.setPConst(1);
    EXPECT_EQ(p.isPConst(), 1);
    p.setXConst(0);
    EXPECT_EQ(p.isZConst(), 1);
    EXPECT_EQ(p.isPConst(), 0);
    EXPECT_EQ(p.setPt(1.0, 2.0, 0), 1);
    EXPECT_EQ(Params(p), "X =       1.0000 , Y =       2.0000 , CP = 2");
}

TEST(Point, DisplayText) {
    CPointGen p("P1", 1234.56789, -2.5, 100.0, "");
    EXPECT_EQ(Params(p), "X =    1234.5679 , Y =      -2.5000 , Z =   100.0000");
    p.setPConst(1);
    EXPECT_EQ(Params(p), "X =    1234.5679 , Y =      -2.5000 , Z =   100.0000 , CP = 3");

    CPointGen::setSwapXY(1);
    EXPECT_EQ(Params(p), "Y =    1234.5679 , X =      -2.5000 , Z =   100.0000 , CP = 3");
    CPointGen::setSwapXY(0);

    CPointGen z("Z1", 12.0, "");
    z.setXConst(1);
    EXPECT_EQ(Params(z), "Z =    12.0000 , CP = 1");

    CPointGen::setDeciXY(2);
    CPointGen::setDeciZ(0);
    EXPECT_EQ(Params(p), "X =    1234.57 , Y =      -2.50 , Z =    100 , CP = 3");
    CPointGen::setDeciXY(-3);  // formats as 0 decimals
    EXPECT_EQ(Params(p).substr(0, 12), "X =     1235");
    CPointGen::setDeciXY(4);
    CPointGen::setDeciZ(4);
}

TEST(Point, RoundingMembers) {
    EXPECT_DOUBLE_EQ(PointProbe::formatXY(1.23456), 1.2346);
    EXPECT_EQ(PointProbe::formatXY(-999999.0), -999999.0);
    EXPECT_EQ(PointProbe::formatZ(-999999.0), -999999.0);
    CPointGen p("P", 1.23456, 2.00004, 3.99996, "");
    EXPECT_DOUBLE_EQ(p.Formx(), 1.2346);
    EXPECT_DOUBLE_EQ(p.Formy(), 2.0);
    EXPECT_DOUBLE_EQ(p.Formz(), 4.0);
}

TEST(Point, FileLine) {
    CPointGen p("P1", 1000.25, 2000.5, "arbre");
    p.setXConst(1);
    EXPECT_EQ(Infos(p), "Point            P1               1    1000.250000    2000.500000 -999999.000000 arbre");

    CPointGen unnamed("", 1.0, "");
    unnamed.setPConst(1);
    EXPECT_EQ(Infos(unnamed),
              "Point            ???????????????? 3 -999999.000000 -999999.000000     1.000000 ");

    // A long name is written whole, never cut.
    CPointGen longName("ABCDEFGHIJKLMNOPQRST", 1.0, 2.0, "");
    EXPECT_EQ(Infos(longName).substr(0, 40), "Point            ABCDEFGHIJKLMNOPQRST 0 ");
}

TEST(Point, SymbolBlanksBecomeMarksInTheRecord) {
    CPointGen p("P1", 1.0, 2.0, 3.0, "borne 7 A");
    std::string line = Infos(p);
    EXPECT_EQ(line.substr(line.size() - 14), " borne***7***A");
    EXPECT_EQ(p.m_Sy, "borne***7***A");

    CNorvexTxtWnd w;
    p.Print(&w, 1);
    p.Print(nullptr, 1);
    ASSERT_EQ(w.Texts().size(), 1u);
    EXPECT_EQ(w.Texts()[0], "000001  " + line);
}
