#include <gtest/gtest.h>

#include <cmath>

#include <carnet/carnet.h>

namespace {

CPointGen* Pt(const char* name, double x, double y, double z, const char* sy = "") {
    return new CPointGen(name, x, y, z, sy);
}

}  // namespace

TEST(Validate, StationsAndObservations) {
    CCarnet book;
    CNorvexTxtWnd wnd;
    EXPECT_EQ(book.validStation(&wnd, new CStation("S1", 1.5, 10.0, ""), 4), nullptr);
    EXPECT_EQ(book.validStation(&wnd, new CStation("", 1.5, 10.0, ""), 4), nullptr);
    EXPECT_EQ(book.validStation(&wnd, nullptr, 4), nullptr);
    ASSERT_EQ(book.length(), 1);
    ASSERT_EQ(wnd.Texts().size(), 1u);
    EXPECT_EQ(wnd.Texts()[0], "Erreur ligne 4 : donn\xE9" "es incompl\xE8tes sur la station <> !");

    // A negative distance is horizontal: AV absent becomes 100 and a note is added.
    book.validReference(&wnd, new CReference("R1", UNDEF_VALUE, 10.0, UNDEF_VALUE, -25.0, ""), 5);
    ASSERT_EQ(book.length(), 3);
    EXPECT_EQ(book.typAt(1), 1000u);
    EXPECT_EQ(book.parAt(1), "Distance H. = 25.0000 => DI = 25.0000 (AV = 100.0000 Gr) ");
    auto* r = static_cast<CReference*>(book.ptrAt(2));
    EXPECT_DOUBLE_EQ(r->Di(), 25.0);
    EXPECT_DOUBLE_EQ(r->Av(), 100.0);
    EXPECT_DOUBLE_EQ(r->Hp(), 0.0);  // filled in once the observation is complete

    // With a vertical angle the horizontal distance is reduced to the slope.
    book.validMesure(&wnd, new CMesure("M1", 1.6, 10.0, 50.0, -10.0, ""), 6);
    ASSERT_EQ(book.length(), 5);
    EXPECT_EQ(book.typAt(4), 1003u);
    EXPECT_NEAR(static_cast<CMesure*>(book.ptrAt(4))->Di(), 10.0 / std::sin(std::asin(1.0) / 2), 1e-9);

    // HP without a distance is dropped, leaving a direction that is kept.
    book.validMesure(&wnd, new CMesure("M2", 1.6, 10.0, UNDEF_VALUE, UNDEF_VALUE, ""), 7);
    ASSERT_EQ(book.length(), 6);
    EXPECT_TRUE(IsUndef(static_cast<CMesure*>(book.ptrAt(5))->Hp()));

    // Incomplete: reported and destroyed. Temporary: silent, stays the caller's.
    wnd.Clear();
    book.validReference(&wnd, new CReference("R9", 1.0, UNDEF_VALUE, 50.0, 10.0, ""), 8);
    auto* temp = new CMesure("M9", UNDEF_VALUE, UNDEF_VALUE, UNDEF_VALUE, UNDEF_VALUE, "");
    book.validMesure(&wnd, temp, 9);
    EXPECT_EQ(book.length(), 6);
    ASSERT_EQ(wnd.Texts().size(), 1u);
    EXPECT_EQ(wnd.Texts()[0], "Erreur ligne 8 : donn\xE9" "es incompl\xE8tes sur la r\xE9" "f\xE9rence <R9> !");
    delete temp;
}

TEST(Validate, PointMergeOutcomes) {
    CNorvexTxtWnd wnd;
    {
        // A height-only point with its lock takes the plan position of a new one.
        CCarnet book;
        auto* e = new CPointGen("P1", 12.0, "");
        e->m_bZConst = 1;
        book.append(e, 1006);
        auto* p = new CPointGen("P1", 100.0, 200.0, "arbre");
        book.validPoint(&wnd, p, 1);
        EXPECT_EQ(book.length(), 1);
        EXPECT_EQ(e->m_X, 100.0);
        EXPECT_EQ(e->m_bXConst + e->m_bZConst, 2);
        EXPECT_EQ(e->m_Sy, "arbre");
        EXPECT_EQ(p->m_Np, "P1");  // absorbed: still alive and the caller's
        delete p;
    }
    {
        // Two heights that differ: a warning, and the new point is added.
        CCarnet book;
        book.append(new CPointGen("P1", 12.0, ""), 1006);
        book.validPoint(&wnd, new CPointGen("P1", 10.0, ""), 1);
        EXPECT_EQ(book.length(), 2);
        ASSERT_EQ(wnd.Texts().size(), 1u);
        EXPECT_EQ(wnd.Texts()[0], "Attention : le point <P1> a \xE9t\xE9 dupliqu\xE9 !");
        EXPECT_EQ(static_cast<CPointGen*>(book.ptrAt(1))->m_bZConst, 1);
    }
    wnd.Clear();
    {
        // A plan point takes a height; the same 3D point again is unchanged.
        CCarnet book;
        auto* e = new CPointGen("P1", 1.0, 2.0, "");
        book.append(e, 1006);
        auto* p = Pt("P1", 1.0, 2.0, 3.0);
        book.validPoint(&wnd, p, 1);
        EXPECT_EQ(e->m_Z, 3.0);
        delete p;
        auto* same = Pt("P1", 1.0, 2.0, 3.0);
        book.validPoint(&wnd, same, 1);
        EXPECT_EQ(book.length(), 1);
        delete same;
        // A different plan position conflicts.
        book.validPoint(&wnd, Pt("P1", 1.5, 2.0, 3.0), 1);
        EXPECT_EQ(book.length(), 2);
        EXPECT_EQ(wnd.Texts().size(), 1u);
    }
    {
        // An earlier placeholder without a height lock cannot take part.
        CCarnet book;
        book.append(new CPointGen("P1", UNDEF_VALUE, ""), 1006);
        book.validPoint(&wnd, Pt("P1", 1.0, 2.0, 3.0), 1);
        EXPECT_EQ(book.length(), 2);
        // A negative line number appends without merging.
        book.validPoint(&wnd, Pt("P1", 1.0, 2.0, 3.0), -1);
        EXPECT_EQ(book.length(), 3);
        // Incomplete points are destroyed; only a non-temporary one is
        // reported. A coordinate that is not a number makes a point incomplete.
        wnd.Clear();
        const double inf = HUGE_VAL;
        book.validPoint(&wnd, new CPointGen("P2", 1.0, UNDEF_VALUE, ""), 7);
        book.validPoint(&wnd, new CPointGen("P3", UNDEF_VALUE, ""), 8);
        book.validPoint(&wnd, new CPointGen("P4", std::nan(""), 2.0, 3.0, ""), 9);
        book.validPoint(&wnd, new CPointGen("P5", 1.0, inf, ""), 10);
        book.validPoint(&wnd, new CPointGen("P6", -inf, ""), 11);
        EXPECT_EQ(book.length(), 3);
        EXPECT_EQ(wnd.Texts(), (std::vector<std::string>{
                                   "Erreur ligne 7 : donn\xE9" "es incompl\xE8tes sur le point <P2> !",
                                   "Erreur ligne 9 : donn\xE9" "es incompl\xE8tes sur le point <P4> !",
                                   "Erreur ligne 10 : donn\xE9" "es incompl\xE8tes sur le point <P5> !",
                                   "Erreur ligne 11 : donn\xE9" "es incompl\xE8tes sur le point <P6> !"}));
    }
}

TEST(Validate, CommentFormatsAreFilledSafely) {
    CCarnet book;
    book.validComment("a=%s b=%s", "", "x");
    EXPECT_EQ(book.length(), 0);
    book.validComment("a=%s b=%s", "1", "2");
    book.validComment("only %s", "1", "");
    // More placeholders than texts, or other conversions, read nothing.
    book.validComment("%s %s %s %d %n 100%%", "1", "2");
    ASSERT_EQ(book.length(), 3);
    EXPECT_EQ(book.parAt(0), "a=1 b=2");
    EXPECT_EQ(book.parAt(1), "only 1");
    EXPECT_EQ(book.parAt(2), "1 2  %d %n 100%");
}
