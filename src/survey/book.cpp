#include "book.h"

#include <carnet/ccarnet.h>
#include <carnet/params.h>
#include <carnet/point.h>

namespace carnet::survey {

std::string ProjectionName(const CCarnet& book) {
    CString name;
    GetParamString(book.m_ParamFile.GetString(), "Options_Corrections", "Projection", "Aucune", &name);
    return name.str();
}

Crs CrsOfBook(const CCarnet& book) { return Crs::FromBookName(ProjectionName(book)); }

std::optional<MeanPosition> MeanOfKnownPoints(const CCarnet& book) {
    // Summed from the first point's offsets: grid coordinates of millions of
    // metres would otherwise lose their millimetres in a long sum.
    MeanPosition mean;
    double x0 = 0, y0 = 0, dx = 0, dy = 0;
    for (int i = 0; i < book.length(); ++i) {
        if (book.typAt(i) != TypeCode<CPointGen>::value) continue;
        const auto& p = *static_cast<const CPointGen*>(book.ptrAt(i));
        if (!p.hasXY()) continue;
        if (mean.count == 0) {
            x0 = p.m_X;
            y0 = p.m_Y;
        }
        dx += p.m_X - x0;
        dy += p.m_Y - y0;
        ++mean.count;
    }
    if (mean.count == 0) return std::nullopt;
    mean.x = x0 + dx / mean.count;
    mean.y = y0 + dy / mean.count;
    return mean;
}

}  // namespace carnet::survey
