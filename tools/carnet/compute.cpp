// carnet compute: the coordinates of every observed point, as a surveyor's
// computation sheet, as JSON, or as CSV files of points and shots.
#include <algorithm>
#include <cmath>

#include <carnet/carnet.h>
#include <carnet/survey/compute.h>

#include "commands.h"
#include "elements.h"
#include "export.h"
#include "session.h"

namespace carnet_tool {
namespace {

using namespace carnet::survey;

// Metres with 4 decimals, grads with 5, as the sheet shows them; an absent
// value is blank (or empty in CSV, null in JSON).
// Rounded before printing, so that -1e-16 shows as 0.0000, not -0.0000.
double Rounded(double v, double scale) { return std::round(v * scale) / scale + 0.0; }
std::string M(double v) { return numconv::Format("%.4f", Rounded(v, 1e4)); }
std::string G(double v) { return numconv::Format("%.5f", Rounded(v, 1e5)); }
std::string M(const std::optional<double>& v) { return v ? M(*v) : std::string(); }
std::string JsonM(const std::optional<double>& v) { return v ? M(*v) : std::string("null"); }

std::string Padded(const std::string& text, size_t width, bool right = false) {
    if (text.size() >= width) return text;
    const std::string pad(width - text.size(), ' ');
    return right ? pad + text : text + pad;
}

const char* StationFromText(StationFrom from) {
    switch (from) {
    case StationFrom::KnownPoint: return "known point";
    case StationFrom::ComputedPoint: return "computed point";
    case StationFrom::Nowhere: return "no coordinates";
    }
    return "";
}

std::string Sheet(const Computation& c, const std::string& path) {
    const carnet::survey::Options& o = c.options;
    std::string s = "Computation of " + path + "\n";
    s += numconv::Format("Distances: scale %+.1f cm/km, level %+.1f cm/km, factor %.8f (",
                         Rounded(c.corrections.alterLineaire, 10), Rounded(c.corrections.corrNivZero, 10),
                         c.corrections.Factor()) +
         c.corrections.origin + ")\n";
    s += "Tolerances: angles " + G(o.tolAngles) + " gr, distances " + M(o.tolDistances) + " m, heights " +
         M(o.tolAltitudes) + " m\n";
    for (const std::string& note : c.notes) s += "Note: " + note + "\n";
    for (const SetUp& set : c.setUps) {
        s += numconv::Format("\nSet-up %s (line %d): ", set.station.c_str(), Line(set.element)) +
             StationFromText(set.from);
        if (set.from != StationFrom::Nowhere)
            s += numconv::Format(" (line %d)", Line(set.fromElement)) + "  X " + M(set.x) + "  Y " + M(set.y) +
                 (set.z ? "  Z " + M(*set.z) : std::string()) + "  HI " + M(set.hi);
        s += "\n";
        if (set.orientation == OrientationFrom::References)
            s += "  V0 " + G(set.v0) + " gr, mean of " + Plural(static_cast<long>(set.references.size()), "reference") +
                 " weighted by distance\n";
        else if (set.orientation == OrientationFrom::StationV0)
            s += "  V0 " + G(set.v0) + " gr, the station's own\n";
        else if (set.from != StationFrom::Nowhere)
            s += "  unoriented: no reference to a point with coordinates, no V0\n";
        if (!set.references.empty()) {
            s += "  reference       distance m        V0 gr     dev. gr   offset m\n";
            for (const ReferenceCheck& r : set.references)
                s += "  " + Padded(r.name, 12) + Padded(M(r.distance), 13, true) + Padded(G(r.v0), 13, true) +
                     Padded(G(r.deviation), 12, true) + Padded(M(r.offset), 11, true) +
                     (r.flagged ? "  above tolerance" : "") + "\n";
        }
        s += "  " + Plural(set.computed, "point") + " computed\n";
    }
    if (!c.multiples.empty()) {
        s += "\nPoints determined more than once\n  point        count  plan spread m  height spread m\n";
        const Determinations* worst = nullptr;
        for (const Determinations& d : c.multiples) {
            s += "  " + Padded(d.name, 12) + Padded(std::to_string(d.count), 6, true) +
                 Padded(M(d.planSpread), 15, true) + Padded(M(d.heightSpread), 17, true) +
                 (d.lockedPlan || d.lockedHeight ? "  locked, checked" : "") + (d.flagged ? "  above tolerance" : "") +
                 "\n";
            if (!worst || d.planSpread > worst->planSpread) worst = &d;
        }
        s += "  worst plan spread: " + worst->name + ", " + M(worst->planSpread) + " m\n";
    }
    if (!c.leftOut.empty()) {
        s += "\nLeft out\n";
        for (const LeftOut& l : c.leftOut)
            s += numconv::Format("  line %-7d ", Line(l.element)) + Padded(l.name, 12) + " " + l.reason + "\n";
    }
    int flagged = 0;
    for (const SetUp& set : c.setUps)
        flagged += static_cast<int>(std::count_if(set.references.begin(), set.references.end(),
                                                  [](const ReferenceCheck& r) { return r.flagged; }));
    flagged += static_cast<int>(
        std::count_if(c.multiples.begin(), c.multiples.end(), [](const Determinations& d) { return d.flagged; }));
    s += "\n" + Plural(static_cast<long>(c.setUps.size()), "set-up") + ", " +
         Plural(static_cast<long>(c.shots.size()), "observation") + " computed, " +
         std::to_string(c.leftOut.size()) + " left out, " + Plural(flagged, "check") + " above tolerance\n";
    return s;
}

std::string Json(const Computation& c) {
    auto list = [](const auto& items, const auto& one) {
        std::string text = "[";
        for (size_t k = 0; k < items.size(); ++k) text += (k ? ",\n  " : "\n  ") + one(items[k]);
        return text + (items.empty() ? "]" : "\n ]");
    };
    std::string s = "{\"corrections\": {\"scale_cm_km\": " + numconv::Format("%.3f", c.corrections.alterLineaire) +
                    ", \"level_cm_km\": " + numconv::Format("%.3f", c.corrections.corrNivZero) +
                    ", \"computed\": " + (c.corrections.computed ? "true" : "false") +
                    ", \"origin\": " + JsonString(c.corrections.origin) + "},\n \"notes\": " +
                    list(c.notes, [](const std::string& n) { return JsonString(n); });
    s += ",\n \"setups\": " + list(c.setUps, [](const SetUp& set) {
        std::string refs = "[";
        for (const ReferenceCheck& r : set.references)
            refs += (refs.size() > 1 ? ", " : "") + numconv::Format("{\"line\": %d, \"name\": ", Line(r.element)) +
                    JsonString(r.name) + ", \"distance\": " + M(r.distance) + ", \"v0\": " + G(r.v0) +
                    ", \"deviation\": " + G(r.deviation) + ", \"offset\": " + M(r.offset) +
                    ", \"flagged\": " + (r.flagged ? "true" : "false") + "}";
        const bool placed = set.from != StationFrom::Nowhere;
        const char* orientation = set.orientation == OrientationFrom::References ? "references"
                                  : set.orientation == OrientationFrom::StationV0 ? "station"
                                                                                   : "none";
        return numconv::Format("{\"line\": %d, \"station\": ", Line(set.element)) + JsonString(set.station) +
               ", \"from\": \"" +
               (set.from == StationFrom::KnownPoint ? "known" : placed ? "computed" : "none") + "\"" +
               (placed ? numconv::Format(", \"from_line\": %d", Line(set.fromElement)) : std::string()) +
               ", \"x\": " + (placed ? M(set.x) : "null") + ", \"y\": " + (placed ? M(set.y) : "null") +
               ", \"z\": " + JsonM(set.z) + ", \"orientation\": \"" + orientation + "\", \"v0\": " +
               (set.orientation != OrientationFrom::None ? G(set.v0) : "null") + ", \"references\": " + refs +
               "], \"computed\": " + std::to_string(set.computed) + "}";
    });
    s += ",\n \"shots\": " + list(c.shots, [&c](const Shot& shot) {
        return numconv::Format("{\"line\": %d, \"station\": ", Line(shot.element)) +
               JsonString(c.setUps[shot.setUp].station) + ", \"name\": " + JsonString(shot.name) +
               ", \"code\": " + JsonString(shot.code) + ", \"x\": " + M(shot.x) + ", \"y\": " + M(shot.y) +
               ", \"z\": " + JsonM(shot.z) + "}";
    });
    s += ",\n \"multiples\": " + list(c.multiples, [](const Determinations& d) {
        return "{\"name\": " + JsonString(d.name) + ", \"count\": " + std::to_string(d.count) +
               ", \"plan_spread\": " + M(d.planSpread) + ", \"height_spread\": " + JsonM(d.heightSpread) +
               ", \"locked\": " + (d.lockedPlan || d.lockedHeight ? "true" : "false") +
               ", \"flagged\": " + (d.flagged ? "true" : "false") + "}";
    });
    s += ",\n \"left_out\": " + list(c.leftOut, [](const LeftOut& l) {
        return numconv::Format("{\"line\": %d, \"name\": ", Line(l.element)) + JsonString(l.name) +
               ", \"reason\": " + JsonString(l.reason) + "}";
    });
    s += ",\n \"points\": " + list(c.points, [](const ComputedPoint& p) {
        return "{\"name\": " + JsonString(p.name) + ", \"code\": " + JsonString(p.code) + ", \"x\": " + JsonM(p.x) +
               ", \"y\": " + JsonM(p.y) + ", \"z\": " + JsonM(p.z) + ", \"source\": \"" + SourceName(p.source) +
               "\"}";
    });
    return s + ",\n \"clean\": " + (c.Clean() ? "true" : "false") + "}\n";
}

}  // namespace

int Compute(const std::string& path, bool json, const std::string& pointsCsv, const std::string& shotsCsv) {
    CCarnet& book = FreshBook();
    int rejected = 0;
    const int status = LoadBook(path, book, rejected, true);
    if (status == kUnreadable) return status;
    const Computation c = carnet::survey::Compute(book);
    if (!pointsCsv.empty() && WriteOutput(pointsCsv, [&c](std::FILE* f) {
            bool ok = Puts(f, "name,x,y,z,code,source\n");
            for (const ComputedPoint& p : c.points)
                ok = Puts(f, CsvField(p.name) + "," + M(p.x) + "," + M(p.y) + "," + M(p.z) + "," + CsvField(p.code) + "," +
                                 SourceName(p.source) + "\n") &&
                     ok;
            return ok;
        }) != kOk)
        return kUnreadable;
    if (!shotsCsv.empty() && WriteOutput(shotsCsv, [&c](std::FILE* f) {
            bool ok = Puts(f, "station,name,x,y,z,code,element\n");
            for (const Shot& s : c.shots)
                ok = Puts(f, CsvField(c.setUps[s.setUp].station) + "," + CsvField(s.name) + "," + M(s.x) + "," + M(s.y) + "," +
                                 M(s.z) + "," + CsvField(s.code) + "," + std::to_string(Line(s.element)) + "\n") &&
                     ok;
            return ok;
        }) != kOk)
        return kUnreadable;
    if (json)
        Puts(stdout, Json(c));  // UTF-8 already
    else
        Put(Sheet(c, path));
    return std::max(status, c.Clean() && c.notes.empty() ? kOk : kRejected);
}

}  // namespace carnet_tool
