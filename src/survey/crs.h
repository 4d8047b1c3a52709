// The coordinate reference system of a field book, through PROJ: what its
// projection name stands for, the distortion of the projection at a point,
// and positions in WGS 84 for the programs that want longitudes and latitudes.
#pragma once

#include <memory>
#include <optional>
#include <string>

namespace carnet::survey {

// A geographic position in decimal degrees: longitude east of Greenwich,
// latitude north of the equator.
struct LonLat {
    double lon = 0;
    double lat = 0;
};

// The distortion of a projection at one point.
struct PointFactors {
    // Point scale factor k: a grid length is k times the length on the
    // ellipsoid (the same in every direction for a conformal projection).
    double scale = 1;
    // Meridian convergence in grads: true azimuth = grid bearing + convergence
    // (positive east of the central meridian in the northern hemisphere).
    double convergence = 0;
    // (k - 1) in cm/km, the unit of the book's distance corrections.
    double ScaleCmPerKm() const { return (scale - 1) * 1e5; }
};

// Where a system may be used, as its authority gives it (degrees, WGS 84).
struct AreaOfUse {
    std::string name;  // UTF-8; empty when none is known
    double west = -180, south = -90, east = 180, north = 90;
    // Whether the position lies inside the box (a box crossing the
    // antimeridian, west > east, is handled).
    bool Contains(const LonLat& p) const;
};

// A projected system in metres (easting X, northing Y) known to PROJ, or a
// local grid with no reference system. Each object holds its own PROJ
// context: use one object from one thread at a time. Movable, not copyable.
class Crs {
public:
    // A local grid: nothing can be converted.
    Crs();
    ~Crs();
    Crs(Crs&&) noexcept;
    Crs& operator=(Crs&&) noexcept;

    // The system a book's projection name stands for: "Projection Lambert
    // Zone I" to "IV" are EPSG:27571 to EPSG:27574, "Aucune" or an empty name
    // a local grid, a name PROJ understands as it stands (such as
    // "EPSG:2154" or "IGNF:LAMB93") that system; any other name is a local
    // grid with Warning() naming it. Never throws; Error() on a PROJ failure.
    static Crs FromBookName(const std::string& name);
    // A system named by the user (such as --crs EPSG:2154): Error() says why
    // when PROJ does not know it as a projected system in metres.
    static Crs FromName(const std::string& name);

    // True for a local grid (including after a warning or an error).
    bool IsLocal() const;
    // The name it was made from, as given.
    const std::string& Given() const;
    // What was handed to PROJ ("EPSG:27572"); empty for a local grid.
    const std::string& Definition() const;
    // PROJ's name of the system (UTF-8), such as "NTF (Paris) / Lambert zone
    // II"; empty for a local grid.
    const std::string& Name() const;
    // The authority code, such as "EPSG:27572"; empty when PROJ gives none.
    const std::string& Code() const;
    // The area of use; its name is empty when PROJ gives none.
    const AreaOfUse& Area() const;
    // Why a book's name was taken as a local grid; empty otherwise.
    const std::string& Warning() const;
    // Why PROJ could not be used (its database missing or unreadable, an
    // unknown --crs name); empty when all is well.
    const std::string& Error() const;

    // The scale factor and the convergence at grid position (x, y); nullopt
    // for a local grid or a position the projection cannot invert.
    std::optional<PointFactors> FactorsAt(double x, double y) const;
    // The position in WGS 84 through PROJ's best available transformation;
    // nullopt for a local grid or when no transformation applies.
    std::optional<LonLat> ToWgs84(double x, double y) const;
    // The position in the system's own geographic system (for NTF (Paris),
    // longitude from Greenwich, without any datum shift); nullopt as above.
    std::optional<LonLat> ToOwnGeographic(double x, double y) const;

private:
    struct Impl;
    std::unique_ptr<Impl> m_impl;
};

}  // namespace carnet::survey
