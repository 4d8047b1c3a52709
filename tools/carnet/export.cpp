// carnet export: the points and paths of a book as CSV, DXF or SVG in its
// own metres, or as GeoJSON, KML or GPX in WGS 84.
#include "export.h"

#include <algorithm>
#include <set>
#include <unordered_map>

#include <carnet/carnet.h>
#include <carnet/survey/book.h>
#include <carnet/survey/compute.h>

#include "commands.h"
#include "elements.h"
#include "session.h"

namespace carnet_tool {
namespace {

std::string Number(double v) { return numconv::Format("%.6f", v); }

std::string JsonNumber(double v) { return IsUndef(v) ? std::string("null") : Number(v); }

// A WGS 84 position, longitude first: nine decimals of a degree are a tenth
// of a millimetre, what a survey can tell.
std::string JsonPosition(double lon, double lat, double z) {
    return numconv::Format("[%.9f, %.9f", lon, lat) + (IsUndef(z) ? std::string() : ", " + Number(z)) + "]";
}

std::string JsonGeometry(const ExportPath& path) {
    auto line = [](const std::vector<Vertex>& part) {
        std::string text = "[";
        for (const Vertex& v : part) text += (text.size() > 1 ? ", " : "") + JsonPosition(v.lon, v.lat, UNDEF_VALUE);
        return text + "]";
    };
    if (path.parts.size() == 1) return "{\"type\": \"LineString\", \"coordinates\": " + line(path.parts[0]) + "}";
    std::string lines;
    for (const auto& part : path.parts) lines += (lines.empty() ? "" : ", ") + line(part);
    return "{\"type\": \"MultiLineString\", \"coordinates\": [" + lines + "]}";
}

// The points and paths of a book. A path is drawn through the first point
// that bears each station's number, as the book's own lookups take it; it is broken where a station has no
// plan position, which is said on standard error.
Survey Gather(CCarnet& book, const std::string& path) {
    Survey survey;
    const size_t slash = path.rfind('/');
    survey.title = slash == std::string::npos ? path : path.substr(slash + 1);
    const std::string projection = carnet::survey::ProjectionName(book);
    if (projection != "Aucune") survey.projection = projection;

    // The coordinates the observations give, beside the known ones.
    const carnet::survey::Computation computed = carnet::survey::Compute(book);
    for (const std::string& note : computed.notes) Say(path, note);
    if (!computed.leftOut.empty())
        Say(path, Plural(static_cast<long>(computed.leftOut.size()), "observation") +
                      " left out of the computation; carnet compute tells why");

    // The numbers that stations are set up on, and the locks of the first
    // point of each number: one pass, not one per query.
    std::set<std::string> stations;
    std::unordered_map<std::string, int> locks;
    for (int i = 0; i < book.length(); ++i) {
        if (book.typAt(i) == TypeCode<CStation>::value) stations.insert(book.matAt(i).str());
        if (book.typAt(i) == TypeCode<CPointGen>::value) {
            const CPointGen* p = static_cast<const CPointGen*>(book.ptrAt(i));
            locks.emplace(p->m_Np.str(), p->LockCode());
        }
    }
    std::unordered_map<std::string, const carnet::survey::ComputedPoint*> byName;
    for (const carnet::survey::ComputedPoint& p : computed.points) {
        byName.emplace(p.name, &p);
        if (!p.x && !p.z) continue;
        const auto lock = locks.find(p.name);
        ExportPoint point{p.name, p.code, p.x.value_or(UNDEF_VALUE), p.y.value_or(UNDEF_VALUE),
                          p.z.value_or(UNDEF_VALUE), lock == locks.end() ? 0 : lock->second,
                          stations.count(p.name) > 0};
        point.source = p.source == carnet::survey::PointSource::Known ? "known" : "computed";
        survey.points.push_back(std::move(point));
    }
    for (int i = 0; i < book.length(); ++i) {
        if (book.typAt(i) != TypeCode<CChemin>::value) continue;
        const CChemin& c = *static_cast<const CChemin*>(book.ptrAt(i));
        ExportPath line{c.Np().str(), c.isAntenne() != 0, {}, {{}}};
        std::string missing;
        for (int k = 0; k < c.length(); ++k) {
            line.stations.push_back(numconv::Format("%s-%d", c.matAt(k).GetString(), c.repAt(k)));
            const auto found = byName.find(c.matAt(k).str());
            if (found != byName.end() && found->second->x) {
                line.parts.back().push_back({*found->second->x, *found->second->y});
                continue;
            }
            missing += (missing.empty() ? "" : ", ") + c.matAt(k).str();
            line.parts.push_back({});
        }
        line.parts.erase(std::remove_if(line.parts.begin(), line.parts.end(),
                                        [](const std::vector<Vertex>& part) { return part.size() < 2; }),
                         line.parts.end());
        if (!missing.empty())
            Say(path, "path " + line.name + ": no plan position for " + missing +
                          (line.parts.empty() ? "; not drawn" : "; the line is broken there"));
        if (!line.parts.empty()) survey.paths.push_back(std::move(line));
    }
    return survey;
}

}  // namespace

std::string CsvField(const std::string& cp1252) {
    const std::string text = Utf8Of(cp1252);
    if (text.find_first_of(",\"\r\n") == std::string::npos) return text;
    std::string quoted = "\"";
    for (char ch : text) quoted += ch == '"' ? std::string("\"\"") : std::string(1, ch);
    return quoted + "\"";
}

bool Puts(std::FILE* f, const std::string& text) { return std::fwrite(text.data(), 1, text.size(), f) == text.size(); }

bool ExportPoint::HasXY() const { return !IsUndef(x) && !IsUndef(y); }

bool Survey::Extent(double& minX, double& minY, double& maxX, double& maxY) const {
    bool any = false;
    auto take = [&](double x, double y) {
        minX = any ? std::min(minX, x) : x;
        maxX = any ? std::max(maxX, x) : x;
        minY = any ? std::min(minY, y) : y;
        maxY = any ? std::max(maxY, y) : y;
        any = true;
    };
    for (const ExportPoint& p : points)
        if (p.HasXY()) take(p.x, p.y);
    for (const ExportPath& path : paths)
        for (const auto& part : path.parts)
            for (const Vertex& v : part) take(v.x, v.y);
    return any;
}

bool WriteCsv(const Survey& survey, std::FILE* f) {
    bool ok = Puts(f, "name,x,y,z,code,locks,source\n");
    auto value = [](double v) { return IsUndef(v) ? std::string() : Number(v); };
    for (const ExportPoint& p : survey.points)
        ok = Puts(f, CsvField(p.name) + "," + value(p.x) + "," + value(p.y) + "," + value(p.z) + "," +
                         CsvField(p.code) + "," + std::to_string(p.locks) + "," + p.source + "\n") &&
             ok;
    return ok;
}

bool WriteGeoJson(const Survey& survey, std::FILE* f) {
    bool ok = Puts(f, "{\"type\": \"FeatureCollection\", \"name\": " + JsonString(survey.title) +
                          (survey.projection.empty() ? "" : ", \"projection\": " + JsonString(survey.projection)) +
                          ", \"source_crs\": " + JsonString(survey.crs) +
                          ", \"source_crs_name\": " + JsonString(survey.crsName) + ",\n\"features\": [");
    const char* separator = "\n";
    for (const ExportPoint& p : survey.points) {
        // A point known in height only has no place on the map.
        const std::string geometry = p.placed ? "{\"type\": \"Point\", \"coordinates\": " +
                                                    JsonPosition(p.lon, p.lat, p.z) + "}"
                                              : std::string("null");
        ok = Puts(f, separator + std::string("{\"type\": \"Feature\", \"geometry\": ") + geometry +
                         ", \"properties\": {\"name\": " + JsonString(p.name) + ", \"code\": " + JsonString(p.code) +
                         ", \"x\": " + JsonNumber(p.x) + ", \"y\": " + JsonNumber(p.y) + ", \"z\": " +
                         JsonNumber(p.z) + ", \"locks\": " + std::to_string(p.locks) +
                         ", \"station\": " + (p.station ? "true" : "false") + ", \"source\": \"" + p.source +
                         "\"}}") &&
             ok;
        separator = ",\n";
    }
    for (const ExportPath& path : survey.paths) {
        std::string stations;
        for (const std::string& s : path.stations) stations += (stations.empty() ? "" : ", ") + JsonString(s);
        ok = Puts(f, separator + std::string("{\"type\": \"Feature\", \"geometry\": ") + JsonGeometry(path) +
                         ", \"properties\": {\"name\": " + JsonString(path.name) + ", \"kind\": \"" +
                         (path.antenna ? "antenna" : "framed") + "\", \"stations\": [" + stations + "]}}") &&
             ok;
        separator = ",\n";
    }
    return Puts(f, "\n]}\n") && ok;
}

// Places the survey in WGS 84 from `crs`. What PROJ cannot place is named
// and written without a position; a point outside the system's area of use
// is named and kept.
static void Place(Survey& survey, const carnet::survey::Crs& crs, const std::string& path) {
    survey.crs = FromProj(crs.Code().empty() ? crs.Definition() : crs.Code());
    survey.crsName = FromProj(crs.Name());
    std::vector<std::string> outside, failed;
    for (ExportPoint& p : survey.points) {
        if (!p.HasXY()) continue;
        const auto at = crs.ToWgs84(p.x, p.y);
        if (!at) {
            failed.push_back(p.name);
            continue;
        }
        p.placed = true;
        p.lon = at->lon;
        p.lat = at->lat;
        if (!crs.Area().Contains(*at)) outside.push_back(p.name);
    }
    for (auto path = survey.paths.begin(); path != survey.paths.end();) {
        bool all = true;
        for (auto& part : path->parts)
            for (Vertex& v : part) {
                const auto at = crs.ToWgs84(v.x, v.y);
                all = all && at;
                if (at) v.lon = at->lon, v.lat = at->lat;
            }
        if (all) {
            ++path;
            continue;
        }
        failed.push_back("path " + path->name);
        path = survey.paths.erase(path);
    }
    // The first names are enough to find the fault; thousands would bury it.
    auto names = [](const std::vector<std::string>& list) {
        std::string text;
        for (size_t i = 0; i < list.size() && i < 10; ++i) text += (i ? ", " : "") + list[i];
        return list.size() > 10 ? text + " and " + std::to_string(list.size() - 10) + " more" : text;
    };
    if (!failed.empty())
        Say(path, "PROJ cannot place in WGS 84: " + names(failed) + "; written without a position");
    if (!outside.empty())
        Say(path, "outside the area of use of " + survey.crs + ": " + names(outside) + "; written all the same");
}

int Export(const std::string& path, const std::string& format, const std::string& output,
           const std::string& crsName) {
    CCarnet& book = FreshBook();
    int rejected = 0;
    const int status = LoadBook(path, book, rejected, true);
    if (status != kOk && (status != kRejected || rejected == 0)) return status;
    const bool geographic = format == "geojson" || format == "kml" || format == "gpx";
    carnet::survey::Crs crs;
    if (geographic) {
        if (OpenCrs(book, path, crsName, crs) != kOk) {
            Say(path, "nothing written");
            return kUnreadable;
        }
        if (crs.IsLocal()) {
            Say(path, "the book's coordinates are on a local grid (projection \"" +
                          carnet::survey::ProjectionName(book) + "\"), and " + format +
                          " holds longitudes and latitudes: give --crs with the system they are in, such as "
                          "--crs EPSG:2154; nothing written");
            return kUnreadable;
        }
    }
    Survey survey = Gather(book, path);
    if (survey.points.empty() && survey.paths.empty()) Say(path, "no point has known coordinates");
    if (geographic) Place(survey, crs, path);
    const int written = WriteOutput(output, [&](std::FILE* f) {
        // dxflib opens a file of its own: the one under the stream.
        if (format == "dxf") return WriteDxf(survey, "/proc/self/fd/" + std::to_string(fileno(f)));
        if (format == "csv") return WriteCsv(survey, f);
        if (format == "geojson") return WriteGeoJson(survey, f);
        if (format == "kml") return WriteKml(survey, f);
        if (format == "gpx") return WriteGpx(survey, f);
        return WriteSvg(survey, f);
    });
    return std::max(status, written);
}

}  // namespace carnet_tool
