// The plot of a survey as SVG: an A4 landscape page, north up, the survey
// fitted into it, points and stations marked and labelled, paths drawn, a
// scale bar and a north arrow.
#include <algorithm>
#include <cmath>

#include <carnet/numconv.h>

#include "export.h"
#include "terminal.h"

namespace carnet_tool {
namespace {

// The page, in millimetres, and the frame that the survey is fitted into.
constexpr double kWidth = 297, kHeight = 210;
constexpr double kLeft = 15, kRight = 282, kTop = 22, kBottom = 185;

std::string Xml(const std::string& cp1252) {
    std::string out;
    for (char ch : Utf8Of(cp1252)) {
        switch (ch) {
        case '&': out += "&amp;"; break;
        case '<': out += "&lt;"; break;
        case '>': out += "&gt;"; break;
        case '"': out += "&quot;"; break;
        default:
            // Control characters have no place in XML 1.0.
            out += static_cast<unsigned char>(ch) < 0x20 && ch != '\t' ? ' ' : ch;
        }
    }
    return out;
}

std::string Mm(double v) { return numconv::Format("%.2f", v); }

// The longest length of 1, 2 or 5 times a power of ten that is not above `limit`.
double RoundLength(double limit) {
    const double power = std::pow(10.0, std::floor(std::log10(limit)));
    for (double step : {5.0, 2.0, 1.0})
        if (step * power <= limit) return step * power;
    return power;
}

class Page {
public:
    explicit Page(const Survey& survey) {
        double minX = 0, minY = 0, maxX = 0, maxY = 0;
        survey.Extent(minX, minY, maxX, maxY);
        // A single point or a straight line still gets a frame around it.
        const double spanX = std::max(maxX - minX, 1.0), spanY = std::max(maxY - minY, 1.0);
        m_scale = std::min((kRight - kLeft) / spanX, (kBottom - kTop) / spanY);
        m_x0 = (kLeft + kRight) / 2 - (minX + maxX) / 2 * m_scale;
        m_y0 = (kTop + kBottom) / 2 + (minY + maxY) / 2 * m_scale;
    }
    double X(double x) const { return m_x0 + x * m_scale; }
    double Y(double y) const { return m_y0 - y * m_scale; }  // north up
    double Scale() const { return m_scale; }

private:
    double m_scale, m_x0, m_y0;
};

std::string ScaleBar(double scale) {
    const double length = RoundLength((kRight - kLeft) / 4 / scale);
    const double bar = length * scale, y = kHeight - 12;
    std::string svg = "<g id=\"scale\" stroke=\"black\" stroke-width=\"0.3\">\n";
    svg += "<path d=\"M " + Mm(kLeft) + " " + Mm(y - 1.5) + " v 1.5 h " + Mm(bar) + " v -1.5\" fill=\"none\"/>\n";
    svg += "<rect x=\"" + Mm(kLeft) + "\" y=\"" + Mm(y - 0.75) + "\" width=\"" + Mm(bar / 2) +
           "\" height=\"0.75\" fill=\"black\"/>\n";
    svg += "<text x=\"" + Mm(kLeft + bar + 2) + "\" y=\"" + Mm(y) + "\" stroke=\"none\" font-size=\"3\">" +
           numconv::Format("%g", length) + " m</text>\n</g>\n";
    return svg;
}

std::string NorthArrow() {
    const double x = kRight - 5, y = 8;
    return "<g id=\"north\">\n<path d=\"M " + Mm(x) + " " + Mm(y) + " l 2.5 9 l -2.5 -2.5 l -2.5 2.5 z\"/>\n"
           "<text x=\"" + Mm(x) + "\" y=\"" + Mm(y + 13.5) + "\" font-size=\"4\" text-anchor=\"middle\">N</text>\n"
           "</g>\n";
}

}  // namespace

bool WriteSvg(const Survey& survey, std::FILE* f) {
    const Page page(survey);
    std::string svg = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                      "<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"297mm\" height=\"210mm\" "
                      "viewBox=\"0 0 297 210\" font-family=\"sans-serif\">\n";
    const std::string title = survey.title + (survey.projection.empty() ? "" : " \x97 " + survey.projection);
    svg += "<title>" + Xml(title) + "</title>\n<rect width=\"297\" height=\"210\" fill=\"white\"/>\n";
    svg += "<text x=\"" + Mm(kLeft) + "\" y=\"12\" font-size=\"5\">" + Xml(title) + "</text>\n";

    svg += "<g id=\"paths\" fill=\"none\" stroke=\"#1f5fa8\" stroke-width=\"0.35\">\n";
    for (const ExportPath& path : survey.paths)
        for (const auto& part : path.parts) {
            svg += "<polyline data-name=\"" + Xml(path.name) + "\" points=\"";
            for (const Vertex& v : part) svg += Mm(page.X(v.x)) + "," + Mm(page.Y(v.y)) + " ";
            svg.back() = '"';
            svg += "/>\n";
        }
    svg += "</g>\n<g id=\"points\">\n";
    std::string labels = "<g id=\"labels\" font-size=\"2.5\">\n";
    for (const ExportPoint& p : survey.points) {
        if (!p.HasXY()) continue;
        const double x = page.X(p.x), y = page.Y(p.y);
        // Stations as triangles, the other points as dots.
        if (p.station)
            svg += "<path class=\"station\" d=\"M " + Mm(x) + " " + Mm(y - 1.6) +
                   " l 1.4 2.4 h -2.8 z\" fill=\"none\" stroke=\"#b22222\" stroke-width=\"0.3\"/>\n";
        else
            svg += "<circle class=\"point\" cx=\"" + Mm(x) + "\" cy=\"" + Mm(y) + "\" r=\"0.6\"/>\n";
        labels += "<text x=\"" + Mm(x + 1.5) + "\" y=\"" + Mm(y - 1.2) + "\">" + Xml(p.name) + "</text>\n";
    }
    svg += "</g>\n" + labels + "</g>\n" + ScaleBar(page.Scale()) + NorthArrow() + "</svg>\n";
    return std::fwrite(svg.data(), 1, svg.size(), f) == svg.size();
}

}  // namespace carnet_tool
