// carnet projection, and the system that the exports in longitude and
// latitude convert from.
#include <cmath>

#include <carnet/carnet.h>
#include <carnet/survey/book.h>

#include "commands.h"
#include "export.h"
#include "session.h"

namespace carnet_tool {

using carnet::survey::Crs;

std::string FromProj(const std::string& utf8) {
    std::string cp1252;
    Unheld unheld;
    size_t bad = 0;
    if (KindOf(utf8, bad) != TextKind::Other && Cp1252Of(utf8, cp1252, unheld)) return cp1252;
    // What code page 1252 cannot hold is not worth failing a command for.
    cp1252.clear();
    for (char ch : utf8) cp1252 += static_cast<unsigned char>(ch) < 0x80 ? ch : '?';
    return cp1252;
}

int OpenCrs(const CCarnet& book, const std::string& path, const std::string& crsName, Crs& crs) {
    std::string given;
    if (!crsName.empty() && !FromTerminal("--crs", crsName, given)) return kUnreadable;
    crs = given.empty() ? carnet::survey::CrsOfBook(book) : Crs::FromName(given);
    // Warnings and errors are the tool's own words around the name as given.
    if (!crs.Warning().empty()) Say(path, crs.Warning());
    if (!crs.Error().empty()) {
        Say(given.empty() ? path : std::string("--crs"), crs.Error());
        return kUnreadable;
    }
    return kOk;
}

int ShowProjection(const std::string& path, const std::string& crsName) {
    CCarnet& book = FreshBook();
    int rejected = 0;
    const int status = LoadBook(path, book, rejected, true);
    if (status == kUnreadable) return status;
    Crs crs;
    if (OpenCrs(book, path, crsName, crs) != kOk) return kUnreadable;
    std::string text = carnet::survey::ProjectionName(book) + "\n";
    if (crs.IsLocal()) {
        Put(text + "system: a local grid, with no reference system\n");
        return status;
    }
    const std::string code = crs.Code().empty() ? crs.Definition() : crs.Code();
    text += "system" + std::string(crsName.empty() ? "" : " (--crs)") + ": " + FromProj(code) + ", " +
            FromProj(crs.Name()) + "\n";
    const auto& area = crs.Area();
    if (!area.name.empty())
        text += "area of use: " + FromProj(area.name) +
                numconv::Format(" (longitude %.2f to %.2f, latitude %.2f to %.2f)\n", area.west, area.east,
                                area.south, area.north);
    const auto mean = carnet::survey::MeanOfKnownPoints(book);
    if (!mean) {
        Put(text + "no point has known coordinates: no scale factor to show\n");
        return status;
    }
    text += numconv::Format("mean of %s: X %.3f  Y %.3f\n", Plural(mean->count, "known point").c_str(), mean->x,
                            mean->y);
    const auto factors = crs.FactorsAt(mean->x, mean->y);
    const auto wgs84 = crs.ToWgs84(mean->x, mean->y);
    if (!factors || !wgs84) {
        Put(text);
        Say(path, "the mean position is beyond what the projection can invert: no scale factor");
        return kRejected;
    }
    text += numconv::Format("WGS 84 there: longitude %.8f, latitude %.8f\n", wgs84->lon, wgs84->lat);
    text += numconv::Format("scale factor there: %.8f (%+.1f cm/km)\n", factors->scale, factors->ScaleCmPerKm());
    // Rounded first, so that a convergence of -1e-12 is not shown as -0.0000.
    text += numconv::Format("meridian convergence there: %.4f grad\n",
                            std::round(factors->convergence * 1e4) / 1e4 + 0.0);
    Put(text);
    if (!area.Contains(*wgs84)) Say(path, "the mean position lies outside the system's area of use");
    return status;
}

}  // namespace carnet_tool
