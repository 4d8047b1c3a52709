// The benchmark program. Started as `carnet_bench --measure-load FILE` it is
// the child of the memory benchmark instead: it loads the file and prints
// its resident size before the load, its peak and its size after it (KiB),
// and the number of elements loaded. `carnet_bench --run-child PROGRAM ...`
// runs a program for the process benchmarks (bench_tool.cpp).
// `carnet_bench --write-book N FILE`
// writes the generated book of N elements, for a profiler to load.
#include <benchmark/benchmark.h>

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <string>

#include <carnet/ccarnet.h>

#include "book.h"
#include "check.h"
#include "sizes.h"

namespace {

long long StatusKiB(const char* field) {
    std::ifstream in("/proc/self/status");
    const std::string tag = std::string(field) + ":";
    for (std::string word; in >> word;) {
        long long v = 0;
        if (word == tag && in >> v) return v;
    }
    return -1;
}

int MeasureLoad(const char* path) {
    // Forget the peak of the start-up so that only the load can set it.
    if (std::FILE* f = std::fopen("/proc/self/clear_refs", "w")) {
        std::fputs("5", f);
        std::fclose(f);
    }
    const long long before = StatusKiB("VmRSS");
    CCarnet book;
    book.Load(nullptr, CString(path), 0, nullptr);
    std::printf("%lld %lld %lld %d\n", before, StatusKiB("VmHWM"), StatusKiB("VmRSS"), book.length());
    return 0;
}

}  // namespace

std::string bench::SelfPath() {
    std::string path(4096, '\0');
    const ssize_t n = ::readlink("/proc/self/exe", &path[0], path.size());
    path.resize(n > 0 ? static_cast<size_t>(n) : 0);
    return path;
}

int main(int argc, char** argv) {
    if (argc == 3 && std::strcmp(argv[1], "--measure-load") == 0) return MeasureLoad(argv[2]);
    if (argc >= 3 && std::strcmp(argv[1], "--run-child") == 0) return bench::RunChild(argv + 2);
    if (argc == 4 && std::strcmp(argv[1], "--write-book") == 0) {
        CCarnet book;
        bench::GenerateBook(book, std::atoi(argv[2]));
        bench::WriteFile(argv[3], bench::ToMemory([&](std::FILE* f) { book.Write(f, 1); }));
        return 0;
    }
    if (!bench::CheckLookups()) return 1;
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
