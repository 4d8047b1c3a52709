// The record branches of the line reader: one small reader per survey record
// keyword, each checking its word count and building the element.
#include <string>

#include <carnet/comment.h>
#include <carnet/lecture.h>
#include <carnet/numconv.h>
#include <carnet/point.h>
#include <carnet/reference.h>
#include <carnet/station.h>
#include <carnet/undef.h>

#include "core/line_internal.h"
#include "file/reader_internal.h"

namespace carnet_reader {
namespace {

// A symbol word: every "***" stands for a blank.
CString SymbolWord(const ReadContext& ctx, size_t i) {
    CString s = ctx.Word(i);
    carnet_line::UnmarkSpaces(s);
    return s;
}

bool HasDot(std::string_view w) { return w.find('.') != std::string_view::npos; }

// Digits with one point (at `dot`) between them, no leading zero before it
// but a lone one, and at most 15 significant digits: such a text is what
// printing its own value with as many decimals gives back, since a double
// keeps any 15 significant digits through a conversion and back. This
// spares the printing for the coordinates a writer makes; any other text
// takes the full test.
bool IsPlainDecimal(std::string_view w, size_t dot) {
    if (dot == 0 || dot + 1 >= w.size() || w.size() - dot - 1 > 290) return false;
    if (w[0] == '0' && dot > 1) return false;
    int significant = 0;
    for (size_t i = 0; i < w.size(); ++i) {
        if (i == dot) continue;
        const char c = w[i];
        if (c < '0' || c > '9') return false;
        if (significant > 0 || c != '0') ++significant;
    }
    return significant <= 15;
}

// A coordinate word of a Point line: one optional sign, a decimal point, and
// a text that prints back exactly with as many decimals as it has.
bool IsCoordinate(std::string_view w) {
    if (!w.empty() && (w[0] == '+' || w[0] == '-')) w.remove_prefix(1);
    const size_t dot = w.find('.');
    if (dot == std::string_view::npos) return false;
    if (IsPlainDecimal(w, dot)) return true;
    const int decimals = static_cast<int>(w.size() - dot - 1);
    return numconv::Format("%.*f", decimals, numconv::Atof(w)) == w;
}

// A comment or a command: the rest of the line, whole.
template <class Text>
void* ReadText(ReadContext& ctx) {
    if (ctx.cut.rest.empty()) return ctx.Incomplete();
    return ctx.Store(new Text(CString(std::string(ctx.cut.rest))), TypeCode<Text>::value);
}

// A reference or a measure: 2 or 3 words (the name, AH and perhaps the
// symbol), or 5 or 6 words (the name, HP, AH, AV, DI and perhaps the symbol).
template <class Observation>
void* ReadObservation(ReadContext& ctx) {
    const size_t n = ctx.WordCount();
    const size_t count = n == 2 || n == 3 ? 1 : (n == 5 || n == 6 ? 4 : 0);
    if (count == 0) return ctx.Incomplete();
    double values[4];
    for (size_t i = 0; i < count; ++i) {
        values[i] = ctx.Number(i + 1);
        // The writer leaves an absent observation out of the line, so a
        // value word that reads as the absent value itself would be saved
        // as a line of another shape: such a line is refused like an
        // incomplete one.
        if (IsUndef(values[i])) return ctx.Incomplete();
    }
    const CString sy = n == 3 || n == 6 ? SymbolWord(ctx, n - 1) : CString();
    Observation* r = count == 1 ? new Observation(ctx.Word(0), values[0], sy)
                                : new Observation(ctx.Word(0), values[0], values[1], values[2], values[3], sy);
    return ctx.Store(r, TypeCode<Observation>::value);
}

template <class Reading>
void* ReadLevelling(ReadContext& ctx) {
    const size_t n = ctx.WordCount();
    if (n < 2 || n > 4) return ctx.Incomplete();
    double values[2];
    int count = 0;
    CString sy;
    for (size_t i = 1; i < n; ++i) {
        std::string_view w = ctx.WordAt(i);
        // Words 2 and 3 are values when they hold a point; word 4 only while
        // fewer than two values were found. Any other word replaces the symbol.
        if (HasDot(w) && (i < 3 || count < 2)) {
            values[count++] = numconv::Atof(w);
        } else {
            sy = SymbolWord(ctx, i);
        }
    }
    // An absent reading is written as blanks and would come back as the
    // distance (an absent distance comes back as itself).
    if (count == 0 || IsUndef(values[0])) return ctx.Incomplete();
    return ctx.Store(new Reading(ctx.Word(0), values[0], count == 2 ? values[1] : UNDEF_VALUE, sy),
                     TypeCode<Reading>::value);
}

}  // namespace

void* ReadElement(ReadContext& ctx, ElementTag<CComment>) { return ReadText<CComment>(ctx); }
void* ReadElement(ReadContext& ctx, ElementTag<CCommand>) { return ReadText<CCommand>(ctx); }
void* ReadElement(ReadContext& ctx, ElementTag<CReference>) { return ReadObservation<CReference>(ctx); }
void* ReadElement(ReadContext& ctx, ElementTag<CMesure>) { return ReadObservation<CMesure>(ctx); }
void* ReadElement(ReadContext& ctx, ElementTag<CLectAR>) { return ReadLevelling<CLectAR>(ctx); }
void* ReadElement(ReadContext& ctx, ElementTag<CLectAV>) { return ReadLevelling<CLectAV>(ctx); }

void* ReadElement(ReadContext& ctx, ElementTag<CAppareil>) {
    if (ctx.WordCount() < 7) return ctx.Incomplete();
    std::string name;
    for (size_t i = 6; i < ctx.WordCount(); ++i) {
        if (i > 6) name += ' ';
        name += ctx.WordAt(i);
    }
    return ctx.Store(new CAppareil(CString(std::move(name)), ctx.Number(0), ctx.Number(1), ctx.Number(2),
                                   ctx.Number(3), ctx.Number(4), ctx.Number(5)),
                     TypeCode<CAppareil>::value);
}

void* ReadElement(ReadContext& ctx, ElementTag<CStation>) {
    const size_t n = ctx.WordCount();
    if (n < 2 || n > 4) return ctx.Incomplete();
    double v0 = n >= 3 ? ctx.Number(2) : UNDEF_VALUE;
    // The writer marks an absent orientation as -1: read it back as absent,
    // so a station saved without orientation loads as the same station.
    if (v0 == -1.0) v0 = UNDEF_VALUE;
    return ctx.Store(new CStation(ctx.Word(0), ctx.Number(1), v0, n == 4 ? SymbolWord(ctx, 3) : CString()),
                     TypeCode<CStation>::value);
}

void* ReadElement(ReadContext& ctx, ElementTag<CPointGen>) {
    const size_t n = ctx.WordCount();
    if (n < 2) return ctx.Incomplete();
    size_t next = 1;
    int lock = 0;
    if (ctx.WordAt(1).size() == 1) {
        lock = numconv::Atoi(std::string(ctx.WordAt(1)).c_str()) & 3;
        next = 2;
    }
    double coords[3];
    int count = 0;
    std::string symbol;
    for (size_t i = next; i < n; ++i) {
        std::string_view w = ctx.WordAt(i);
        if (count < 3 && IsCoordinate(w)) {
            coords[count++] = numconv::Atof(w);
        } else {
            if (!symbol.empty()) symbol += ' ';
            symbol += w;
        }
    }
    if (count == 0) {
        if (!(lock & 2)) return ctx.Incomplete();
        lock = 2;
    } else if (count == 1) {
        lock &= 2;
    }
    CString sy(std::move(symbol));
    carnet_line::UnmarkSpaces(sy);
    CPointGen* p = nullptr;
    switch (count) {
        case 0: p = new CPointGen(ctx.Word(0), UNDEF_VALUE, sy); break;
        case 1: p = new CPointGen(ctx.Word(0), coords[0], sy); break;
        case 2: p = new CPointGen(ctx.Word(0), coords[0], coords[1], sy); break;
        default: p = new CPointGen(ctx.Word(0), coords[0], coords[1], coords[2], sy); break;
    }
    p->m_bXConst = (lock & 1) ? 1 : 0;
    p->m_bZConst = (lock & 2) ? 1 : 0;
    return ctx.Store(p, TypeCode<CPointGen>::value);
}

void* ReadElement(ReadContext& ctx, ElementTag<CExcent>) {
    if (ctx.WordCount() != 1) return ctx.Incomplete();
    const CarnetElementType* row = CarnetTypeInfo(TypeCode<CExcent>::value);
    int kind = 0;
    while (kind < 2 && ctx.cut.keyword != row->keywords[kind]) ++kind;
    return ctx.Store(new CExcent(kind, ctx.Number(0)), TypeCode<CExcent>::value);
}

}  // namespace carnet_reader
