// What an export carries: the points with known coordinates and the traverse
// paths drawn through the points of their stations.
#pragma once

#include <cstdio>
#include <string>
#include <vector>

namespace carnet_tool {

struct ExportPoint {
    std::string name;  // code page 1252, as every text below
    std::string code;
    double x, y, z;    // UNDEF_VALUE when not known
    int locks;         // 1 planimetric, 2 altimetric, 3 both
    bool station;      // a station is set up on it
    bool HasXY() const;
};

struct Vertex {
    double x, y;
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
    std::vector<ExportPoint> points;
    std::vector<ExportPath> paths;
    // The plan extent of what is drawn; false when nothing has a plan position.
    bool Extent(double& minX, double& minY, double& maxX, double& maxY) const;
};

// Each writes the survey whole and says whether all was written.
bool WriteCsv(const Survey& survey, std::FILE* f);
bool WriteGeoJson(const Survey& survey, std::FILE* f);
bool WriteSvg(const Survey& survey, std::FILE* f);
// Through dxflib, to a file of its own.
bool WriteDxf(const Survey& survey, const std::string& path);

}  // namespace carnet_tool
