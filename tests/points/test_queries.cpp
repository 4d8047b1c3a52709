#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include <carnet/carnet.h>

namespace {

// An element of a code outside the type table (freed as raw memory).
void* Opaque() { return ::operator new(8); }

int AddStation(CCarnet& b, const char* np, double hi = 1.5) { return b.append(new CStation(np, hi, 0.0, ""), 1001); }
int AddMesure(CCarnet& b, const char* np, double hp = 1.6, double av = 100.0, double di = 25.0) {
    return b.append(new CMesure(np, hp, 10.0, av, di, ""), 1003);
}
int AddExcent(CCarnet& b, int kind, double v) { return b.append(new CExcent(kind, v), 1010); }

}  // namespace

TEST(Queries, TypedReadersGiveTheFieldOfTheirTypesOnly) {
    CCarnet b;
    b.append(new CPointGen("P1", 1.25, 2.5, 3.75, ""), 1006);              // 0
    b.append(new CStation("S1", 1.55, 12.345, ""), 1001);                  // 1
    b.append(new CReference("R1", 1.6, 54.321, 99.5, 120.25, ""), 1002);   // 2
    b.append(new CMesure("M1", 1.7, 154.321, 101.5, 20.5, ""), 1003);      // 3
    b.append(new CLectAR("B1", 1.234, 45.6, ""), 1004);                    // 4
    b.append(new CLectAV("B2", 2.345, 30.1, ""), 1005);                    // 5
    b.append(new CComment("note"), 1000);                                  // 6
    b.append(new CPointGen("P2", 7.0, ""), 1006);                          // 7: z only
    b.append(Opaque(), 1066);                                              // 8

    struct Reader {
        const char* name;
        double (CCarnet::*read)(int) const;
        std::vector<std::pair<int, double>> carried;  // every other index gives UNDEF_VALUE
    } readers[] = {
        {"xAt", &CCarnet::xAt, {{0, 1.25}, {7, UNDEF_VALUE}}},
        {"yAt", &CCarnet::yAt, {{0, 2.5}, {7, UNDEF_VALUE}}},
        {"zAt", &CCarnet::zAt, {{0, 3.75}, {7, 7.0}}},
        {"hiAt", &CCarnet::hiAt, {{1, 1.55}}},
        {"v0At", &CCarnet::v0At, {{1, 12.345}}},
        {"hpAt", &CCarnet::hpAt, {{2, 1.6}, {3, 1.7}}},
        {"ahAt", &CCarnet::ahAt, {{2, 54.321}, {3, 154.321}}},
        {"avAt", &CCarnet::avAt, {{2, 99.5}, {3, 101.5}}},
        {"diAt", &CCarnet::diAt, {{2, 120.25}, {3, 20.5}}},
        {"lmAt", &CCarnet::lmAt, {{4, 1.234}, {5, 2.345}}},
        {"dhAt", &CCarnet::dhAt, {{4, 45.6}, {5, 30.1}}},
    };
    for (const Reader& r : readers) {
        for (int i = 0; i < b.length(); ++i) {
            double expected = UNDEF_VALUE;
            for (const auto& c : r.carried)
                if (c.first == i) expected = c.second;
            EXPECT_EQ((b.*r.read)(i), expected) << r.name << " at " << i;
        }
    }
}

TEST(Queries, BackwardFindOfAnyStation) {
    for (bool withStations : {false, true}) {
        CCarnet b;
        for (int i = 0; i < 6; ++i) {
            if (withStations && (i == 2 || i == 4))
                AddStation(b, i == 2 ? "S1" : "S2");
            else
                b.append(new CPointGen("P", 1.0, 2.0, ""), 1006);
        }
        EXPECT_EQ(b.Find(1001, "", 5, -1), withStations ? 4 : -1);
        EXPECT_EQ(b.Find(1001, "", 3, -1), withStations ? 2 : -1);
        EXPECT_EQ(b.Find(1001, "S2", 5, -1), withStations ? 4 : -1);
        EXPECT_EQ(b.Find(1001, "S2", 3, -1), -1);
        EXPECT_EQ(b.Find(1001, "", 0, 0), withStations ? 2 : -1);
    }
}

TEST(Queries, EccentricGroups) {
    struct Case {
        const char* what;
        std::function<void(CCarnet&)> build;  // the observation is appended after these
        int lower;
        double er, et, ev;
    } cases[] = {
        {"measure, radial, vertical",
         [](CCarnet& b) { AddMesure(b, "M0"); AddExcent(b, 0, 0.25); AddExcent(b, 2, 0.5); }, -1, 0.25, 0.0, 0.5},
        {"radial closed off by a measure",
         [](CCarnet& b) { AddExcent(b, 0, 0.25); AddMesure(b, "M0"); }, -1, 0.0, 0.0, 0.0},
        {"the nearest of a kind wins",
         [](CCarnet& b) { AddExcent(b, 1, 0.1); AddExcent(b, 1, 0.2); }, -1, 0.0, 0.2, 0.0},
        {"other elements are passed over",
         [](CCarnet& b) {
             AddExcent(b, 0, 0.3);
             b.append(new CAppareil(), 1008);
             b.append(new CComment("c"), 1000);
             b.append(new CCommand("cmd"), 1009);
             b.append(Opaque(), 1066);
             AddExcent(b, 3, 9.0);
             AddExcent(b, -1, 8.0);
         },
         -1, 0.3, 0.0, 0.0},
        {"a station closes the group", [](CCarnet& b) { AddExcent(b, 2, 0.4); AddStation(b, "S1"); }, -1, 0.0, 0.0, 0.0},
        {"a point closes the group",
         [](CCarnet& b) { AddExcent(b, 2, 0.4); b.append(new CPointGen("P", 1.0, ""), 1006); }, -1, 0.0, 0.0, 0.0},
        {"a path closes the group",
         [](CCarnet& b) { AddExcent(b, 2, 0.4); b.append(new CChemin("C"), 1007); }, -1, 0.0, 0.0, 0.0},
        {"a levelling reading closes the group",
         [](CCarnet& b) { AddExcent(b, 2, 0.4); b.append(new CLectAV("B", 1.0, 2.0, ""), 1005); }, -1, 0.0, 0.0, 0.0},
        {"the lower index is not looked at",
         [](CCarnet& b) { AddExcent(b, 0, 0.25); AddExcent(b, 1, 0.75); }, 0, 0.0, 0.75, 0.0},
        {"a lower index below -1 searches down to 0",
         [](CCarnet& b) { AddExcent(b, 0, 0.25); }, -9, 0.25, 0.0, 0.0},
        {"nothing before the observation", [](CCarnet&) {}, -1, 0.0, 0.0, 0.0},
    };
    for (const Case& k : cases) {
        CCarnet b;
        k.build(b);
        const int obs = AddMesure(b, "M1");
        EXPECT_EQ(b.findER(obs, k.lower), k.er) << k.what;
        EXPECT_EQ(b.findET(obs, k.lower), k.et) << k.what;
        EXPECT_EQ(b.findEV(obs, k.lower), k.ev) << k.what;
    }
}

TEST(Queries, TextReadersOfRecordsWithVariableKeywords) {
    CCarnet b;
    for (int kind : {0, 1, 2, 3, -1}) AddExcent(b, kind, 0.1);
    CChemin* framed = new CChemin("C1");
    framed->setAntenne(0);
    b.append(new CChemin("C0"), 1007);
    b.append(framed, 1007);
    const int comment = b.append(new CComment("vu du nord"), 1000);
    const char* expected[] = {"ExcentRad", "ExcentTan", "ExcentVer", "", "", "CheminAntenne", "CheminEncadre"};
    for (int i = 0; i < 7; ++i) EXPECT_EQ(b.cmdAt(i), expected[i]) << i;
    EXPECT_EQ(b.matAt(6), "C1");
    EXPECT_EQ(b.symAt(6), "");
    EXPECT_EQ(b.matAt(0), "");
    EXPECT_EQ(b.matAt(comment), "");
    EXPECT_EQ(b.parAt(comment), "vu du nord");
}

namespace {

// 0 station S1, 1 measure on P9, 2 point P1 without z, 3 point P9, 4 point P1
// complete, 5 point P2 with z only, 6 comment, 7 path named P9.
struct PointBook : ::testing::Test {
    CCarnet b;
    void SetUp() override {
        AddStation(b, "S1");
        AddMesure(b, "P9");
        b.append(new CPointGen("P1", 10.0, 20.0, ""), 1006);
        b.append(new CPointGen("P9", 90.0, 91.0, 92.0, ""), 1006);
        b.append(new CPointGen("P1", 11.0, 21.0, 31.0, ""), 1006);
        b.append(new CPointGen("P2", 52.0, ""), 1006);
        b.append(new CComment("c"), 1000);
        b.append(new CChemin("P9"), 1007);
    }
};

struct Out {
    double x = 42.0, y = 42.0, z = 42.0;
};

}  // namespace

TEST_F(PointBook, PointQueriesAndTheirOutValues) {
    const double U = UNDEF_VALUE;
    struct Case {
        const char* what;
        std::function<int(const CCarnet&, Out&)> call;
        int result;
        Out written;  // 42 stands for "left unchanged"
    } cases[] = {
        {"hasPnt P1", [](const CCarnet& c, Out&) { return c.hasPnt("P1"); }, 2, {}},
        {"hasPnt p1", [](const CCarnet& c, Out&) { return c.hasPnt("p1"); }, -1, {}},
        {"hasPnt empty", [](const CCarnet& c, Out&) { return c.hasPnt(""); }, 2, {}},
        {"hasPnt index of the comment", [](const CCarnet& c, Out&) { return c.hasPnt(6); }, 2, {}},
        {"hasPnt index of the path", [](const CCarnet& c, Out&) { return c.hasPnt(7); }, 3, {}},
        {"hasPnt index of the second P1", [](const CCarnet& c, Out&) { return c.hasPnt(4); }, 2, {}},
        {"hasPnt P1 xyz", [](const CCarnet& c, Out& o) { return c.hasPnt("P1", o.x, o.y, o.z); }, 2, {10.0, 20.0, U}},
        {"hasPnt P7 xyz", [](const CCarnet& c, Out& o) { return c.hasPnt("P7", o.x, o.y, o.z); }, -1, {}},
        {"hasPnt index xyz, P1", [](const CCarnet& c, Out& o) { return c.hasPnt(4, o.x, o.y, o.z); }, -1, {}},
        {"hasPnt index xyz, P9", [](const CCarnet& c, Out& o) { return c.hasPnt(1, o.x, o.y, o.z); }, 3, {90.0, 91.0, 92.0}},
        {"hasXYZ P1", [](const CCarnet& c, Out&) { return c.hasXYZ("P1"); }, -1, {}},
        {"hasXYZ P9", [](const CCarnet& c, Out&) { return c.hasXYZ("P9"); }, 3, {}},
        {"hasXYZ index of the measure", [](const CCarnet& c, Out&) { return c.hasXYZ(1); }, 3, {}},
        {"hasXYZ P1 xyz", [](const CCarnet& c, Out& o) { return c.hasXYZ("P1", o.x, o.y, o.z); }, -1, {}},
        {"hasXYZ P9 xyz", [](const CCarnet& c, Out& o) { return c.hasXYZ("P9", o.x, o.y, o.z); }, 3, {90.0, 91.0, 92.0}},
        {"hasXYZ index xyz, P1", [](const CCarnet& c, Out& o) { return c.hasXYZ(2, o.x, o.y, o.z); }, -1, {}},
        {"hasXYZ index xyz, path P9", [](const CCarnet& c, Out& o) { return c.hasXYZ(7, o.x, o.y, o.z); }, 3, {90.0, 91.0, 92.0}},
        {"hasXY P1", [](const CCarnet& c, Out&) { return c.hasXY("P1"); }, 2, {}},
        {"hasXY P2", [](const CCarnet& c, Out&) { return c.hasXY("P2"); }, -1, {}},
        {"hasXY index of the second P1", [](const CCarnet& c, Out&) { return c.hasXY(4); }, 2, {}},
        {"hasXY P1 xy", [](const CCarnet& c, Out& o) { return c.hasXY("P1", o.x, o.y); }, 2, {10.0, 20.0, 42.0}},
        {"hasXY P2 xy", [](const CCarnet& c, Out& o) { return c.hasXY("P2", o.x, o.y); }, -1, {}},
        {"hasXY index xy, measure", [](const CCarnet& c, Out& o) { return c.hasXY(1, o.x, o.y); }, 3, {90.0, 91.0, 42.0}},
        {"hasXY index xy, P2", [](const CCarnet& c, Out& o) { return c.hasXY(5, o.x, o.y); }, -1, {}},
        {"hasZ P1", [](const CCarnet& c, Out&) { return c.hasZ("P1"); }, -1, {}},
        {"hasZ P2", [](const CCarnet& c, Out&) { return c.hasZ("P2"); }, 5, {}},
        {"hasZ index of the measure", [](const CCarnet& c, Out&) { return c.hasZ(1); }, 3, {}},
        {"hasZ index of the station", [](const CCarnet& c, Out&) { return c.hasZ(0); }, -1, {}},
        {"hasZ P2 z", [](const CCarnet& c, Out& o) { return c.hasZ("P2", o.z); }, 5, {42.0, 42.0, 52.0}},
        {"hasZ P1 z", [](const CCarnet& c, Out& o) { return c.hasZ("P1", o.z); }, -1, {}},
        {"hasZ index z, measure", [](const CCarnet& c, Out& o) { return c.hasZ(1, o.z); }, 3, {42.0, 42.0, 92.0}},
        {"hasZ index z, second P1", [](const CCarnet& c, Out& o) { return c.hasZ(4, o.z); }, -1, {}},
    };
    for (const Case& k : cases) {
        Out o;
        EXPECT_EQ(k.call(b, o), k.result) << k.what;
        EXPECT_EQ(o.x, k.written.x) << k.what;
        EXPECT_EQ(o.y, k.written.y) << k.what;
        EXPECT_EQ(o.z, k.written.z) << k.what;
    }
}

TEST_F(PointBook, ZForGivesTheKnownHeightOrTheSentinel) {
    EXPECT_EQ(b.zFor("P9"), 92.0);
    EXPECT_EQ(b.zFor("P2"), 52.0);
    EXPECT_EQ(b.zFor("P1"), -999999.0);
    EXPECT_EQ(b.zFor("none"), -999999.0);
    EXPECT_EQ(b.zFor(1), 92.0);
    EXPECT_EQ(b.zFor(4), -999999.0);
    EXPECT_EQ(b.zFor(6), -999999.0);  // empty number: the first point, P1, has no z
}

TEST(Queries, InstrumentInForce) {
    CCarnet b;
    b.append(new CAppareil(), 1008);                    // 0
    CAppareil* first = static_cast<CAppareil*>(b.ptrAt(0));
    AddStation(b, "S1");                                // 1
    b.append(new CAppareil(), 1008);                    // 2: after the station
    AddMesure(b, "M1");                                 // 3
    AddStation(b, "S2");                                // 4
    AddMesure(b, "M2");                                 // 5
    CAppareil* second = static_cast<CAppareil*>(b.ptrAt(2));
    EXPECT_EQ(b.findAppAt(0), nullptr);  // no station yet
    EXPECT_EQ(b.findAppAt(1), first);
    EXPECT_EQ(b.findAppAt(2), first);
    EXPECT_EQ(b.findAppAt(3), first);
    EXPECT_EQ(b.findAppAt(4), second);
    EXPECT_EQ(b.findAppAt(5), second);

    CCarnet none;
    AddStation(none, "S1");
    AddMesure(none, "M1");
    none.append(new CAppareil(), 1008);
    EXPECT_EQ(none.findAppAt(1), nullptr);
    EXPECT_EQ(none.findAppAt(2), nullptr);
}

TEST(Queries, RepetitionOfTheGoverningStation) {
    CCarnet b;
    b.append(new CComment("debut"), 1000);  // 0
    AddStation(b, "S1");                    // 1
    AddMesure(b, "M1");                     // 2
    AddStation(b, "S2");                    // 3
    AddStation(b, "S1");                    // 4
    AddMesure(b, "M2");                     // 5
    AddStation(b, "S3");                    // 6
    AddStation(b, "S1");                    // 7
    b.append(new CComment("fin"), 1000);    // 8
    AddMesure(b, "M3");                     // 9
    struct Case {
        int at;
        int rep;
        const char* station;
    } cases[] = {{0, 0, "unchanged"}, {1, 1, "S1"}, {2, 1, "S1"}, {3, 1, "S2"}, {4, 2, "S1"},
                 {5, 2, "S1"},        {6, 1, "S3"}, {7, 3, "S1"}, {8, 3, "S1"}, {9, 3, "S1"}};
    for (const Case& k : cases) {
        CString np("unchanged");
        EXPECT_EQ(b.findRepAt(k.at, np), k.rep) << k.at;
        EXPECT_EQ(np, k.station) << k.at;
    }
    // A station without a number counts every station before it.
    AddStation(b, "");
    CString np("x");
    EXPECT_EQ(b.findRepAt(b.length() - 1, np), 6);
    EXPECT_EQ(np, "");
}

TEST(Queries, ObservationsUsableForHeights) {
    struct Case {
        const char* what;
        double hi, hp, av, di;
        bool stationZ, pointZ;
        int withStationFlag, withPointFlag;
    } cases[] = {
        {"complete", 1.5, 1.6, 100.0, 25.0, true, true, 1, 1},
        {"no height at the station's point", 1.5, 1.6, 100.0, 25.0, false, true, 0, 1},
        {"no height at the observed point", 1.5, 1.6, 100.0, 25.0, true, false, 1, 0},
        {"zero distance", 1.5, 1.6, 100.0, 0.0, true, true, 0, 0},
        {"negative distance", 1.5, 1.6, 100.0, -3.0, true, true, 0, 0},
        {"no distance", 1.5, 1.6, 100.0, UNDEF_VALUE, true, true, 0, 0},
        {"no target height", 1.5, UNDEF_VALUE, 100.0, 25.0, true, true, 0, 0},
        {"no vertical angle", 1.5, 1.6, UNDEF_VALUE, 25.0, true, true, 0, 0},
        {"no instrument height", UNDEF_VALUE, 1.6, 100.0, 25.0, true, true, 0, 0},
        {"zero heights are known", 0.0, 0.0, 0.0, 0.001, true, true, 1, 1},
    };
    for (const Case& k : cases) {
        CCarnet b;
        b.append(new CPointGen("S1", 1.0, 2.0, k.stationZ ? 100.0 : UNDEF_VALUE, ""), 1006);
        b.append(new CPointGen("P", 5.0, 6.0, k.pointZ ? 98.0 : UNDEF_VALUE, ""), 1006);
        AddStation(b, "S1", k.hi);
        const int m = AddMesure(b, "P", k.hp, k.av, k.di);
        const int r = b.append(new CReference("P", k.hp, 0.0, k.av, k.di, ""), 1002);
        for (int at : {m, r}) {
            EXPECT_EQ(b.isObsAltiAt(at, 1), k.withStationFlag) << k.what << " at " << at;
            EXPECT_EQ(b.isObsAltiAt(at, 0), k.withPointFlag) << k.what << " at " << at;
        }
    }

    CCarnet b;
    b.append(new CPointGen("P", 5.0, 6.0, 98.0, ""), 1006);
    AddMesure(b, "P");  // before any station
    AddStation(b, "P");
    b.append(new CLectAR("P", 1.0, 2.0, ""), 1004);
    for (int at = 0; at < b.length(); ++at) {
        EXPECT_EQ(b.isObsAltiAt(at, 0), 0) << at;
        EXPECT_EQ(b.isObsAltiAt(at, 1), 0) << at;
    }
}
