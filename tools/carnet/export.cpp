// carnet export: the points and paths of a book as CSV, GeoJSON, DXF or SVG.
#include "export.h"

#include <algorithm>
#include <set>
#include <unordered_map>

#include <carnet/carnet.h>

#include "commands.h"
#include "elements.h"
#include "session.h"

namespace carnet_tool {
namespace {

const unsigned int kStation = TypeCode<CStation>::value, kPoint = TypeCode<CPointGen>::value,
                   kPath = TypeCode<CChemin>::value;

std::string Number(double v) { return numconv::Format("%.6f", v); }

// A CSV field, quoted when it holds a separator, a quote or a line break.
std::string CsvField(const std::string& cp1252) {
    const std::string text = Utf8Of(cp1252);
    if (text.find_first_of(",\"\r\n") == std::string::npos) return text;
    std::string quoted = "\"";
    for (char ch : text) quoted += ch == '"' ? std::string("\"\"") : std::string(1, ch);
    return quoted + "\"";
}

bool Puts(std::FILE* f, const std::string& text) { return std::fwrite(text.data(), 1, text.size(), f) == text.size(); }

std::string JsonNumber(double v) { return IsUndef(v) ? std::string("null") : Number(v); }

std::string JsonPosition(double x, double y, double z) {
    return "[" + Number(x) + ", " + Number(y) + (IsUndef(z) ? std::string() : ", " + Number(z)) + "]";
}

std::string JsonGeometry(const ExportPath& path) {
    auto line = [](const std::vector<Vertex>& part) {
        std::string text = "[";
        for (const Vertex& v : part) text += (text.size() > 1 ? ", " : "") + JsonPosition(v.x, v.y, UNDEF_VALUE);
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
    CString projection;
    GetParamString(CurrentSession().store.Location().c_str(), "Options_Corrections", "Projection", "", &projection);
    if (projection != "Aucune") survey.projection = projection.str();

    // The first point of each number, as the book's lookups find it, and
    // the numbers that stations are set up on: one pass, not one per query.
    std::set<std::string> stations;
    std::unordered_map<std::string, const CPointGen*> firstPoint;
    for (int i = 0; i < book.length(); ++i) {
        if (book.typAt(i) == kStation) stations.insert(book.matAt(i).str());
        if (book.typAt(i) == kPoint) {
            const CPointGen* p = static_cast<const CPointGen*>(book.ptrAt(i));
            firstPoint.emplace(p->m_Np.str(), p);
        }
    }
    for (int i = 0; i < book.length(); ++i) {
        if (book.typAt(i) == kPoint) {
            const CPointGen& p = *static_cast<const CPointGen*>(book.ptrAt(i));
            if (p.hasXY() || p.hasZ())
                survey.points.push_back({p.m_Np.str(), p.m_Sy.str(), p.m_X, p.m_Y, p.m_Z, p.LockCode(),
                                         stations.count(p.m_Np.str()) > 0});
        } else if (book.typAt(i) == kPath) {
            const CChemin& c = *static_cast<const CChemin*>(book.ptrAt(i));
            ExportPath line{c.Np().str(), c.isAntenne() != 0, {}, {{}}};
            std::string missing;
            for (int k = 0; k < c.length(); ++k) {
                line.stations.push_back(numconv::Format("%s-%d", c.matAt(k).GetString(), c.repAt(k)));
                const auto found = firstPoint.find(c.matAt(k).str());
                if (found != firstPoint.end() && found->second->hasXY()) {
                    line.parts.back().push_back({found->second->m_X, found->second->m_Y});
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
    }
    return survey;
}

}  // namespace

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
    bool ok = Puts(f, "name,x,y,z,code,locks\n");
    auto value = [](double v) { return IsUndef(v) ? std::string() : Number(v); };
    for (const ExportPoint& p : survey.points)
        ok = Puts(f, CsvField(p.name) + "," + value(p.x) + "," + value(p.y) + "," + value(p.z) + "," +
                         CsvField(p.code) + "," + std::to_string(p.locks) + "\n") &&
             ok;
    return ok;
}

bool WriteGeoJson(const Survey& survey, std::FILE* f) {
    bool ok = Puts(f, "{\"type\": \"FeatureCollection\", \"name\": " + JsonString(survey.title) +
                          (survey.projection.empty() ? "" : ", \"projection\": " + JsonString(survey.projection)) +
                          ",\n\"features\": [");
    const char* separator = "\n";
    for (const ExportPoint& p : survey.points) {
        // A point known in height only has no place on the plan.
        const std::string geometry = p.HasXY() ? "{\"type\": \"Point\", \"coordinates\": " +
                                                     JsonPosition(p.x, p.y, p.z) + "}"
                                               : std::string("null");
        ok = Puts(f, separator + std::string("{\"type\": \"Feature\", \"geometry\": ") + geometry +
                         ", \"properties\": {\"name\": " + JsonString(p.name) + ", \"code\": " + JsonString(p.code) +
                         ", \"z\": " + JsonNumber(p.z) + ", \"locks\": " + std::to_string(p.locks) +
                         ", \"station\": " + (p.station ? "true" : "false") + "}}") &&
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

int Export(const std::string& path, const std::string& format, const std::string& output) {
    CCarnet& book = FreshBook();
    int rejected = 0;
    const int status = LoadBook(path, book, rejected, true);
    if (status != kOk && (status != kRejected || rejected == 0)) return status;
    const Survey survey = Gather(book, path);
    if (survey.points.empty() && survey.paths.empty()) Say(path, "no point has known coordinates");
    const int written = WriteOutput(output, [&](std::FILE* f) {
        // dxflib opens a file of its own: the one under the stream.
        if (format == "dxf") return WriteDxf(survey, "/proc/self/fd/" + std::to_string(fileno(f)));
        return format == "csv"       ? WriteCsv(survey, f)
               : format == "geojson" ? WriteGeoJson(survey, f)
                                     : WriteSvg(survey, f);
    });
    return std::max(status, written);
}

}  // namespace carnet_tool
