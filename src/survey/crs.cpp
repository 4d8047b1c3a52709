#include "crs.h"

#include <cmath>
#include <utility>

#include <proj.h>
#include <proj_experimental.h>  // building the geographic system in radians

namespace carnet::survey {
namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr double kGradsPerRadian = 200 / kPi;
constexpr double kDegreesPerRadian = 180 / kPi;

// The book's own names for the four zones of the old French grid.
struct Zone {
    const char* bookName;
    const char* code;
};
constexpr Zone kZones[] = {
    {"Projection Lambert Zone I", "EPSG:27571"},
    {"Projection Lambert Zone II", "EPSG:27572"},
    {"Projection Lambert Zone III", "EPSG:27573"},
    {"Projection Lambert Zone IV", "EPSG:27574"},
};

std::string Trimmed(const std::string& text) {
    const size_t first = text.find_first_not_of(" \t");
    if (first == std::string::npos) return std::string();
    return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

struct PjDeleter {
    void operator()(PJ* p) const { proj_destroy(p); }
};
using PjPtr = std::unique_ptr<PJ, PjDeleter>;

}  // namespace

bool AreaOfUse::Contains(const LonLat& p) const {
    if (p.lat < south || p.lat > north) return false;
    return west <= east ? p.lon >= west && p.lon <= east : p.lon >= west || p.lon <= east;
}

struct Crs::Impl {
    PJ_CONTEXT* ctx = nullptr;
    std::string given, definition, name, code, warning, error;
    AreaOfUse area;
    PjPtr crs;
    PjPtr toWgs84;      // easting, northing -> longitude, latitude (degrees)
    PjPtr toGeodetic;   // easting, northing -> radians on the datum, from its prime meridian
    double primeMeridian = 0;  // radians east of Greenwich
    double a = 0, e2 = 0;      // the ellipsoid: semi-major axis (m), squared eccentricity

    Impl() : ctx(proj_context_create()) {
        // PROJ's own messages would reach standard error unasked: the reasons
        // are given through Error() instead.
        if (ctx) proj_log_func(ctx, nullptr, [](void*, int, const char*) {});
    }
    ~Impl() {
        crs.reset();
        toWgs84.reset();
        toGeodetic.reset();
        if (ctx) proj_context_destroy(ctx);
    }

    // Why PROJ cannot work at all, or empty: its database must be found and
    // answer a query before any name is judged unknown.
    std::string Unusable() {
        if (!ctx) return "PROJ cannot start (out of memory)";
        const char* db = proj_context_get_database_path(ctx);
        PjPtr probe(db ? proj_create(ctx, "EPSG:4326") : nullptr);
        if (probe) return std::string();
        return std::string("PROJ's database (proj.db) cannot be ") + (db ? "read at " + std::string(db) : "found") +
               "; install Debian's proj-data or set PROJ_DATA to the folder that holds it";
    }

    // Takes `text` as the system when PROJ knows it as a projected system
    // with plan axes in metres; else says why.
    std::string Open(const std::string& text) {
        proj_context_errno(ctx);
        PjPtr p(proj_create(ctx, text.c_str()));
        if (!p || !proj_is_crs(p.get())) {
            const std::string why = Unusable();
            return why.empty() ? "PROJ knows no coordinate system named \"" + text + "\"" : why;
        }
        if (proj_get_type(p.get()) != PJ_TYPE_PROJECTED_CRS)
            return "\"" + text + "\" is not a projected system (easting and northing in metres)";
        PjPtr cs(proj_crs_get_coordinate_system(ctx, p.get()));
        double toMetre = 0;
        if (!cs || !proj_cs_get_axis_info(ctx, cs.get(), 0, nullptr, nullptr, nullptr, &toMetre, nullptr, nullptr,
                                          nullptr) ||
            std::fabs(toMetre - 1) > 1e-12)
            return "\"" + text + "\" does not count its coordinates in metres";

        PjPtr geodetic(proj_crs_get_geodetic_crs(ctx, p.get()));
        PjPtr datum(geodetic ? proj_crs_get_datum_forced(ctx, geodetic.get()) : nullptr);
        PjPtr radians(proj_create_ellipsoidal_2D_cs(ctx, PJ_ELLPS2D_LONGITUDE_LATITUDE, "Radian", 1.0));
        // The geographic system that proj_factors reads its input in: the
        // projection's datum, longitude first, in radians.
        PjPtr base(datum && radians ? proj_create_geographic_crs_from_datum(ctx, "base", datum.get(), radians.get())
                                    : nullptr);
        PjPtr inverse(base ? proj_create_crs_to_crs_from_pj(ctx, p.get(), base.get(), nullptr, nullptr) : nullptr);
        PjPtr meridian(geodetic ? proj_get_prime_meridian(ctx, geodetic.get()) : nullptr);
        double pmLongitude = 0, pmToRadian = 0;
        PjPtr ellipsoid(proj_get_ellipsoid(ctx, p.get()));
        double semiMajor = 0, semiMinor = 0;
        if (!inverse || !meridian || !ellipsoid ||
            !proj_prime_meridian_get_parameters(ctx, meridian.get(), &pmLongitude, &pmToRadian, nullptr) ||
            !proj_ellipsoid_get_parameters(ctx, ellipsoid.get(), &semiMajor, &semiMinor, nullptr, nullptr) ||
            semiMajor <= 0)
            return "PROJ cannot invert the projection of \"" + text + "\"";
        PjPtr geodeticOp(proj_normalize_for_visualization(ctx, inverse.get()));
        if (!geodeticOp) return "PROJ cannot invert the projection of \"" + text + "\"";

        PjPtr wgs84(proj_create_crs_to_crs(ctx, text.c_str(), "EPSG:4326", nullptr));
        PjPtr wgs84Op(wgs84 ? proj_normalize_for_visualization(ctx, wgs84.get()) : nullptr);
        if (!wgs84Op) return "PROJ knows no transformation from \"" + text + "\" to WGS 84";

        definition = text;
        name = proj_get_name(p.get()) ? proj_get_name(p.get()) : "";
        const char* authority = proj_get_id_auth_name(p.get(), 0);
        const char* id = proj_get_id_code(p.get(), 0);
        code = authority && id ? std::string(authority) + ":" + id : std::string();
        const char* areaName = nullptr;
        if (proj_get_area_of_use(ctx, p.get(), &area.west, &area.south, &area.east, &area.north, &areaName) &&
            area.west > -1000) {
            area.name = areaName ? areaName : "";
        } else {
            area = AreaOfUse();
        }
        crs = std::move(p);
        toGeodetic = std::move(geodeticOp);
        toWgs84 = std::move(wgs84Op);
        primeMeridian = pmLongitude * pmToRadian;
        a = semiMajor;
        e2 = 1 - (semiMinor / semiMajor) * (semiMinor / semiMajor);
        return std::string();
    }
};

Crs::Crs() : m_impl(std::make_unique<Impl>()) {}
Crs::~Crs() = default;
Crs::Crs(Crs&&) noexcept = default;
Crs& Crs::operator=(Crs&&) noexcept = default;

Crs Crs::FromBookName(const std::string& name) {
    Crs result;
    Impl& m = *result.m_impl;
    m.given = name;
    const std::string text = Trimmed(name);
    if (text.empty() || text == "Aucune") return result;
    std::string definition = text;
    bool zone = false;
    for (const Zone& z : kZones)
        if (text == z.bookName) {
            definition = z.code;
            zone = true;
        }
    const std::string why = m.Open(definition);
    if (why.empty()) return result;
    // A zone the database should know, or a database that does not answer,
    // is PROJ's failure; any other text is a local name of the surveyor's.
    const std::string unusable = m.Unusable();
    if (zone || !unusable.empty())
        m.error = unusable.empty() ? why : unusable;
    else
        m.warning = "projection \"" + name + "\" is not a system PROJ knows (" + why + "): taken as a local grid";
    return result;
}

Crs Crs::FromName(const std::string& name) {
    Crs result;
    Impl& m = *result.m_impl;
    m.given = name;
    const std::string text = Trimmed(name);
    m.error = text.empty() ? std::string("no coordinate system named") : m.Open(text);
    return result;
}

bool Crs::IsLocal() const { return !m_impl->crs; }
const std::string& Crs::Given() const { return m_impl->given; }
const std::string& Crs::Definition() const { return m_impl->definition; }
const std::string& Crs::Name() const { return m_impl->name; }
const std::string& Crs::Code() const { return m_impl->code; }
const AreaOfUse& Crs::Area() const { return m_impl->area; }
const std::string& Crs::Warning() const { return m_impl->warning; }
const std::string& Crs::Error() const { return m_impl->error; }

namespace {

// One position through an operation; nullopt when PROJ fails on it.
std::optional<PJ_COORD> Through(PJ* op, double x, double y) {
    if (!op || !std::isfinite(x) || !std::isfinite(y)) return std::nullopt;
    proj_errno_reset(op);
    const PJ_COORD out = proj_trans(op, PJ_FWD, proj_coord(x, y, 0, 0));
    if (proj_errno(op) != 0 || !std::isfinite(out.xy.x) || !std::isfinite(out.xy.y)) return std::nullopt;
    return out;
}

}  // namespace

// The factors are derived from PROJ's own forward projection rather than
// read from proj_factors, which in PROJ 9.1 gets the scale and the
// convergence wrong for a system whose prime meridian is not Greenwich (the
// Lambert zones are reckoned from Paris).
std::optional<PointFactors> Crs::FactorsAt(double x, double y) const {
    const Impl& m = *m_impl;
    const auto lp = Through(m.toGeodetic.get(), x, y);
    if (!lp || !m.crs) return std::nullopt;
    const double lam = lp->lp.lam, phi = lp->lp.phi;
    // A step of 1e-7 rad (60 cm) keeps both the truncation of the central
    // difference and the rounding of the grid coordinates below 1e-9.
    constexpr double d = 1e-7;
    auto forward = [&](double dl, double dp) {
        proj_errno_reset(m.toGeodetic.get());
        return proj_trans(m.toGeodetic.get(), PJ_INV, proj_coord(lam + dl, phi + dp, 0, 0));
    };
    const PJ_COORD n = forward(0, d), s = forward(0, -d), e = forward(d, 0), w = forward(-d, 0);
    if (proj_errno(m.toGeodetic.get()) != 0) return std::nullopt;
    const double xPhi = (n.xy.x - s.xy.x) / (2 * d), yPhi = (n.xy.y - s.xy.y) / (2 * d);
    const double xLam = (e.xy.x - w.xy.x) / (2 * d), yLam = (e.xy.y - w.xy.y) / (2 * d);
    // Radii of curvature of the ellipsoid: in the meridian (M) and in the
    // prime vertical (N).
    const double w2 = 1 - m.e2 * std::sin(phi) * std::sin(phi);
    const double radiusM = m.a * (1 - m.e2) / (w2 * std::sqrt(w2));
    const double radiusN = m.a / std::sqrt(w2);
    // Meridian scale h and parallel scale k, equal for a conformal
    // projection; their geometric mean is the point scale factor.
    const double h = std::hypot(xPhi, yPhi) / radiusM;
    const double k = std::hypot(xLam, yLam) / (radiusN * std::cos(phi));
    // Meridian convergence: grid bearing of true north is -convergence.
    const double convergence = -std::atan2(xPhi, yPhi) * kGradsPerRadian;
    if (!std::isfinite(h) || !std::isfinite(k) || !std::isfinite(convergence)) return std::nullopt;
    return PointFactors{std::sqrt(h * k), convergence};
}

std::optional<LonLat> Crs::ToWgs84(double x, double y) const {
    const auto out = Through(m_impl->toWgs84.get(), x, y);
    if (!out) return std::nullopt;
    return LonLat{out->lp.lam, out->lp.phi};
}

std::optional<LonLat> Crs::ToOwnGeographic(double x, double y) const {
    const auto lp = Through(m_impl->toGeodetic.get(), x, y);
    if (!lp) return std::nullopt;
    return LonLat{(lp->lp.lam + m_impl->primeMeridian) * kDegreesPerRadian, lp->lp.phi * kDegreesPerRadian};
}

}  // namespace carnet::survey
