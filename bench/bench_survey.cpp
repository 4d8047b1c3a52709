// The computation of a whole book, beside loading it (bench_file.cpp): both
// walk every element once, and the computation must stay within a few
// times the load.
#include <benchmark/benchmark.h>

#include <carnet/survey/compute.h>

#include "book.h"
#include "sizes.h"

namespace {

void BM_Compute(benchmark::State& state) {
    bench::BookFile& b = bench::Book(static_cast<int>(state.range(0)));
    size_t shots = 0, leftOut = 0;
    for (auto _ : state) {
        const carnet::survey::Computation c = carnet::survey::Compute(*b.book);
        shots = c.shots.size();
        leftOut = c.leftOut.size();
        benchmark::DoNotOptimize(c.points.data());
    }
    state.SetItemsProcessed(state.iterations() * b.elements);
    state.counters["shots"] = static_cast<double>(shots);
    state.counters["left_out"] = static_cast<double>(leftOut);
}

}  // namespace

BENCHMARK(BM_Compute)->Apply(bench::BookSizes)->Unit(benchmark::kMillisecond);
