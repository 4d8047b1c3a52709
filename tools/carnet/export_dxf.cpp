// The survey as a DXF drawing (format version AC1015) through dxflib: each
// point on the layer of its code with its name as a text beside it, the
// paths as polylines on a layer of their own. Texts stay code page 1252, as
// the drawing's code page says.
#include <algorithm>
#include <fstream>
#include <map>
#include <memory>

#include <dl_dxf.h>
#include <dl_writer_ascii.h>

#include <carnet/undef.h>

#include "export.h"

namespace carnet_tool {
namespace {

const char kNoCode[] = "0";  // the layer that every drawing has
const char kPathLayer[] = "CHEMINS";

// A layer named after a code: the characters that layer names may not hold
// become '_'.
std::string LayerOf(const std::string& code) {
    if (code.empty()) return kNoCode;
    std::string name = code;
    for (char& ch : name)
        if (static_cast<unsigned char>(ch) < 0x20 || std::string("<>/\\\":;?*|=`,").find(ch) != std::string::npos)
            ch = '_';
    return name;
}

double Height(double z) { return IsUndef(z) ? 0.0 : z; }

// dxflib reports no write error; a drawing that was written whole ends so.
bool EndsWithEof(const std::string& path) {
    std::ifstream in(path, std::ios::binary | std::ios::ate);
    const std::streamoff size = in.tellg();
    if (size < 4) return false;
    in.seekg(size - 4);
    std::string tail(4, '\0');
    in.read(&tail[0], 4);
    return static_cast<bool>(in) && tail == "EOF\n";
}

}  // namespace

bool WriteDxf(const Survey& survey, const std::string& path) {
    // Layers in order of appearance, with colours from the standard seven.
    std::map<std::string, int> layers{{kNoCode, 7}, {kPathLayer, 5}};
    for (const ExportPoint& p : survey.points)
        if (p.HasXY()) layers.emplace(LayerOf(p.code), 1 + static_cast<int>(layers.size()) % 6);
    double minX = 0, minY = 0, maxX = 0, maxY = 0;
    survey.Extent(minX, minY, maxX, maxY);
    const double text = std::max(0.05, std::max(maxX - minX, maxY - minY) / 250);

    DL_Dxf dxf;
    std::unique_ptr<DL_WriterA> dw(dxf.out(path.c_str(), DL_Codes::AC1015));
    if (!dw) return false;
    dxf.writeHeader(*dw);
    dw->dxfString(9, "$DWGCODEPAGE");
    dw->dxfString(3, "ANSI_1252");
    dw->dxfString(9, "$INSUNITS");
    dw->dxfInt(70, 6);  // metres
    dw->sectionEnd();

    dw->sectionTables();
    dxf.writeVPort(*dw);
    dw->tableLinetypes(3);
    dxf.writeLinetype(*dw, DL_LinetypeData("BYBLOCK", "BYBLOCK", 0, 0, 0.0));
    dxf.writeLinetype(*dw, DL_LinetypeData("BYLAYER", "BYLAYER", 0, 0, 0.0));
    dxf.writeLinetype(*dw, DL_LinetypeData("CONTINUOUS", "Continuous", 0, 0, 0.0));
    dw->tableEnd();
    dw->tableLayers(static_cast<int>(layers.size()));
    for (const auto& layer : layers)
        dxf.writeLayer(*dw, DL_LayerData(layer.first, 0),
                       DL_Attributes(std::string(), layer.second, 100, "CONTINUOUS", 1.0));
    dw->tableEnd();
    dw->tableStyle(1);
    dxf.writeStyle(*dw, DL_StyleData("standard", 0, 0.0, 1.0, 0.0, 0, text, "txt", ""));
    dw->tableEnd();
    dxf.writeView(*dw);
    dxf.writeUcs(*dw);
    dw->tableAppid(1);
    dxf.writeAppid(*dw, "ACAD");
    dw->tableEnd();
    dxf.writeDimStyle(*dw, 1, 1, 1, 1, 1);
    dxf.writeBlockRecord(*dw);
    dw->tableEnd();
    dw->sectionEnd();

    dw->sectionBlocks();
    for (const char* block : {"*Model_Space", "*Paper_Space", "*Paper_Space0"}) {
        dxf.writeBlock(*dw, DL_BlockData(block, 0, 0.0, 0.0, 0.0));
        dxf.writeEndBlock(*dw, block);
    }
    dw->sectionEnd();

    dw->sectionEntities();
    for (const ExportPoint& p : survey.points) {
        if (!p.HasXY()) continue;
        const DL_Attributes on(LayerOf(p.code), 256, -1, "BYLAYER", 1.0);
        dxf.writePoint(*dw, DL_PointData(p.x, p.y, Height(p.z)), on);
        dxf.writeText(*dw,
                      DL_TextData(p.x + text / 2, p.y + text / 2, Height(p.z), 0.0, 0.0, 0.0, text, 1.0, 0, 0, 0,
                                  p.name, "standard", 0.0),
                      on);
    }
    const DL_Attributes onPaths(kPathLayer, 256, -1, "BYLAYER", 1.0);
    for (const ExportPath& line : survey.paths)
        for (const auto& part : line.parts) {
            dxf.writePolyline(*dw, DL_PolylineData(static_cast<int>(part.size()), 0, 0, 0), onPaths);
            for (const Vertex& v : part) dxf.writeVertex(*dw, DL_VertexData(v.x, v.y, 0.0));
            dxf.writePolylineEnd(*dw);
        }
    dw->sectionEnd();
    dxf.writeObjects(*dw);
    dxf.writeObjectsEnd(*dw);
    dw->dxfEOF();
    dw->close();
    return EndsWithEof(path);
}

}  // namespace carnet_tool
