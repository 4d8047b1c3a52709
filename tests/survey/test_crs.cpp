// The book's coordinate system through PROJ, checked against hand
// computation and against PROJ's own command-line programs.
#include <carnet/survey/book.h>
#include <carnet/survey/crs.h>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>

#include <gtest/gtest.h>

#include <carnet/carnet.h>

namespace {

using carnet::survey::Crs;

constexpr double kPi = 3.14159265358979323846;
constexpr double kParis = 2.33722917;  // the Paris meridian, degrees east of Greenwich

std::string Shell(const std::string& command) {
    std::string out;
    if (std::FILE* p = popen(command.c_str(), "r")) {
        char chunk[4096];
        for (size_t n; (n = std::fread(chunk, 1, sizeof chunk, p)) > 0;) out.append(chunk, n);
        pclose(p);
    }
    return out;
}

// The number after `label` in PROJ's verbose listing, or NaN.
double After(const std::string& text, const std::string& label) {
    const size_t at = text.find(label);
    return at == std::string::npos ? NAN : std::strtod(text.c_str() + at + label.size(), nullptr);
}

TEST(Crs, BookNames) {
    struct Case {
        const char* name;
        const char* code;  // empty: a local grid
        const char* warning;  // a part of it, or empty for none
    } cases[] = {
        {"Aucune", "", ""},
        {"", "", ""},
        {"Projection Lambert Zone I", "EPSG:27571", ""},
        {"Projection Lambert Zone II", "EPSG:27572", ""},
        {"Projection Lambert Zone III", "EPSG:27573", ""},
        {"Projection Lambert Zone IV", "EPSG:27574", ""},
        {"EPSG:2154", "EPSG:2154", ""},
        {"EPSG:3948", "EPSG:3948", ""},
        {"IGNF:LAMB93", "IGNF:LAMB93", ""},
        {"Rep\xE8re chantier", "", "projection \"Rep\xE8re chantier\" is not a system PROJ knows"},
        {"EPSG:4326", "", "is not a projected system"},
        {"EPSG:2227", "", "does not count its coordinates in metres"},  // US feet
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        const Crs crs = Crs::FromBookName(c.name);
        EXPECT_EQ(crs.Error(), "");
        EXPECT_EQ(crs.IsLocal(), *c.code == '\0');
        EXPECT_EQ(crs.Code(), c.code);
        if (*c.warning)
            EXPECT_NE(crs.Warning().find(c.warning), std::string::npos) << crs.Warning();
        else
            EXPECT_EQ(crs.Warning(), "");
        EXPECT_EQ(crs.ToWgs84(600000, 2200000).has_value(), !crs.IsLocal());
    }
    EXPECT_EQ(Crs::FromBookName("Projection Lambert Zone II").Name(), "NTF (Paris) / Lambert zone II");
    EXPECT_EQ(Crs::FromBookName("EPSG:2154").Name(), "RGF93 v1 / Lambert-93");
    // What the user names must be a system: no local fallback.
    EXPECT_NE(Crs::FromName("EPSG:999999").Error().find("PROJ knows no coordinate system named"),
              std::string::npos);
    EXPECT_NE(Crs::FromName("EPSG:4326").Error(), "");
    EXPECT_EQ(Crs::FromName("EPSG:2154").Error(), "");
}

// The origin of zone II: 52 grads north on the Paris meridian, where the
// scale factor is the zone's k0 and the convergence nil.
TEST(Crs, ZoneTwoOrigin) {
    const Crs crs = Crs::FromBookName("Projection Lambert Zone II");
    const auto own = crs.ToOwnGeographic(600000, 2200000);
    ASSERT_TRUE(own);
    EXPECT_NEAR(own->lat, 46.8, 1e-9);
    EXPECT_NEAR(own->lon, kParis, 1e-8);
    const auto f = crs.FactorsAt(600000, 2200000);
    ASSERT_TRUE(f);
    EXPECT_NEAR(f->scale, 0.99987742, 1e-9);
    EXPECT_NEAR(f->ScaleCmPerKm(), -12.258, 1e-3);
    EXPECT_NEAR(f->convergence, 0, 1e-9);

    // In WGS 84 the NTF datum shift moves it about 6 m in latitude and 53 m
    // in longitude here; cs2cs, PROJ's own program, gives the same figures.
    const auto wgs = crs.ToWgs84(600000, 2200000);
    ASSERT_TRUE(wgs);
    EXPECT_NEAR(wgs->lat, 46.8, 10 / 111e3);
    EXPECT_NEAR(wgs->lon, kParis, 60 / 76e3);
    std::istringstream ref(Shell("echo 600000 2200000 | cs2cs -f %.10f EPSG:27572 EPSG:4326"));
    double lat = NAN, lon = NAN;
    ref >> lat >> lon;  // EPSG:4326 is latitude first
    EXPECT_NEAR(wgs->lat, lat, 1e-9);
    EXPECT_NEAR(wgs->lon, lon, 1e-9);
}

// Away from the origin: the convergence of a Lambert projection with one
// standard parallel is n (lambda - lambda0), n = sin(phi0); the scale factor
// is what PROJ's `proj -V` gives for the same projection.
TEST(Crs, ZoneTwoFactorsAwayFromTheOrigin) {
    const Crs crs = Crs::FromBookName("Projection Lambert Zone II");
    const std::string definition = Shell("projinfo -o PROJ -q EPSG:27572 | sed 's/+type=crs//'");
    ASSERT_NE(definition.find("+proj=lcc"), std::string::npos);
    for (const auto& xy : {std::pair<double, double>{601234.512, 2428765.331}, {350000, 2100000}, {980000, 1750000}}) {
        SCOPED_TRACE(xy.first);
        const auto own = crs.ToOwnGeographic(xy.first, xy.second);
        const auto f = crs.FactorsAt(xy.first, xy.second);
        ASSERT_TRUE(own && f);
        EXPECT_NEAR(f->convergence, std::sin(46.8 * kPi / 180) * (own->lon - kParis) * 400 / 360, 1e-8);
        const std::string verbose = Shell("echo " + std::to_string(own->lon) + " " + std::to_string(own->lat) +
                                        " | proj -V " + definition);
        EXPECT_NEAR(f->scale, After(verbose, "Meridian scale (h) :"), 1e-8) << verbose;
    }
}

// Lambert-93 (Greenwich meridian): scale and convergence as `proj -V` gives
// them; and the origin (3 E, 46.5 N) in WGS 84 within the few centimetres
// between RGF93 and WGS 84.
TEST(Crs, LambertNinetyThree) {
    const Crs crs = Crs::FromBookName("EPSG:2154");
    const auto origin = crs.ToWgs84(700000, 6600000);
    ASSERT_TRUE(origin);
    EXPECT_NEAR(origin->lon, 3, 1e-6);
    EXPECT_NEAR(origin->lat, 46.5, 1e-6);
    const std::string definition = Shell("projinfo -o PROJ -q EPSG:2154 | sed 's/+type=crs//'");
    const auto own = crs.ToOwnGeographic(652000, 6862000);
    const auto f = crs.FactorsAt(652000, 6862000);
    ASSERT_TRUE(own && f);
    const std::string verbose =
        Shell("echo " + std::to_string(own->lon) + " " + std::to_string(own->lat) + " | proj -V " + definition);
    EXPECT_NEAR(f->scale, After(verbose, "Meridian scale (h) :"), 1e-8) << verbose;
    const size_t at = verbose.find("Convergence");
    ASSERT_NE(at, std::string::npos);
    const double degrees = After(verbose.substr(at), "[");
    EXPECT_NEAR(f->convergence, degrees * 400 / 360, 1e-6);
    EXPECT_TRUE(crs.Area().Contains(*own));
}

TEST(Crs, AreaOfUse) {
    carnet::survey::AreaOfUse france{"", -4.87, 42.33, 8.23, 51.14};
    carnet::survey::AreaOfUse pacific{"", 170, -50, -170, -30};  // across the antimeridian
    struct Case {
        const carnet::survey::AreaOfUse& area;
        double lon, lat;
        bool inside;
    } cases[] = {{france, 2.35, 48.86, true},  {france, -5, 48, false}, {france, 2, 52, false},
                 {france, 8.23, 42.33, true},  {pacific, 175, -40, true}, {pacific, -175, -40, true},
                 {pacific, 0, -40, false}};
    for (const Case& c : cases) EXPECT_EQ(c.area.Contains({c.lon, c.lat}), c.inside) << c.lon << " " << c.lat;
}

// Without PROJ's database, a system cannot be known: an error, never a local
// grid taken silently; a local grid needs no database.
TEST(Crs, DatabaseMissing) {
    const char* saved = std::getenv("PROJ_DATA");
    const std::string keep = saved ? saved : "";
    setenv("PROJ_DATA", "/nonexistent-carnet", 1);
    const Crs zone = Crs::FromBookName("Projection Lambert Zone II");
    const Crs named = Crs::FromBookName("EPSG:2154");
    const Crs none = Crs::FromBookName("Aucune");
    if (saved)
        setenv("PROJ_DATA", keep.c_str(), 1);
    else
        unsetenv("PROJ_DATA");
    EXPECT_NE(zone.Error().find("proj.db"), std::string::npos) << zone.Error();
    EXPECT_NE(named.Error().find("proj.db"), std::string::npos) << named.Error();
    EXPECT_TRUE(zone.IsLocal() && zone.Warning().empty());
    EXPECT_EQ(none.Error(), "");
    EXPECT_FALSE(zone.FactorsAt(600000, 2200000));
}

// What the survey reads of the book: the projection its option line stored
// at the book's parameter location, and the mean of its known points.
TEST(Crs, BookProjectionAndMean) {
    char folder[] = "/tmp/carnet-crs-XXXXXX";
    ASSERT_NE(mkdtemp(folder), nullptr);
    const std::string profile = std::string(folder) + "/options.ini";
    CCarnet book;
    CNorvexTxtWnd wnd;
    book.LoadBytes(&wnd,
                   "        Option_Projec                       EPSG:3948\n"
                   "Point A 0 1000.000 2000.000\nPoint B 0 1000.002 2000.004 12.5\nPoint C 2 -999999 -999999 10\n",
                   profile.c_str(), 0);
    EXPECT_EQ(carnet::survey::ProjectionName(book), "EPSG:3948");
    EXPECT_EQ(carnet::survey::CrsOfBook(book).Code(), "EPSG:3948");
    const auto mean = carnet::survey::MeanOfKnownPoints(book);
    ASSERT_TRUE(mean);
    EXPECT_EQ(mean->count, 2);
    EXPECT_NEAR(mean->x, 1000.001, 1e-9);
    EXPECT_NEAR(mean->y, 2000.002, 1e-9);
    CCarnet empty;
    EXPECT_EQ(carnet::survey::ProjectionName(empty), "Aucune");
    EXPECT_FALSE(carnet::survey::MeanOfKnownPoints(empty));
    std::system(("rm -rf '" + std::string(folder) + "'").c_str());
}

}  // namespace
