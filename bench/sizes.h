// The book sizes every size-dependent benchmark runs on, and the pieces of
// the benchmark program that the measurements share.
#pragma once

#include <string>

#include <benchmark/benchmark.h>

namespace bench {

// 10 thousand, 100 thousand and 1 million elements.
inline void BookSizes(benchmark::internal::Benchmark* b) {
    for (int n : {10000, 100000, 1000000}) b->Arg(n);
}

// The path of this program, to start it again as a measuring child.
std::string SelfPath();

// Runs argv[0] with its arguments, its output thrown away, and prints its
// wall-clock and CPU seconds and its peak resident bytes; 1 when it failed.
int RunChild(char** argv);

}  // namespace bench
