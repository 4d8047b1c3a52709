#include <carnet/drawing_layouts.h>

#include <cassert>
#include <cmath>

#include <carnet/cp1252.h>

#include "core/line_internal.h"

namespace carnet_drawing {

namespace {

// In the order of Label; accented letters are code-page-1252 bytes.
const char* const kLabelTexts[] = {
    "",                        // kNoLabel
    "Ech",                     // kEch
    "Ech X",                   // kEchX
    "Ech Y",                   // kEchY
    "Ech 1",                   // kEch1
    "Ech 2",                   // kEch2
    "Seuil",                   // kSeuil
    "Rayon",                   // kRayon
    "Diam\xE8tre",             // kDiametre
    "Cot\xE9",                 // kCote
    "Liaison",                 // kLiaison
    "Epaisseur",               // kEpaisseur
    "D\xE9port",               // kDeport
    "Prolongement",            // kProlongement
    "Distance",                // kDistance
    "Distance1",               // kDistance1
    "Distance2",               // kDistance2
    "D\xE9" "calage",          // kDecalage
    "D\xE9" "calage 1",        // kDecalage1
    "D\xE9" "calage 2",        // kDecalage2
    "R\xE9p\xE9tition",        // kRepetition
    "Marches",                 // kMarches
    "Largeur",                 // kLargeur
    "Largeur marche",          // kLargeurMarche
    "Texte",                   // kTexte
    "Point",                   // kPoint
};
static_assert(sizeof kLabelTexts / sizeof kLabelTexts[0] == static_cast<size_t>(kPoint) + 1,
              "one text per label");

// Every item of a display text follows the code item.
void Separate(CString& out) { out += " , "; }

// The distance below which a stair width counts as unchanged.
constexpr double kWidthTolerance = 1e-6;

}  // namespace

const char* LabelText(Label label) {
    const size_t i = static_cast<size_t>(label);
    return i < sizeof kLabelTexts / sizeof kLabelTexts[0] ? kLabelTexts[i] : "";
}

void BeginParams(CString& out, const CString& code) {
    out = "Code = ";
    out += code;
}

void AddNumber(CString& out, Label label, double value) {
    Separate(out);
    out.AppendFormat("%s = %.3f", LabelText(label), value);
}

void AddCount(CString& out, Label label, int count) {
    Separate(out);
    out.AppendFormat("%s = %d", LabelText(label), count);
}

void AddText(CString& out, Label label, const CString& text, bool quoted) {
    Separate(out);
    out += LabelText(label);
    out += quoted ? " = <" : " = ";
    out += text;
    if (quoted) out += '>';
}

void AddScales(CString& out, std::initializer_list<Label> labels, std::initializer_list<double> values,
               Label alone) {
    assert(labels.size() == values.size());
    const double* v = values.begin();
    const size_t n = values.size();
    if (n == 0 || !Given(v[0])) return;
    size_t last = 0;
    for (size_t i = 1; i < n; ++i)
        if (Given(v[i])) last = i;
    if (last == 0) {
        if (alone != kNoLabel) AddNumber(out, alone, v[0]);
        return;
    }
    for (size_t i = 0; i <= last; ++i) AddNumber(out, labels.begin()[i], v[i]);
}

void BeginLine(CString& out, unsigned int type, const CString& code) {
    out.Empty();
    carnet_line::AppendKeyword(out, CarnetKeyword(type));
    out.str().append(18, ' ');
    out += code;
}

void PrintLine(CNorvexTxtWnd* wnd, int n, const CString& line) { carnet_line::Emit(wnd, n, line); }

void WriteLine(std::FILE* f, int n, const CString& line) { carnet_line::Emit(f, n, line); }

bool Update(CString& member, const CString& value) {
    if (cp1252::Compare(member, value) == 0) return false;
    member = value;
    return true;
}

bool Update(int& member, int value) {
    if (member == value) return false;
    member = value;
    return true;
}

bool Update(double& member, double value, bool tolerant) {
    // Without tolerance an unordered comparison (a NaN) counts as a change.
    const bool differs = tolerant ? std::fabs(member - value) > kWidthTolerance : !(member == value);
    if (differs) member = value;
    return differs;
}

}  // namespace carnet_drawing
