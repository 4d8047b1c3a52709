#include "compute.h"

#include <algorithm>
#include <cmath>
#include <string_view>
#include <unordered_map>

#include <carnet/ccarnet.h>
#include <carnet/params.h>
#include <carnet/point.h>
#include <carnet/reference.h>
#include <carnet/station.h>

#include "book.h"

namespace carnet::survey {
namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr double kRadiansPerGrad = kPi / 200;

// Earth curvature and refraction, with the usual coefficient of refraction.
constexpr double kRefraction = 0.13;

// The elements that end a group of eccentric lines, as the book's own
// eccentric lookup reads them.
bool ClosesEccentrics(unsigned int t) {
    for (unsigned int code : {TypeCode<CStation>::value, TypeCode<CReference>::value, TypeCode<CMesure>::value, TypeCode<CLectAR>::value,
                              TypeCode<CLectAV>::value, TypeCode<CPointGen>::value, TypeCode<CChemin>::value})
        if (t == code) return true;
    return false;
}

double Sin(double grads) { return std::sin(grads * kRadiansPerGrad); }
double Cos(double grads) { return std::cos(grads * kRadiansPerGrad); }

}  // namespace

double Turn(double grads) {
    double t = std::fmod(grads, 400.0);
    if (t < 0) t += 400.0;
    return t >= 400.0 ? 0.0 : t;
}

double HalfTurn(double grads) {
    const double t = Turn(grads);
    return t > 200.0 ? t - 400.0 : t;
}

// The bearing (gisement) of A -> B.
double Bearing(double xa, double ya, double xb, double yb) {
    if (xa == xb && ya == yb) return 0.0;
    return Turn(std::atan2(xb - xa, yb - ya) / kRadiansPerGrad);
}

const char* SourceName(PointSource source) {
    switch (source) {
    case PointSource::Known: return "known";
    case PointSource::Radiated: return "radiated";
    case PointSource::Mean: return "mean";
    }
    return "";
}

Options ReadOptions(const CCarnet& book) {
    Options o;
    const char* at = book.m_ParamFile.GetString();
    int automatic = 1;
    GetParamInt(at, "Options_Corrections", "CorrAuto", 1, 0, 1, &automatic);
    o.automatic = automatic == 1;
    GetParamDouble(at, "Options_Corrections", "AlterLineaire", 0.0, -100000.0, 100000.0, &o.alterLineaire);
    GetParamDouble(at, "Options_Corrections", "CorrNivZero", 0.0, -100000.0, 100000.0, &o.corrNivZero);
    GetParamDouble(at, "Options_Corrections", "AbsiMoyenne", 0.0, 0.0, 90000000.0, &o.absiMoyenne);
    GetParamDouble(at, "Options_Corrections", "OrdoMoyenne", 0.0, 0.0, 90000000.0, &o.ordoMoyenne);
    GetParamDouble(at, "Options_Corrections", "AltiMoyenne", 0.0, -10000.0, 10000.0, &o.altiMoyenne);
    double radiusKm = 6366.0;
    GetParamDouble(at, "Options_Corrections", "RayonTerre", 6366.0, 6000.0, 7000.0, &radiusKm);
    o.earthRadius = radiusKm * 1000;
    o.projection = ProjectionName(book);
    GetParamDouble(at, "Options_Tolerances", "TolAngles", 0.01, 0.001, 400000.0, &o.tolAngles);
    GetParamDouble(at, "Options_Tolerances", "TolDistances", 0.01, 0.001, 100000.0, &o.tolDistances);
    GetParamDouble(at, "Options_Tolerances", "TolAltitudes", 0.01, 0.001, 100000.0, &o.tolAltitudes);
    return o;
}

bool Computation::Clean() const {
    if (!leftOut.empty()) return false;
    for (const SetUp& s : setUps)
        for (const ReferenceCheck& r : s.references)
            if (r.flagged) return false;
    for (const Determinations& d : multiples)
        if (d.flagged) return false;
    return true;
}

namespace {

// The corrections in force: as stored, or computed from the projection's
// scale at the survey's mean position and from its mean height.
Corrections CorrectionsOf(const CCarnet& book, const Options& o, std::vector<std::string>& notes) {
    Corrections c;
    if (!o.automatic) {
        c.alterLineaire = o.alterLineaire;
        c.corrNivZero = o.corrNivZero;
        c.origin = "as stored (CorrAuto 0)";
        return c;
    }
    c.computed = true;
    // Reduction to the reference level: -H / R.
    c.corrNivZero = -o.altiMoyenne / o.earthRadius * 1e5;
    double x = o.absiMoyenne, y = o.ordoMoyenne;
    std::string where = "the stored mean position";
    if (x == 0 && y == 0) {
        const auto mean = MeanOfKnownPoints(book);
        if (mean) {
            x = mean->x;
            y = mean->y;
            where = "the mean of the known points";
        }
    }
    const Crs crs = Crs::FromBookName(o.projection);
    if (!crs.Warning().empty()) notes.push_back(crs.Warning());
    if (!crs.Error().empty()) notes.push_back(crs.Error() + ": no scale correction");
    if (crs.IsLocal()) {
        c.origin = "computed: no projection scale (local grid), level reduction from the mean height";
        return c;
    }
    const auto f = crs.FactorsAt(x, y);
    if (!f) {
        notes.push_back("the projection cannot be evaluated at the mean position: no scale correction");
        c.origin = "computed: no projection scale, level reduction from the mean height";
        return c;
    }
    c.alterLineaire = f->ScaleCmPerKm();
    c.origin = "computed: scale of " + (crs.Code().empty() ? crs.Definition() : crs.Code()) + " at " + where +
               ", level reduction from the mean height";
    return c;
}

// Running means of the determinations of each number, in book order.
constexpr size_t kNone = static_cast<size_t>(-1);

// What the computation knows of one point number: its Point lines (as
// ranges of Computer::m_planLines and m_heightLines) and the running sums
// of its determinations in book order.
struct Entry {
    int planBegin = 0, planEnd = 0, heightBegin = 0, heightEnd = 0;
    int plan = 0, height = 0;
    double sx = 0, sy = 0, sz = 0;
    // Its shots, chained through Computer::m_nextShot: one list for the
    // whole book rather than a vector for each of a million points.
    size_t first = kNone, last = kNone;
    bool computed = false;  // in m_computedOrder
    int point = -1;         // its row in Computation::points
};

class Computer {
public:
    explicit Computer(const CCarnet& book) : m_book(book) {}

    Computation Run() {
        m_result.options = ReadOptions(m_book);
        m_result.corrections = CorrectionsOf(m_book, m_result.options, m_result.notes);
        m_factor = m_result.corrections.Factor();
        IndexKnownPoints();
        int instrument = -1;
        int pendingEccentric = -1;
        for (int i = 0; i < m_book.length(); ++i) {
            const unsigned int t = m_book.typAt(i);
            if (t == TypeCode<CAppareil>::value) instrument = i;
            if (t == TypeCode<CExcent>::value) {
                if (pendingEccentric < 0) pendingEccentric = i;
                continue;
            }
            const bool observation = t == TypeCode<CReference>::value || t == TypeCode<CMesure>::value;
            // Eccentrics qualify the observation that follows them; a point,
            // a station or a reading closes their group.
            if (pendingEccentric >= 0 && ClosesEccentrics(t)) {
                if (!observation) LeaveOut(pendingEccentric, "", "eccentric with no observation after it");
                pendingEccentric = -1;
            }
            if (t == TypeCode<CStation>::value) {
                SetUpAt(i, instrument);
            } else if (observation) {
                if (m_current < 0)
                    LeaveOut(i, Name(i), "observation before any station");
                else
                    m_observations.push_back(i);
            }
        }
        if (pendingEccentric >= 0) LeaveOut(pendingEccentric, "", "eccentric with no observation after it");
        FinishSetUp();
        Adopt();
        std::stable_sort(m_result.leftOut.begin(), m_result.leftOut.end(),
                         [](const LeftOut& a, const LeftOut& b) { return a.element < b.element; });
        return std::move(m_result);
    }

private:
    const CCarnet& m_book;
    Computation m_result;
    double m_factor = 1;
    // The one index of the point numbers of the book: a number (viewed in
    // the book's own text) to its entry.
    // Its keys view the book's own texts, which outlive it: never a copy
    // such as SetUp::station, which moves when the set-ups grow.
    std::unordered_map<std::string_view, int> m_ids;
    std::vector<Entry> m_entries;
    // The Point lines with a plan position, and with a height, grouped by
    // number in book order.
    std::vector<int> m_planLines, m_heightLines;
    std::vector<size_t> m_nextShot;  // the next shot of the same number, or kNone
    std::vector<int> m_computedOrder;  // entries, in the order first computed
    int m_current = -1;               // index into setUps of the set-up being read
    std::vector<int> m_observations;  // its observations

    const CPointGen& PointAt(int i) const { return *static_cast<const CPointGen*>(m_book.ptrAt(i)); }
    const CReference& ObservationAt(int i) const { return *static_cast<const CReference*>(m_book.ptrAt(i)); }
    std::string Name(int i) const { return ObservationAt(i).Np().str(); }
    std::string_view NameView(int i) const { return ObservationAt(i).Np().str(); }
    std::string_view StationName(int i) const { return static_cast<const CStation*>(m_book.ptrAt(i))->Np().str(); }

    int Id(std::string_view name) {
        const auto [at, fresh] = m_ids.try_emplace(name, static_cast<int>(m_entries.size()));
        if (fresh) m_entries.emplace_back();
        return at->second;
    }

    void LeaveOut(int element, const std::string& name, const std::string& reason) {
        m_result.leftOut.push_back({element, name, reason});
    }

    void IndexKnownPoints() {
        size_t observations = 0, points = 0;
        for (int i = 0; i < m_book.length(); ++i) points += m_book.typAt(i) == TypeCode<CPointGen>::value;
        m_ids.reserve(points);
        m_entries.reserve(points);
        for (int i = 0; i < m_book.length(); ++i) {
            const unsigned int t = m_book.typAt(i);
            observations += t == TypeCode<CReference>::value || t == TypeCode<CMesure>::value;
            if (t != TypeCode<CPointGen>::value) continue;
            const CPointGen& p = PointAt(i);
            Entry& e = m_entries[Id(p.m_Np.str())];
            e.planEnd += p.hasXY() ? 1 : 0;
            e.heightEnd += p.hasZ() ? 1 : 0;
        }
        // Counts to ranges, then the lines in book order within each.
        int plan = 0, height = 0;
        for (Entry& e : m_entries) {
            e.planBegin = plan;
            plan += e.planEnd;
            e.planEnd = e.planBegin;
            e.heightBegin = height;
            height += e.heightEnd;
            e.heightEnd = e.heightBegin;
        }
        m_planLines.resize(plan);
        m_heightLines.resize(height);
        for (int i = 0; i < m_book.length(); ++i) {
            if (m_book.typAt(i) != TypeCode<CPointGen>::value) continue;
            const CPointGen& p = PointAt(i);
            Entry& e = m_entries[m_ids.at(p.m_Np.str())];
            if (p.hasXY()) m_planLines[e.planEnd++] = i;
            if (p.hasZ()) m_heightLines[e.heightEnd++] = i;
        }
        m_ids.reserve(m_ids.size() + observations);
        m_entries.reserve(m_entries.size() + observations);
        m_result.shots.reserve(observations);
        m_nextShot.reserve(observations);
        m_computedOrder.reserve(observations);
    }

    // Rule of the station coordinates: of the lines [begin, end), the last
    // before the element, else the first after it; -1 when none.
    static int LineFor(const std::vector<int>& lines, int begin, int end, int element) {
        if (begin == end) return -1;
        const auto after = std::upper_bound(lines.begin() + begin, lines.begin() + end, element);
        return after != lines.begin() + begin ? *(after - 1) : *after;
    }
    int PlanLine(const Entry& e, int element) const { return LineFor(m_planLines, e.planBegin, e.planEnd, element); }
    int HeightLine(const Entry& e, int element) const {
        return LineFor(m_heightLines, e.heightBegin, e.heightEnd, element);
    }

    struct Position {
        bool plan = false;
        double x = 0, y = 0;
        std::optional<double> z;
        StationFrom from = StationFrom::Nowhere;
        int element = -1;
    };

    // Where a number stands as seen from `element`: known points first, then
    // what earlier set-ups computed.
    Position PositionOf(std::string_view name, int element) {
        Position p;
        const Entry& e = m_entries[Id(name)];
        const int line = PlanLine(e, element);
        if (line >= 0) {
            p.plan = true;
            p.x = PointAt(line).m_X;
            p.y = PointAt(line).m_Y;
            p.from = StationFrom::KnownPoint;
            p.element = line;
        } else if (e.plan > 0) {
            p.plan = true;
            p.x = e.sx / e.plan;
            p.y = e.sy / e.plan;
            p.from = StationFrom::ComputedPoint;
            p.element = m_result.shots[e.first].element;
        }
        const int heightLine = HeightLine(e, element);
        if (heightLine >= 0)
            p.z = PointAt(heightLine).m_Z;
        else if (e.height > 0)
            p.z = e.sz / e.height;
        return p;
    }

    void SetUpAt(int i, int instrument) {
        FinishSetUp();
        const CStation& s = *static_cast<const CStation*>(m_book.ptrAt(i));
        SetUp set;
        set.element = i;
        set.station = s.Np().str();
        set.hi = s.Hi();
        set.instrument = instrument;
        m_result.setUps.push_back(std::move(set));
        m_current = static_cast<int>(m_result.setUps.size()) - 1;
    }

    // An observation reduced to the horizontal: rule of the observation
    // reduction, then the distance correction and the eccentrics.
    struct Reduced {
        double ah = 0;
        bool hasDistance = false;
        double dp = 0;              // corrected horizontal distance, radial eccentric added
        double tangential = 0;      // ET
        std::optional<double> dz;   // station ground to point, vertical eccentric added
    };

    std::optional<Reduced> Reduce(int i, const SetUp& set, const CAppareil& instrument, std::string& why) const {
        const CReference& o = ObservationAt(i);
        Reduced r;
        double ah = o.Ah(), av = o.Av();
        if (IsUndef(ah) || !std::isfinite(ah)) {
            why = "incomplete observation (no horizontal angle)";
            return std::nullopt;
        }
        // Second face to first.
        if (!IsUndef(av)) CCarnet::setCD(ah, av);
        r.ah = ah;
        if (IsUndef(o.Di())) return r;  // a direction only
        if (IsUndef(av)) {
            why = "incomplete observation (a distance without zenith angle)";
            return std::nullopt;
        }
        const double zenith = av - instrument.CollVert();
        const double slope = o.Di() + instrument.CstePrism();
        if (!std::isfinite(slope) || slope <= 0) {
            why = "zero or negative distance";
            return std::nullopt;
        }
        // Horizontal distance and height difference from the slope distance.
        const double dh = slope * Sin(zenith);
        if (!std::isfinite(dh) || dh <= 1e-9) {
            why = "vertical sight (zenith angle of 0 or 200 grads): no horizontal distance";
            return std::nullopt;
        }
        const double hp = IsUndef(o.Hp()) ? 0.0 : o.Hp();
        double dz = slope * Cos(zenith) + set.hi - hp;
        // Earth curvature and refraction.
        if (m_result.options.automatic) dz += (1 - kRefraction) * dh * dh / (2 * m_result.options.earthRadius);
        // Distance corrections: projection scale and reduction to the level.
        r.dp = dh * m_factor + m_book.findER(i, set.element);
        r.tangential = m_book.findET(i, set.element);
        r.dz = dz + m_book.findEV(i, set.element);
        r.hasDistance = true;
        if (r.dp <= 0) {
            why = "the radial eccentric leaves no distance";
            return std::nullopt;
        }
        return r;
    }

    void FinishSetUp() {
        if (m_current < 0) return;
        SetUp& set = m_result.setUps[m_current];
        const std::vector<int> observations = std::move(m_observations);
        m_observations.clear();
        const Position at = PositionOf(StationName(set.element), set.element);
        set.from = at.from;
        set.fromElement = at.element;
        set.x = at.x;
        set.y = at.y;
        set.z = at.z;
        const CAppareil defaults;
        const CAppareil& instrument =
            set.instrument >= 0 ? *static_cast<const CAppareil*>(m_book.ptrAt(set.instrument)) : defaults;

        std::vector<std::pair<int, Reduced>> reduced;
        for (int i : observations) {
            std::string why;
            if (NameView(i) == set.station) {
                LeaveOut(i, Name(i), "sight to the station itself");
                continue;
            }
            const auto r = Reduce(i, set, instrument, why);
            if (!r)
                LeaveOut(i, Name(i), why);
            else
                reduced.emplace_back(i, *r);
        }
        if (!at.plan) {
            for (const auto& [i, r] : reduced) LeaveOut(i, Name(i), "the station " + set.station + " has no coordinates");
            return;
        }
        Orient(set, reduced);
        if (set.orientation == OrientationFrom::None) {
            for (const auto& [i, r] : reduced) LeaveOut(i, Name(i), "the set-up on " + set.station + " is unoriented");
            return;
        }
        for (const auto& [i, r] : reduced) {
            if (!r.hasDistance) continue;
            Radiate(static_cast<size_t>(m_current), i, r);
        }
    }

    // The orientation of a set-up: the distance-weighted mean over its
    // references to points with coordinates, else the station's own V0.
    void Orient(SetUp& set, const std::vector<std::pair<int, Reduced>>& reduced) {
        double sum = 0, weights = 0, first = 0;
        for (const auto& [i, r] : reduced) {
            if (m_book.typAt(i) != TypeCode<CReference>::value) continue;
            const Position target = PositionOf(NameView(i), set.element);
            if (!target.plan) continue;
            ReferenceCheck check;
            check.element = i;
            check.name = Name(i);
            check.distance = std::hypot(target.x - set.x, target.y - set.y);
            if (check.distance <= 0) continue;
            check.v0 = Turn(Bearing(set.x, set.y, target.x, target.y) - r.ah);
            if (set.references.empty()) first = check.v0;
            // Each value within 200 grads of the first, so that 399.99 and
            // 0.01 average to 0.
            const double near = first + HalfTurn(check.v0 - first);
            sum += near * check.distance;
            weights += check.distance;
            set.references.push_back(check);
        }
        if (weights > 0) {
            set.orientation = OrientationFrom::References;
            set.v0 = Turn(sum / weights);
            for (ReferenceCheck& c : set.references) {
                c.deviation = HalfTurn(c.v0 - set.v0);
                c.offset = c.deviation * kRadiansPerGrad * c.distance;
                c.flagged = std::fabs(c.deviation) > m_result.options.tolAngles;
            }
            return;
        }
        const double v0 = static_cast<const CStation*>(m_book.ptrAt(set.element))->V0();
        if (!IsUndef(v0) && std::isfinite(v0)) {
            set.orientation = OrientationFrom::StationV0;
            set.v0 = Turn(v0);
        }
    }

    // Coordinates of an observed point (polar radiation, eccentrics applied).
    void Radiate(size_t setUpIndex, int i, const Reduced& r) {
        SetUp& set = m_result.setUps[setUpIndex];
        const double bearing = Turn(set.v0 + r.ah);
        // The tangential eccentric moves the point to the right of the sight.
        const double x = set.x + r.dp * Sin(bearing) + r.tangential * Cos(bearing);
        const double y = set.y + r.dp * Cos(bearing) - r.tangential * Sin(bearing);
        if (!std::isfinite(x) || !std::isfinite(y)) {
            LeaveOut(i, Name(i), "no finite coordinates (degenerate sight)");
            return;
        }
        Shot shot;
        shot.element = i;
        shot.setUp = setUpIndex;
        shot.name = Name(i);
        shot.code = ObservationAt(i).Sy().str();
        shot.x = x;
        shot.y = y;
        if (set.z && r.dz) shot.z = *set.z + *r.dz;
        shot.bearing = Bearing(set.x, set.y, x, y);
        shot.distance = std::hypot(x - set.x, y - set.y);
        ++set.computed;
        const int id = Id(NameView(i));
        Entry& a = m_entries[id];
        if (!a.computed) m_computedOrder.push_back(id);
        a.computed = true;
        ++a.plan;
        a.sx += x;
        a.sy += y;
        if (shot.z) {
            ++a.height;
            a.sz += *shot.z;
        }
        const size_t index = m_result.shots.size();
        (a.last == kNone ? a.first : m_nextShot[a.last]) = index;
        a.last = index;
        m_nextShot.push_back(kNone);
        m_result.shots.push_back(std::move(shot));
    }

    // The coordinates each point keeps: a locked axis its Point line's; else
    // the mean of the determinations, the Point line's own counting as one.
    void Adopt() {
        const int end = m_book.length();
        m_result.points.reserve(m_entries.size());
        for (int i = 0; i < end; ++i) {
            if (m_book.typAt(i) != TypeCode<CPointGen>::value) continue;
            const CPointGen& p = PointAt(i);
            Entry& e = m_entries[m_ids.at(p.m_Np.str())];
            if ((!p.hasXY() && !p.hasZ()) || e.point >= 0) continue;
            e.point = static_cast<int>(m_result.points.size());
            ComputedPoint point;
            point.name = p.m_Np.str();
            point.code = p.m_Sy.str();
            // The last line of a number with a position is the one in force at the end.
            const int plan = PlanLine(e, end), height = HeightLine(e, end);
            if (plan >= 0) point.x = PointAt(plan).m_X, point.y = PointAt(plan).m_Y;
            if (height >= 0) point.z = PointAt(height).m_Z;
            m_result.points.push_back(std::move(point));
        }
        for (int id : m_computedOrder) {
            const Entry& a = m_entries[id];
            const bool known = a.point >= 0;
            const int line = known ? PlanLine(a, end) : -1;
            const int heightLine = known ? HeightLine(a, end) : -1;
            const bool lockedPlan = line >= 0 && PointAt(line).isXConst();
            const bool lockedHeight = heightLine >= 0 && PointAt(heightLine).isZConst();
            ComputedPoint fresh;
            ComputedPoint& point = known ? m_result.points[a.point] : fresh;
            if (!known) {
                point.name = m_result.shots[a.first].name;
                point.code = m_result.shots[a.first].code;
            }
            const int planCount = a.plan + (point.x && !lockedPlan ? 1 : 0);
            const int heightCount = a.height + (point.z && !lockedHeight ? 1 : 0);
            if (!lockedPlan) {
                const double sx = a.sx + (point.x ? *point.x : 0), sy = a.sy + (point.y ? *point.y : 0);
                point.x = sx / planCount;
                point.y = sy / planCount;
                point.source = planCount > 1 ? PointSource::Mean : PointSource::Radiated;
            }
            if (!lockedHeight && heightCount > 0) point.z = (a.sz + (point.z ? *point.z : 0)) / heightCount;
            if (lockedPlan || lockedHeight || planCount > 1 || heightCount > 1) {
                Determinations d;
                d.name = point.name;
                d.count = a.plan;
                d.lockedPlan = lockedPlan;
                d.lockedHeight = lockedHeight;
                for (size_t s = a.first; s != kNone; s = m_nextShot[s]) {
                    const Shot& shot = m_result.shots[s];
                    d.planSpread = std::max(d.planSpread, std::hypot(shot.x - *point.x, shot.y - *point.y));
                    if (shot.z && point.z)
                        d.heightSpread = std::max(d.heightSpread.value_or(0.0), std::fabs(*shot.z - *point.z));
                }
                d.flagged = d.planSpread > m_result.options.tolDistances ||
                            d.heightSpread.value_or(0.0) > m_result.options.tolAltitudes;
                m_result.multiples.push_back(d);
            }
            if (!known) m_result.points.push_back(std::move(fresh));
        }
    }
};

}  // namespace

Computation Compute(const CCarnet& book) { return Computer(book).Run(); }

}  // namespace carnet::survey
