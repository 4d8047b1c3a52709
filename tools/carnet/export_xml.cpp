// The exports for globe viewers (KML 2.2) and handheld receivers (GPX 1.1):
// XML in UTF-8, positions in WGS 84 longitude and latitude.
#include <carnet/carnet.h>

#include "export.h"
#include "terminal.h"

namespace carnet_tool {
namespace {

// A code page 1252 text as XML character data. The control characters that
// XML 1.0 cannot hold at all become blanks.
std::string Xml(const std::string& cp1252) {
    std::string text;
    for (char ch : Utf8Of(cp1252)) {
        switch (ch) {
        case '&': text += "&amp;"; break;
        case '<': text += "&lt;"; break;
        case '>': text += "&gt;"; break;
        case '"': text += "&quot;"; break;
        default:
            const bool control = static_cast<unsigned char>(ch) < 0x20 && ch != '\t' && ch != '\n' && ch != '\r';
            text += control ? ' ' : ch;
        }
    }
    return text;
}

std::string Metres(double v) { return IsUndef(v) ? std::string() : numconv::Format("%.6f", v); }

std::string Degrees(double v) { return numconv::Format("%.9f", v); }

std::string Header(const Survey& survey) {
    return survey.projection.empty() ? "converted from " + survey.crs
                                     : survey.projection + ", converted from " + survey.crs;
}

std::string KmlData(const char* name, const std::string& value) {
    return std::string("<Data name=\"") + name + "\"><value>" + value + "</value></Data>";
}

std::string KmlLine(const std::vector<Vertex>& part) {
    std::string text = "<LineString><coordinates>";
    for (size_t i = 0; i < part.size(); ++i) text += (i ? " " : "") + Degrees(part[i].lon) + "," + Degrees(part[i].lat);
    return text + "</coordinates></LineString>";
}

}  // namespace

bool WriteKml(const Survey& survey, std::FILE* f) {
    bool ok = Puts(f, "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<kml xmlns=\"http://www.opengis.net/kml/2.2\">\n"
                      "<Document>\n<name>" + Xml(survey.title) + "</name>\n<description>" +
                          Xml(Header(survey)) + "</description>\n<Folder><name>points</name>\n");
    for (const ExportPoint& p : survey.points) {
        if (!p.placed) continue;
        // Heights are the book's own (above its levelling datum), kept for
        // the record: the mark is drawn on the ground.
        ok = Puts(f, "<Placemark><name>" + Xml(p.name) + "</name><description>" + Xml(p.code) +
                         "</description>\n<ExtendedData>" + KmlData("code", Xml(p.code)) + KmlData("x", Metres(p.x)) +
                         KmlData("y", Metres(p.y)) + KmlData("z", Metres(p.z)) +
                         KmlData("locks", std::to_string(p.locks)) +
                         KmlData("station", p.station ? "true" : "false") + KmlData("source", p.source) +
                         "</ExtendedData>\n<Point><coordinates>" +
                         Degrees(p.lon) + "," + Degrees(p.lat) + (IsUndef(p.z) ? "" : "," + Metres(p.z)) +
                         "</coordinates></Point></Placemark>\n") &&
             ok;
    }
    ok = Puts(f, "</Folder>\n<Folder><name>paths</name>\n") && ok;
    for (const ExportPath& path : survey.paths) {
        std::string stations, geometry;
        for (const std::string& s : path.stations) stations += (stations.empty() ? "" : " ") + Xml(s);
        for (const auto& part : path.parts) geometry += KmlLine(part);
        if (path.parts.size() > 1) geometry = "<MultiGeometry>" + geometry + "</MultiGeometry>";
        ok = Puts(f, "<Placemark><name>" + Xml(path.name) + "</name>\n<ExtendedData>" +
                         KmlData("kind", path.antenna ? "antenna" : "framed") + KmlData("stations", stations) +
                         "</ExtendedData>\n" + geometry + "</Placemark>\n") &&
             ok;
    }
    return Puts(f, "</Folder>\n</Document>\n</kml>\n") && ok;
}

bool WriteGpx(const Survey& survey, std::FILE* f) {
    bool ok = Puts(f, "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<gpx version=\"1.1\" creator=\"carnet\" "
                      "xmlns=\"http://www.topografix.com/GPX/1/1\">\n<metadata><name>" +
                          Xml(survey.title) + "</name><desc>" + Xml(Header(survey)) + "</desc></metadata>\n");
    // Waypoints come before tracks in GPX.
    for (const ExportPoint& p : survey.points) {
        if (!p.placed) continue;
        ok = Puts(f, "<wpt lat=\"" + Degrees(p.lat) + "\" lon=\"" + Degrees(p.lon) + "\">" +
                         (IsUndef(p.z) ? std::string() : "<ele>" + Metres(p.z) + "</ele>") + "<name>" + Xml(p.name) +
                         "</name><desc>" + Xml(p.code) + "</desc><src>" + p.source + "</src>" + (p.station ? "<type>station</type>" : "") +
                         "</wpt>\n") &&
             ok;
    }
    for (const ExportPath& path : survey.paths) {
        std::string stations, segments;
        for (const std::string& s : path.stations) stations += (stations.empty() ? "" : " ") + Xml(s);
        for (const auto& part : path.parts) {
            segments += "<trkseg>";
            for (const Vertex& v : part)
                segments += "<trkpt lat=\"" + Degrees(v.lat) + "\" lon=\"" + Degrees(v.lon) + "\"/>";
            segments += "</trkseg>\n";
        }
        ok = Puts(f, "<trk><name>" + Xml(path.name) + "</name><desc>" + stations + "</desc><type>" +
                         (path.antenna ? "antenna" : "framed") + "</type>\n" + segments + "</trk>\n") &&
             ok;
    }
    return Puts(f, "</gpx>\n") && ok;
}

}  // namespace carnet_tool
