// Lookups over whole books, and the point-number, selection and code-table
// members on the texts a user types.
#include <benchmark/benchmark.h>

#include <string>
#include <utility>
#include <vector>

#include <carnet/ccarnet.h>
#include <carnet/code.h>
#include <carnet/drawing.h>
#include <carnet/reference.h>
#include <carnet/selmatch.h>

#include "book.h"
#include "sizes.h"

namespace {

using bench::Book;

constexpr unsigned int kStation = 1001;
constexpr unsigned int kMesure = 1003;
constexpr unsigned int kPoint = 1006;

// Index of the last (or first) element of a type.
int LastOf(CCarnet& book, unsigned int type) {
    for (int i = book.length() - 1; i >= 0; --i)
        if (book.typAt(i) == type) return i;
    return -1;
}
int FirstOf(CCarnet& book, unsigned int type) {
    for (int i = 0; i < book.length(); ++i)
        if (book.typAt(i) == type) return i;
    return -1;
}

// Elements visited per second: the cost of one element is its inverse.
void Visited(benchmark::State& state, long long perIteration) {
    state.SetItemsProcessed(state.iterations() * perIteration);
    state.counters["visited"] = static_cast<double>(perIteration);
}

// Forwards over the whole book to the last measure, comparing the number of
// every measure on the way (most have the same length as the one sought).
void BM_FindForward(benchmark::State& state) {
    CCarnet& book = *Book(static_cast<int>(state.range(0))).book;
    const int target = LastOf(book, kMesure);
    const CString np = book.matAt(target);
    for (auto _ : state) benchmark::DoNotOptimize(book.Find(kMesure, np, 0, 0));
    if (book.Find(kMesure, np, 0, 0) != target) state.SkipWithError("the last measure was not found");
    Visited(state, target + 1);
}

// The limit of a lookup: the length of the number of every measure read, in
// book order, with nothing compared. A large book does not fit in the
// caches, so this is the cost of fetching the elements from memory.
void BM_TouchMeasures(benchmark::State& state) {
    CCarnet& book = *Book(static_cast<int>(state.range(0))).book;
    const int count = book.length();
    for (auto _ : state) {
        long long sum = 0;
        for (int i = 0; i < count; ++i)
            if (book.typAt(i) == kMesure) sum += static_cast<const CMesure*>(book.ptrAt(i))->Np().GetLength();
        benchmark::DoNotOptimize(sum);
    }
    Visited(state, count);
}

// Backwards from the end to the first measure.
void BM_FindBackward(benchmark::State& state) {
    CCarnet& book = *Book(static_cast<int>(state.range(0))).book;
    const int target = FirstOf(book, kMesure);
    const CString np = book.matAt(target);
    const int last = book.length() - 1;
    for (auto _ : state) benchmark::DoNotOptimize(book.Find(kMesure, np, last, -1));
    if (book.Find(kMesure, np, last, -1) != target) state.SkipWithError("the first measure was not found");
    Visited(state, last - target + 1);
}

// The last point of the book by its number.
void BM_HasPnt(benchmark::State& state) {
    CCarnet& book = *Book(static_cast<int>(state.range(0))).book;
    const int target = LastOf(book, kPoint);
    const CString np = book.matAt(target);
    for (auto _ : state) benchmark::DoNotOptimize(book.hasPnt(np));
    if (book.hasPnt(np) != target) state.SkipWithError("the last point was not found");
    Visited(state, target + 1);
}

// The repetition of every station of the book: each call looks back over
// the whole book before it, so the whole loop grows with the square of the
// size and only the smaller books are measured.
void BM_FindRepAtEveryStation(benchmark::State& state) {
    CCarnet& book = *Book(static_cast<int>(state.range(0))).book;
    std::vector<int> stations;
    for (int i = 0; i < book.length(); ++i)
        if (book.typAt(i) == kStation) stations.push_back(i);
    CString np;
    for (auto _ : state) {
        long long sum = 0;
        for (int i : stations) sum += book.findRepAt(i, np);
        benchmark::DoNotOptimize(sum);
    }
    state.SetItemsProcessed(state.iterations() * static_cast<long long>(stations.size()));
    state.counters["stations"] = static_cast<double>(stations.size());
}

// The last point number used by points, and by any element.
void BM_LastMatPoints(benchmark::State& state) {
    CCarnet& book = *Book(static_cast<int>(state.range(0))).book;
    for (auto _ : state) benchmark::DoNotOptimize(book.lastMat(kPoint));
    Visited(state, book.length());
}

void BM_LastMatAny(benchmark::State& state) {
    CCarnet& book = *Book(static_cast<int>(state.range(0))).book;
    for (auto _ : state) benchmark::DoNotOptimize(book.lastMat(999));
    Visited(state, book.length());
}

// Point numbers tested against the selections a user types.
void BM_IsPointInSel(benchmark::State& state) {
    const std::vector<std::pair<CString, CString>> cases = {
        {"P12", "P1-P20"},          {"P25", "P1-P20;P30-P40"}, {"A.7", "1-5;8;10-12;A.*"},
        {"1234", "1000-2000"},      {"B.3", "B.1-B.9"},        {"S4", "S1;S2;S3;S4"},
        {"P7", "*"},                {"1500", "1-999;2000-3000"},
    };
    for (auto _ : state)
        for (const auto& c : cases) benchmark::DoNotOptimize(CCarnet::IsPointInSel(c.first, c.second));
    state.SetItemsProcessed(state.iterations() * static_cast<long long>(cases.size()));
}

// A selection of `groups` groups (ranges of measure numbers and single point
// numbers, most of them naming nothing of the book) matched against every
// element of the 100 000-element book, as the tool's select does: once read
// by the matcher, and group by group through IsPointInSel.
CString SelectionOf(int groups) {
    std::string sel;
    for (int g = 0; g < groups; ++g) {
        if (!sel.empty()) sel += ';';
        const int at = 1000 + g * 997;
        sel += g % 2 ? std::to_string(at) + "-" + std::to_string(at + 40) : "P" + std::to_string(at);
    }
    return CString(sel);
}

template <bool kMatcher>
void SelectBook(benchmark::State& state) {
    CCarnet& book = *Book(100000).book;
    const CString sel = SelectionOf(static_cast<int>(state.range(0)));
    std::vector<CString> names;
    for (int i = 0; i < book.length(); ++i) names.push_back(book.matAt(i));
    for (auto _ : state) {
        CSelMatcher matcher(sel);
        int matched = 0;
        for (const CString& np : names) matched += kMatcher ? matcher.Contains(np) : CCarnet::IsPointInSel(np, sel);
        benchmark::DoNotOptimize(matched);
    }
    Visited(state, book.length());
}
void BM_SelectMatcher(benchmark::State& state) { SelectBook<true>(state); }
void BM_SelectIsPointInSel(benchmark::State& state) { SelectBook<false>(state); }

// Typed point numbers normalised, and point numbers built from their parts.
void BM_FormMatNormalise(benchmark::State& state) {
    const std::vector<CString> typed = {"P 12", "P-12", "P007", "A.007", "A.12", "A.1.2", "A.B12", "1234", "A.*", "S12"};
    for (auto _ : state) {
        for (const CString& t : typed) {
            CString np = t;
            CCarnet::formMat(np);
            benchmark::DoNotOptimize(np);
        }
    }
    state.SetItemsProcessed(state.iterations() * static_cast<long long>(typed.size()));
}

void BM_FormMatBuild(benchmark::State& state) {
    const CString radicals[] = {"P", "A", "", "S"};
    CString out;
    for (auto _ : state) {
        for (int i = 0; i < 16; ++i) {
            int dotted = i & 1;
            CCarnet::formMat(radicals[i & 3], 100 + i, dotted, out);
            benchmark::DoNotOptimize(out);
        }
    }
    state.SetItemsProcessed(state.iterations() * 16);
}

// Code-table lines of the usual kinds, in the current format.
void BM_InitCode(benchmark::State& state) {
    const char* const lines[] = {
        "ARB;9;Arbre",
        "C;16;T;1;A;2;3;7;B;G3a;20;G3b;9;2;1.5;2.25;-3",
        "C;48;T;0;A;0;0;0;;G4a;12;10;G4c;6;2",
        "C;54;T;1;A;0;0;0;;G5a;6;7;1.5;G5b;8;2.25;-3.125;G5c",
    };
    CCode code;
    for (auto _ : state)
        for (const char* l : lines) benchmark::DoNotOptimize(code.initCode(l, CCode::CurrentVersion));
    state.SetItemsProcessed(state.iterations() * 4);
}

// Typed code strings turned into drawing commands, with the sign mode and
// with a separator, numbers carrying two implied decimals.
void BM_Interprete(benchmark::State& state) {
    const char* const kSign = "\xB1";
    CCode two;
    two.m_Decimals = 2;
    CSymSansOri sym;
    CSymCirCenRay circle;
    CLiaison link;
    CEscalier4 stairs;
    CCer1PtR ring;
    CPointSansOri point;
    for (auto _ : state) {
        benchmark::DoNotOptimize(sym.Interprete("ARB+150-075", kSign, &two));
        benchmark::DoNotOptimize(circle.Interprete("SCR/250", "/", &two));
        benchmark::DoNotOptimize(link.Interprete("LI+035", kSign, &two));
        benchmark::DoNotOptimize(stairs.Interprete("E4+L5+12+80", kSign, &two));
        benchmark::DoNotOptimize(ring.Interprete("CER/L12/250", "/", &two));
        benchmark::DoNotOptimize(point.Interprete("P1+X", kSign));
    }
    state.SetItemsProcessed(state.iterations() * 6);
}

BENCHMARK(BM_FindForward)->Apply(bench::BookSizes)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_TouchMeasures)->Apply(bench::BookSizes)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_FindBackward)->Apply(bench::BookSizes)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_HasPnt)->Apply(bench::BookSizes)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_FindRepAtEveryStation)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_LastMatPoints)->Apply(bench::BookSizes)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_LastMatAny)->Apply(bench::BookSizes)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_IsPointInSel);
BENCHMARK(BM_SelectMatcher)->Arg(10)->Arg(100)->Arg(1000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_SelectIsPointInSel)->Arg(10)->Arg(100)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_FormMatNormalise);
BENCHMARK(BM_FormMatBuild);
BENCHMARK(BM_InitCode);
BENCHMARK(BM_Interprete);

}  // namespace
