// What an export carries: the points with known coordinates and the traverse
// paths drawn through the points of their stations, in the book's metres and,
// for the exports that want them, in WGS 84 longitude and latitude.
#pragma once

#include <cstdio>
#include <string>
#include <vector>

#include <carnet/survey/crs.h>

class CCarnet;

namespace carnet_tool {

struct ExportPoint {
    std::string name;  // code page 1252, as every text below
    std::string code;
    double x, y, z;    // UNDEF_VALUE when not known
    int locks;         // 1 planimetric, 2 altimetric, 3 both
    bool station;      // a station is set up on it
    std::string source = "known";  // or "computed" from the observations
    bool placed = false;  // lon and lat hold its WGS 84 position
    double lon = 0, lat = 0;
    bool HasXY() const;
};

struct Vertex {
    double x, y;
    double lon = 0, lat = 0;  // WGS 84, when the survey is placed
};

struct ExportPath {
    std::string name;
    bool antenna;
    std::vector<std::string> stations;       // "NUMBER-SETUP"
    std::vector<std::vector<Vertex>> parts;  // runs of stations with known coordinates
};

struct Survey {
    std::string title;       // the book's file name
    std::string projection;  // empty when none is declared
    std::string crs;         // the system converted from ("EPSG:27572"), when placed
    std::string crsName;     // PROJ's name of it, code page 1252
    std::vector<ExportPoint> points;
    std::vector<ExportPath> paths;
    // The plan extent of what is drawn; false when nothing has a plan position.
    bool Extent(double& minX, double& minY, double& maxX, double& maxY) const;
};

// Each writes the survey whole and says whether all was written.
bool WriteCsv(const Survey& survey, std::FILE* f);
// In WGS 84: RFC 7946 GeoJSON, KML 2.2 and GPX 1.1.
bool WriteGeoJson(const Survey& survey, std::FILE* f);
bool WriteKml(const Survey& survey, std::FILE* f);
bool WriteGpx(const Survey& survey, std::FILE* f);
bool WriteSvg(const Survey& survey, std::FILE* f);
// Through dxflib, to a file of its own.
bool WriteDxf(const Survey& survey, const std::string& path);

// A CSV field in UTF-8, quoted when it holds a separator, a quote or a line break.
std::string CsvField(const std::string& cp1252);
// Writes the text; false when not all of it was written.
bool Puts(std::FILE* f, const std::string& text);

// PROJ's UTF-8 text as code page 1252 (what it cannot hold becomes '?').
std::string FromProj(const std::string& utf8);

// The system of a book, or the one --crs names when not empty; warnings said.
// kOk, or kUnreadable with the error said.
int OpenCrs(const CCarnet& book, const std::string& path, const std::string& crsName, carnet::survey::Crs& crs);

}  // namespace carnet_tool
