// The computation of small books whose every figure is worked out by hand
// in the comments beside it.
#include <carnet/survey/compute.h>

#include <cmath>
#include <cstdlib>
#include <string>

#include <gtest/gtest.h>

#include <carnet/carnet.h>

namespace {

using namespace carnet::survey;

// Books loaded with their options kept in a profile of their own.
class Compute : public ::testing::Test {
protected:
    void SetUp() override {
        char folder[] = "/tmp/carnet-compute-XXXXXX";
        ASSERT_NE(mkdtemp(folder), nullptr);
        m_folder = folder;
    }
    void TearDown() override { std::system(("rm -rf '" + m_folder + "'").c_str()); }

    // The computation of a book; `options` are its option lines.
    Computation Of(const std::string& lines, const std::string& options = kNoCorrections) {
        m_book = std::make_unique<CCarnet>();
        CNorvexTxtWnd wnd;
        m_book->LoadBytes(&wnd, options + lines, (m_folder + "/p" + std::to_string(++m_count) + ".ini").c_str(), 0);
        EXPECT_EQ(wnd.Texts().size(), 0u) << (wnd.Texts().empty() ? "" : wnd.Texts()[0]);
        return carnet::survey::Compute(*m_book);
    }

    static const Shot* ShotOf(const Computation& c, const std::string& name) {
        for (const Shot& s : c.shots)
            if (s.name == name) return &s;
        return nullptr;
    }
    static const ComputedPoint* PointOf(const Computation& c, const std::string& name) {
        for (const ComputedPoint& p : c.points)
            if (p.name == name) return &p;
        return nullptr;
    }

    // No distance correction, no curvature: the plain polar formulas.
    static inline const std::string kNoCorrections = "Option_Correc 0 0.0 0.0 0 0 0 6366\n";
    std::unique_ptr<CCarnet> m_book;
    std::string m_folder;
    int m_count = 0;
};

TEST(Angles, BearingsAndTurns) {
    struct Case {
        double xa, ya, xb, yb, bearing;
    } bearings[] = {{0, 0, 0, 1, 0},   {0, 0, 1, 0, 100},  {0, 0, 0, -1, 200}, {0, 0, -1, 0, 300},
                    {0, 0, 1, 1, 50},  {0, 0, -1, 1, 350}, {5, 5, 5, 5, 0},    {10, 20, 10 - 1e-12, 21, 400 - 6.4e-11}};
    for (const Case& c : bearings) {
        const double b = Bearing(c.xa, c.ya, c.xb, c.yb);
        EXPECT_NEAR(b, c.bearing, 1e-9) << c.xb << " " << c.yb;
        EXPECT_TRUE(b >= 0 && b < 400);
    }
    EXPECT_DOUBLE_EQ(Turn(-1), 399);
    EXPECT_DOUBLE_EQ(Turn(400), 0);
    EXPECT_DOUBLE_EQ(Turn(812.5), 12.5);
    EXPECT_DOUBLE_EQ(HalfTurn(300), -100);
    EXPECT_DOUBLE_EQ(HalfTurn(200), 200);
    EXPECT_DOUBLE_EQ(HalfTurn(-200), 200);
    EXPECT_DOUBLE_EQ(HalfTurn(-0.5), -0.5);
}

// A station on a known point, oriented by two references, radiating
// measures: first face, second face, sloping, and one of each eccentric.
TEST_F(Compute, SetUpOrientationRadiationEccentrics) {
    const Computation c = Of(
        "Point A 0 1000.000 1000.000 100.000 borne\n"
        "Point B 0 1000.000 1100.000 -999999 borne\n"
        "Point C 0 1100.000 1000.000 -999999 borne\n"
        "Station A 1.500\n"
        // bearing A->B 0: V0 = 0 - 350 = 50; A->C 100: V0 = 100 - 50.002 = 49.998;
        // same distances: V0 = 49.999, deviations +0.001 and -0.001 (0.0016 m at 100 m).
        "Reference B 350.0000\n"
        "Reference C 50.0020\n"
        // bearing 49.999 + 50.001 = 100, horizontal: X 1050, Y 1000, Z 100 + 1.5 - 1.5.
        "Mesure P1 1.500 50.0010 100.0000 50.000 a\n"
        // second face: AH 250.001 - 200, AV 400 - 300: the same point.
        "Mesure P2 1.500 250.0010 300.0000 50.000 b\n"
        // bearing 200, zenith 95: Dh = 100 sin 95g = 99.6917334, dZ = 100 cos 95g + 1.5 - 2 = 7.3459096.
        "Mesure P3 2.000 150.0010 95.0000 100.000 c\n"
        // bearing 100, 10 m, the prism 0.5 m short of the point: X 1010.5.
        "ExcentRad 0.5000\nMesure P4 1.500 50.0010 100.0000 10.000 d\n"
        // looking east, 0.2 m to the right is south: X 1010, Y 999.8.
        "ExcentTan 0.2000\nMesure P5 1.500 50.0010 100.0000 10.000 e\n"
        // 0.3 m above the prism: Z 100.3.
        "ExcentVer 0.3000\nMesure P6 1.500 50.0010 100.0000 10.000 f\n");
    ASSERT_EQ(c.setUps.size(), 1u);
    const carnet::survey::SetUp& set = c.setUps[0];
    EXPECT_EQ(set.from, StationFrom::KnownPoint);
    EXPECT_EQ(Line(set.fromElement), 1);
    EXPECT_EQ(set.orientation, OrientationFrom::References);
    EXPECT_NEAR(set.v0, 49.999, 1e-9);
    ASSERT_EQ(set.references.size(), 2u);
    EXPECT_NEAR(set.references[0].deviation, 0.001, 1e-9);
    EXPECT_NEAR(set.references[1].deviation, -0.001, 1e-9);
    EXPECT_NEAR(set.references[0].offset, 0.001 * M_PI / 200 * 100, 1e-9);
    EXPECT_FALSE(set.references[0].flagged);
    struct Expected {
        const char* name;
        double x, y, z;
    } expected[] = {{"P1", 1050, 1000, 100},
                    {"P2", 1050, 1000, 100},
                    {"P3", 1000, 1000 - 99.6917334, 107.3459096},
                    {"P4", 1010.5, 1000, 100},
                    {"P5", 1010, 999.8, 100},
                    {"P6", 1010, 1000, 100.3}};
    for (const Expected& e : expected) {
        SCOPED_TRACE(e.name);
        const Shot* s = ShotOf(c, e.name);
        ASSERT_NE(s, nullptr);
        EXPECT_NEAR(s->x, e.x, 1e-6);
        EXPECT_NEAR(s->y, e.y, 1e-6);
        ASSERT_TRUE(s->z);
        EXPECT_NEAR(*s->z, e.z, 1e-6);
    }
    EXPECT_EQ(set.computed, 6);
    EXPECT_TRUE(c.leftOut.empty());
    EXPECT_TRUE(c.Clean());
}

// The mean orientation of references either side of north, and the
// tolerance: 399.99 and 0.01 average to 0, not to 200.
TEST_F(Compute, OrientationAcrossNorthAndItsTolerance) {
    const Computation c = Of(
        "Point A 0 0.000 0.000 -999999 a\nPoint B 0 0.000 100.000 -999999 b\nPoint C 0 0.000 -300.000 -999999 c\n"
        // V0 from B: 0 - 0.01 = 399.99 (100 m); from C: 200 - 199.97 = 0.03 (300 m);
        // weighted: (-0.01 * 100 + 0.03 * 300) / 400 = 0.02.
        "Station A 1.5\nReference B 0.0100\nReference C 199.9700\n",
        kNoCorrections + "Option_Planim 0 0.015 0.010 0.010 0.010 0.010 0.010 0\n");
    ASSERT_EQ(c.setUps.size(), 1u);
    EXPECT_NEAR(c.setUps[0].v0, 0.02, 1e-9);
    EXPECT_NEAR(c.setUps[0].references[0].deviation, -0.03, 1e-9);
    EXPECT_TRUE(c.setUps[0].references[0].flagged);  // 0.03 > TolAngles 0.015
    EXPECT_NEAR(c.setUps[0].references[1].deviation, 0.01, 1e-9);
    EXPECT_FALSE(c.setUps[0].references[1].flagged);
    EXPECT_FALSE(c.Clean());
}

// The distance corrections, stored or computed, and the curvature term.
TEST_F(Compute, DistanceCorrections) {
    const std::string shot = "Point A 0 0.000 0.000 0.000 a\nStation A 0.0 0.0\nMesure P 0.0 100.0000 100.0000 1000.000 p\n";
    struct Case {
        const char* options;
        double alter, level, x, z;
    } cases[] = {
        // As stored: 10 - 5 cm/km, 1000 m becomes 1000.05 m; no curvature.
        {"Option_Correc 0 10.0 -5.0 0 0 0 6366\n", 10, -5, 1000.05, 0},
        // Computed on a local grid: -H / R = -637 / 6370000 * 1e5 = -10 cm/km;
        // curvature and refraction 0.87 * 1000^2 / (2 * 6370000) = 0.0682889.
        {"Option_Correc 1 0.0 0.0 0 0 637 6370\n", 0, -10, 999.9, 0.0682889},
        // Zone II at its origin: the scale is its k0, 0.99987742: -12.258 cm/km.
        {"Option_Correc 1 0.0 0.0 600000 2200000 0 6370\nOption_Projec Projection Lambert Zone II\n", -12.258, 0,
         999.87742, 0.0682889},
    };
    for (const Case& k : cases) {
        SCOPED_TRACE(k.options);
        const Computation c = Of(shot, k.options);
        EXPECT_NEAR(c.corrections.alterLineaire, k.alter, 1e-3);
        EXPECT_NEAR(c.corrections.corrNivZero, k.level, 1e-9);
        ASSERT_EQ(c.shots.size(), 1u);
        EXPECT_NEAR(c.shots[0].x, k.x, 1e-5);
        ASSERT_TRUE(c.shots[0].z);
        EXPECT_NEAR(*c.shots[0].z, k.z, 1e-6);
    }
}

// Without a stored mean position, the scale is taken at the mean of the
// known points; the instrument's collimation and prism constant apply.
TEST_F(Compute, InstrumentAndMeanPosition) {
    const Computation c = Of(
        "Appareil 0.010000 0.005000 0.0003 0.0003 0.002 2.0 first\n"
        "Point A 0 600000.000 2200000.000 0.000 a\n"
        "Station A 0.0 0.0\n"
        "Appareil 0.500000 0.500000 0.0003 0.0003 0.002 2.0 not in force\n"
        // zenith 100.01 - 0.01 = 100, slope 100 + 0.005: 100.005 * 0.99987742 = 99.9927413.
        "Mesure P 0.0 100.0000 100.0100 100.000 p\n",
        "Option_Correc 1 0.0 0.0 0 0 0 6370\nOption_Projec EPSG:27572\n");
    ASSERT_EQ(c.shots.size(), 1u);
    EXPECT_EQ(Line(c.setUps[0].instrument), 1);
    EXPECT_NEAR(c.shots[0].x, 600000 + 100.005 * 0.99987742, 2e-6);
    EXPECT_NEAR(c.shots[0].y, 2200000, 1e-9);
    EXPECT_NE(c.corrections.origin.find("the mean of the known points"), std::string::npos);
}

// Successive radiation: a station set up on a point measured before it;
// the Point line before a station wins over one after it.
TEST_F(Compute, StationCoordinates) {
    const Computation c = Of(
        "Point A 0 0.000 0.000 10.000 a\n"
        "Station A 1.0 0.0\n"
        "Mesure S 1.0 100.0000 100.0000 20.000 s\n"  // S at (20, 0), Z 10
        "Station S 1.0 100.0\n"
        "Mesure Q 1.0 100.0000 100.0000 5.000 q\n"   // bearing 200: Q at (20, -5)
        "Point B 0 50.000 50.000 -999999 b\n"
        "Station B 1.0 0.0\nMesure R 1.0 0.0000 100.0000 1.000 r\n"  // the line before: R at (50, 51)
        "Point B 0 70.000 70.000 -999999 b\n"
        "Station C 1.0 0.0\nMesure T 1.0 0.0000 100.0000 1.000 t\n"  // only a line after: T at (5, 6)
        "Point C 0 5.000 5.000 -999999 c\n");
    ASSERT_EQ(c.setUps.size(), 4u);
    EXPECT_EQ(c.setUps[1].from, StationFrom::ComputedPoint);
    EXPECT_EQ(Line(c.setUps[1].fromElement), 3);
    EXPECT_EQ(c.setUps[1].orientation, OrientationFrom::StationV0);
    ASSERT_TRUE(c.setUps[1].z);
    EXPECT_NEAR(*c.setUps[1].z, 10, 1e-9);
    const std::pair<const char*, std::pair<double, double>> expected[] = {
        {"Q", {20, -5}}, {"R", {50, 51}}, {"T", {5, 6}}};
    for (const auto& [name, xy] : expected) {
        const Shot* s = ShotOf(c, name);
        ASSERT_NE(s, nullptr) << name;
        EXPECT_NEAR(s->x, xy.first, 1e-9) << name;
        EXPECT_NEAR(s->y, xy.second, 1e-9) << name;
    }
    EXPECT_EQ(PointOf(c, "Q")->source, PointSource::Radiated);
}

// Points determined more than once: a locked one keeps its coordinates and
// is checked, another takes the mean (its own Point line counting as one).
TEST_F(Compute, RepeatedDeterminations) {
    const Computation c = Of(
        "Point A 3 0.000 0.000 0.000 a\nPoint L 3 10.000 0.000 0.000 l\nPoint U 0 0.000 10.000 -999999 u\n"
        "Station A 0.0 0.0\n"
        "Mesure L 0.0 100.0000 100.0000 10.030 l\n"  // L seen 3 cm too far: checked, not moved
        "Mesure U 0.0 0.0000 100.0000 10.004 u\n"    // U: (0, 10) and (0, 10.004): mean 10.002
        "Mesure N 0.0 200.0000 100.0000 10.000 n\nMesure N 0.0 200.0000 100.0000 10.006 n\n");
    const ComputedPoint* l = PointOf(c, "L");
    const ComputedPoint* u = PointOf(c, "U");
    const ComputedPoint* n = PointOf(c, "N");
    ASSERT_TRUE(l && u && n);
    EXPECT_EQ(*l->x, 10);
    EXPECT_EQ(l->source, PointSource::Known);
    EXPECT_NEAR(*u->y, 10.002, 1e-9);
    EXPECT_EQ(u->source, PointSource::Mean);
    EXPECT_NEAR(*n->y, -10.003, 1e-9);
    ASSERT_EQ(c.multiples.size(), 3u);
    for (const Determinations& d : c.multiples) {
        SCOPED_TRACE(d.name);
        const bool locked = d.name == "L", flagged = d.name == "L";
        const double spread = d.name == "L" ? 0.03 : d.name == "U" ? 0.002 : 0.003;
        EXPECT_EQ(d.lockedPlan, locked);
        EXPECT_EQ(d.flagged, flagged);
        EXPECT_NEAR(d.planSpread, spread, 1e-9);
    }
}

// Bad input is left out with its line and reason, never computed.
TEST_F(Compute, LeftOutObservations) {
    const Computation c = Of(
        "Mesure X0 1.0 0.0 100.0 10.0 x\n"                         // 1
        "Point A 0 0.000 0.000 0.000 a\nPoint B 0 0.000 10.000 0.000 b\n"
        "Station A 1.0\nReference B 0.0000\n"                     // 4, 5
        "Reference A 1.0 10.0 100.0 5.0 a\n"                      // 6
        "Mesure X1 1.0 10.0 100.0 0.000 x\n"                      // 7
        "Mesure X2 1.0 10.0 100.0 -3.0 x\n"                       // 8
        "Mesure X3 1.0 10.0 0.0 5.0 x\n"                          // 9
        "Mesure X4 1.0 10.0 200.0 5.0 x\n"                        // 10
        "Station Z 1.0 0.0\nMesure X5 1.0 10.0 100.0 5.0 x\n"     // 11, 12
        "Point D 0 9.000 9.000 0.000 d\nStation D 1.0\nMesure X6 1.0 10.0 100.0 5.0 x\n"  // 14, 15
        "ExcentRad 0.5\n");                                       // 16
    const std::pair<int, const char*> expected[] = {
        {1, "observation before any station"},
        {6, "sight to the station itself"},
        {7, "zero or negative distance"},
        {8, "zero or negative distance"},
        {9, "vertical sight"},
        {10, "vertical sight"},
        {12, "the station Z has no coordinates"},
        {15, "the set-up on D is unoriented"},
        {16, "eccentric with no observation after it"},
    };
    ASSERT_EQ(c.leftOut.size(), std::size(expected));
    for (size_t k = 0; k < std::size(expected); ++k) {
        EXPECT_EQ(Line(c.leftOut[k].element), expected[k].first);
        EXPECT_NE(c.leftOut[k].reason.find(expected[k].second), std::string::npos) << c.leftOut[k].reason;
    }
    EXPECT_TRUE(c.shots.empty());
    EXPECT_FALSE(c.Clean());
}

}  // namespace
