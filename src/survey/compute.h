// The coordinates that a book's observations give: set-ups, orientation,
// radiation of the observed points, eccentrics and distance corrections.
//
// Conventions: angles in grads (400 a turn), zenith angles from the zenith;
// X east, Y north; a bearing runs clockwise from north, in [0, 400); lengths
// in metres; distance corrections in cm/km. Element indexes are 0-based as
// in CCarnet; `Line` gives the 1-based line number a report shows.
#pragma once

#include <optional>
#include <string>
#include <vector>

class CCarnet;

namespace carnet::survey {

// The bearing of A -> B: atan2(XB - XA, YB - YA) in grads, in [0, 400); 0
// when A and B coincide.
double Bearing(double xa, double ya, double xb, double yb);
// An angle brought into [0, 400).
double Turn(double grads);
// An angle difference brought into (-200, 200].
double HalfTurn(double grads);

// The 1-based number of element index i, as reports give it.
inline int Line(int element) { return element + 1; }

// The survey options of the book's parameter location that a computation uses.
struct Options {
    bool automatic = true;       // CorrAuto: corrections computed, curvature and refraction applied
    double alterLineaire = 0;    // cm/km, as stored
    double corrNivZero = 0;      // cm/km, as stored
    double absiMoyenne = 0, ordoMoyenne = 0, altiMoyenne = 0;
    double earthRadius = 6366000;  // metres (RayonTerre is stored in km)
    std::string projection = "Aucune";
    double tolAngles = 0.01;     // grads
    double tolDistances = 0.01;  // metres
    double tolAltitudes = 0.01;  // metres
};
// The options stored at book.m_ParamFile, with their defaults and ranges.
Options ReadOptions(const CCarnet& book);

// The distance correction in force.
struct Corrections {
    double alterLineaire = 0;  // cm/km: the projection's scale, (k - 1) * 1e5
    double corrNivZero = 0;    // cm/km: reduction to the reference level, -H / R * 1e5
    bool computed = false;     // from the projection and the mean height, not as stored
    std::string origin;        // where they came from, for the report
    // The factor a horizontal distance is multiplied by.
    double Factor() const { return 1 + (alterLineaire + corrNivZero) * 1e-5; }
};

enum class StationFrom { KnownPoint, ComputedPoint, Nowhere };
enum class OrientationFrom { References, StationV0, None };
enum class PointSource { Known, Radiated, Mean };
// "known", "radiated" or "mean".
const char* SourceName(PointSource source);

// A reference of a set-up and how it agrees with the orientation.
struct ReferenceCheck {
    int element = -1;
    std::string name;
    double distance = 0;   // from the coordinates, metres
    double v0 = 0;         // bearing - AH of this reference alone
    double deviation = 0;  // v0 - orientation, grads
    double offset = 0;     // the lateral shift it makes at its distance, metres
    bool flagged = false;  // |deviation| above TolAngles
};

struct SetUp {
    int element = -1;          // the Station element
    std::string station;       // its point number
    double hi = 0;             // instrument height
    StationFrom from = StationFrom::Nowhere;
    int fromElement = -1;      // the Point line, or the observation that computed it
    double x = 0, y = 0;       // when from != Nowhere
    std::optional<double> z;
    int instrument = -1;       // the instrument line in force; -1: the defaults of CAppareil
    OrientationFrom orientation = OrientationFrom::None;
    double v0 = 0;             // grads, when oriented
    std::vector<ReferenceCheck> references;
    int computed = 0;          // observations that gave coordinates
};

// An observation that gave coordinates.
struct Shot {
    int element = -1;
    size_t setUp = 0;          // index into Computation::setUps
    std::string name, code;
    double x = 0, y = 0;
    std::optional<double> z;
    double bearing = 0, distance = 0;  // from the station to the (offset) point
};

// A point determined more than once, or a locked point checked.
struct Determinations {
    std::string name;
    int count = 0;                 // determinations from observations
    bool lockedPlan = false, lockedHeight = false;
    double planSpread = 0;         // largest plan deviation from the adopted position
    std::optional<double> heightSpread;
    bool flagged = false;          // a spread above TolDistances or TolAltitudes
};

// An observation or element left out, and why.
struct LeftOut {
    int element = -1;
    std::string name;
    std::string reason;
};

// A point with coordinates after the computation.
struct ComputedPoint {
    std::string name, code;
    std::optional<double> x, y, z;  // x and y are both present or both absent
    PointSource source = PointSource::Known;
};

struct Computation {
    Options options;
    Corrections corrections;
    std::vector<std::string> notes;   // about the options (a projection PROJ cannot evaluate...)
    std::vector<SetUp> setUps;
    std::vector<Shot> shots;
    std::vector<Determinations> multiples;
    std::vector<LeftOut> leftOut;
    std::vector<ComputedPoint> points;  // known points first, in book order, then the computed ones
    // Nothing left out and every check within its tolerance.
    bool Clean() const;
};

// Computes the book. Never throws on bad input: what cannot be computed is
// in leftOut, with its element and reason.
Computation Compute(const CCarnet& book);

}  // namespace carnet::survey
