// The survey options: written at the head of a field-book file from the
// stored parameters, and read back from option lines into them. The book
// itself keeps none of these values, only where they are stored.
#include <initializer_list>
#include <string>

#include <carnet/ccarnet.h>
#include <carnet/cstring.h>
#include <carnet/numconv.h>
#include <carnet/params.h>

#include "core/line_internal.h"
#include "file/file_texts_internal.h"
#include "file/reader_internal.h"

namespace {

constexpr const char* kCorrections = "Options_Corrections";
constexpr const char* kLevelling = "Options_Nivellement";
constexpr const char* kTolerances = "Options_Tolerances";

int StoredInt(const char* location, const char* section, const char* key, int def, int min, int max) {
    int value = def;
    GetParamInt(location, section, key, def, min, max, &value);
    return value;
}

double StoredDouble(const char* location, const char* section, const char* key, double def, double min,
                    double max) {
    double value = def;
    GetParamDouble(location, section, key, def, min, max, &value);
    return value;
}

// 8 blanks in place of a line number, the keyword, the blanks that align the
// fields, the fields.
void WriteOptionLine(std::FILE* f, const char* keyword, int blanks, const CString& fields) {
    CString line(std::string(8, ' '));
    carnet_line::AppendKeyword(line, keyword);
    line.str().append(static_cast<size_t>(blanks), ' ');
    line.str() += fields.str();
    carnet_line::Emit(f, 0, line);
}

}  // namespace

void CCarnet::WriteOptions(std::FILE* f) {
    if (!f) return;
    const char* at = m_ParamFile.GetString();
    CString fields;

    fields.Format("  %d  %.1f  %.1f  %.3f  %.3f  %.3f  %.3f", StoredInt(at, kCorrections, "CorrAuto", 1, 0, 1),
                  StoredDouble(at, kCorrections, "AlterLineaire", 0.0, -100000.0, 100000.0),
                  StoredDouble(at, kCorrections, "CorrNivZero", 0.0, -100000.0, 100000.0),
                  StoredDouble(at, kCorrections, "AbsiMoyenne", 0.0, 0.0, 90000000.0),
                  StoredDouble(at, kCorrections, "OrdoMoyenne", 0.0, 0.0, 90000000.0),
                  StoredDouble(at, kCorrections, "AltiMoyenne", 0.0, -10000.0, 10000.0),
                  StoredDouble(at, kCorrections, "RayonTerre", 6366.0, 6000.0, 7000.0));
    WriteOptionLine(f, "Option_Correc", 18, fields);

    fields.Empty();
    GetParamString(at, kCorrections, "Projection", carnet_texts::kNoProjection, &fields);
    WriteOptionLine(f, "Option_Projec", 20, fields);

    fields.Format("  %d  %d  %.3f", StoredInt(at, kLevelling, "TypeTolerance", 0, 0, 2),
                  StoredInt(at, kLevelling, "TypeNivel", 0, 0, 2),
                  StoredDouble(at, kLevelling, "FermAltimetr", 0.01, 0.001, 100000.0));
    WriteOptionLine(f, "Option_Nivell", 18, fields);

    fields.Format("  %d  %.3f  %.3f  %.3f  %.3f  %.3f %.3f %d", StoredInt(at, kTolerances, "TypeTolerance", 0, 0, 2),
                  StoredDouble(at, kTolerances, "TolAngles", 0.01, 0.001, 400000.0),
                  StoredDouble(at, kTolerances, "TolDistances", 0.01, 0.001, 100000.0),
                  StoredDouble(at, kTolerances, "TolAltitudes", 0.01, 0.001, 100000.0),
                  StoredDouble(at, kTolerances, "FermAngulaire", 0.01, 0.001, 400000.0),
                  StoredDouble(at, kTolerances, "FermPlanimetr", 0.01, 0.001, 100000.0),
                  StoredDouble(at, kTolerances, "FermAltimetr", 0.01, 0.001, 100000.0),
                  StoredInt(at, kTolerances, "TypeCanevas", 0, 0, 3));
    WriteOptionLine(f, "Option_Planim", 18, fields);
}

namespace carnet_reader {
namespace {

// Writes to the store at the book's parameter location. Failures are the
// store's to report; the line is consumed either way.
class OptionStore {
public:
    OptionStore(const ReadContext& ctx, const char* section)
        : m_ctx(ctx), m_at(ctx.book.m_ParamFile.GetString()), m_section(section) {}

    // The words from the first, each stored as it stands under its key.
    void Words(std::initializer_list<const char*> keys) const {
        size_t i = 0;
        for (const char* key : keys) Text(key, m_ctx.Word(i++));
    }
    // The words from the first, each read as a number, scaled and stored.
    void Numbers(std::initializer_list<const char*> keys, double scale) const {
        size_t i = 0;
        for (const char* key : keys) SetParamDouble(m_at, m_section, key, m_ctx.Number(i++) * scale);
    }
    void Text(const char* key, const CString& value) const { SetParamString(m_at, m_section, key, value); }
    void Text(const char* key, const char* value) const { SetParamString(m_at, m_section, key, value); }
    void Number(const char* key, double value) const { SetParamDouble(m_at, m_section, key, value); }

private:
    const ReadContext& m_ctx;
    const char* m_at;
    const char* m_section;
};

void StoreCorrections(const ReadContext& ctx) {
    OptionStore(ctx, kCorrections)
        .Words({"CorrAuto", "AlterLineaire", "CorrNivZero", "AbsiMoyenne", "OrdoMoyenne", "AltiMoyenne", "RayonTerre"});
}

// The older corrections line: a Lambert zone number instead of the
// projection name, and no switch (corrections are then off).
void StoreOlderCorrections(const ReadContext& ctx) {
    OptionStore store(ctx, kCorrections);
    store.Text("CorrAuto", "0");
    const int zone = numconv::Atoi(std::string(ctx.WordAt(0)).c_str());
    store.Text("Projection", zone >= 0 && zone <= 3 ? carnet_texts::kLambertZones[zone] : carnet_texts::kNoProjection);
    store.Text("AbsiMoyenne", ctx.Word(1));
    store.Text("OrdoMoyenne", ctx.Word(2));
    store.Text("AltiMoyenne", ctx.Word(3));
    store.Text("RayonTerre", ctx.Word(4));
}

// The older distance line gives the alteration in tenths; its second word
// has never been used, and both corrections take the alteration.
void StoreOlderDistances(const ReadContext& ctx) {
    OptionStore store(ctx, kCorrections);
    const double alteration = ctx.Number(0) * 10.0;
    store.Number("AlterLineaire", alteration);
    store.Number("CorrNivZero", alteration);
}

void StoreProjection(const ReadContext& ctx) {
    OptionStore(ctx, kCorrections).Text("Projection", CString(std::string(ctx.cut.rest)));
}

// "Tol_Niv" gives its closure in thousandths.
void StoreLevelling(const ReadContext& ctx, double scale) {
    OptionStore store(ctx, kLevelling);
    store.Words({"TypeTolerance", "TypeNivel"});
    store.Number("FermAltimetr", ctx.Number(2) * scale);
}

void StoreTolerances(const ReadContext& ctx) {
    OptionStore(ctx, kTolerances)
        .Words({"TypeTolerance", "TolAngles", "TolDistances", "TolAltitudes", "FermAngulaire", "FermPlanimetr",
                "FermAltimetr", "TypeCanevas"});
}

void StoreOlderNetwork(const ReadContext& ctx) {
    OptionStore(ctx, kTolerances).Words({"TypeTolerance", "TypeCanevas"});
}

// The older tolerances line gives every tolerance in thousandths.
void StoreOlderTolerances(const ReadContext& ctx) {
    OptionStore(ctx, kTolerances)
        .Numbers({"TolAngles", "TolDistances", "TolAltitudes", "FermAngulaire", "FermPlanimetr", "FermAltimetr"},
                 0.001);
}

struct OptionKeyword {
    const char* keyword;
    int words;  // the exact count; 0: any non-empty rest
    void (*store)(const ReadContext&);
};

// Current keywords and the older ones that files may still hold.
const OptionKeyword kOptionKeywords[] = {
    {"Option_Correc", 7, StoreCorrections},
    {"Cal_Cor", 5, StoreOlderCorrections},
    {"Cor_Dist", 2, StoreOlderDistances},
    {"Option_Projec", 0, StoreProjection},
    {"Option_Nivell", 3, [](const ReadContext& ctx) { StoreLevelling(ctx, 1.0); }},
    {"Tol_Niv", 3, [](const ReadContext& ctx) { StoreLevelling(ctx, 0.001); }},
    {"Option_Planim", 8, StoreTolerances},
    {"Tol_Poly", 2, StoreOlderNetwork},
    {"Tol_Pers", 6, StoreOlderTolerances},
};

}  // namespace

bool ReadOptionLine(ReadContext& ctx) {
    for (const OptionKeyword& option : kOptionKeywords) {
        if (ctx.cut.keyword != option.keyword) continue;
        const bool fits = option.words == 0 ? !ctx.cut.rest.empty()
                                            : ctx.WordCount() == static_cast<size_t>(option.words);
        if (fits)
            option.store(ctx);
        else
            ctx.Report(carnet_texts::kWrongCount);
        return true;
    }
    return false;
}

}  // namespace carnet_reader
