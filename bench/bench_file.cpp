// Loading and saving whole books, each beside the loop that marks the limit
// for the same bytes: reading them (getline), cutting and converting them
// (getline, split on blanks, numbers converted), and printing them (fprintf).
#include <benchmark/benchmark.h>

#include <charconv>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <stdexcept>
#include <string_view>
#include <vector>

#include "book.h"
#include "sizes.h"

namespace {

using bench::Book;
using bench::BookFile;

void Describe(benchmark::State& state, const BookFile& b) {
    state.SetItemsProcessed(state.iterations() * b.elements);
    state.SetBytesProcessed(state.iterations() * b.bytes);
    state.counters["elements"] = b.elements;
    state.counters["lines"] = static_cast<double>(b.lines);
}

std::FILE* Open(const std::string& path, const char* mode) {
    std::FILE* f = std::fopen(path.c_str(), mode);
    if (!f) throw std::runtime_error("cannot open " + path);
    return f;
}

// A file stream for writing with the buffer that Save gives its own, so
// that the writers are compared on the same kind of stream.
std::FILE* OpenForWriting(const std::string& path) {
    std::FILE* f = Open(path, "w");
    std::setvbuf(f, nullptr, _IOFBF, 1 << 16);
    return f;
}

void BM_Load(benchmark::State& state) {
    BookFile& b = Book(static_cast<int>(state.range(0)));
    const CString path(b.path);
    for (auto _ : state) {
        auto book = std::make_unique<CCarnet>();
        benchmark::DoNotOptimize(book->Load(nullptr, path, 0, nullptr));
        // Destroying the book is not part of loading it.
        state.PauseTiming();
        book.reset();
        state.ResumeTiming();
    }
    Describe(state, b);
}

// The limit of reading: every line fetched, nothing done with it.
void BM_LoadGetline(benchmark::State& state) {
    BookFile& b = Book(static_cast<int>(state.range(0)));
    for (auto _ : state) {
        std::FILE* f = Open(b.path, "r");
        char* buf = nullptr;
        size_t cap = 0;
        long long total = 0;
        for (ssize_t n; (n = getline(&buf, &cap, f)) > 0;) total += n;
        std::free(buf);
        std::fclose(f);
        benchmark::DoNotOptimize(total);
    }
    Describe(state, b);
}

// The least work any reader must do: every line fetched, cut into words at
// blanks, and every numeric word converted.
void BM_LoadMinimalParse(benchmark::State& state) {
    BookFile& b = Book(static_cast<int>(state.range(0)));
    std::vector<std::string_view> words;
    for (auto _ : state) {
        std::FILE* f = Open(b.path, "r");
        char* buf = nullptr;
        size_t cap = 0;
        double sum = 0.0;
        size_t count = 0;
        for (ssize_t n; (n = getline(&buf, &cap, f)) > 0;) {
            std::string_view line(buf, static_cast<size_t>(n));
            if (!line.empty() && line.back() == '\n') line.remove_suffix(1);
            words.clear();
            for (size_t i = 0; i < line.size();) {
                if (line[i] == ' ') {
                    ++i;
                    continue;
                }
                const size_t end = std::min(line.find(' ', i), line.size());
                words.push_back(line.substr(i, end - i));
                i = end;
            }
            for (std::string_view w : words) {
                const char c = w[0];
                if (c == '+') w.remove_prefix(1);
                if ((c >= '0' && c <= '9') || c == '-' || c == '.' || c == '+') {
                    double v = 0.0;
                    std::from_chars(w.data(), w.data() + w.size(), v);
                    sum += v;
                }
            }
            count += words.size();
        }
        std::free(buf);
        std::fclose(f);
        benchmark::DoNotOptimize(sum);
        benchmark::DoNotOptimize(count);
    }
    Describe(state, b);
}

void BM_Save(benchmark::State& state) {
    BookFile& b = Book(static_cast<int>(state.range(0)));
    const CString path(bench::TempPath("save-" + std::to_string(b.elements) + ".geo"));
    for (auto _ : state) benchmark::DoNotOptimize(b.book->Save(path, nullptr, false));
    Describe(state, b);
}

// The library's writer on an open stream, without the file replacement
// that Save adds around it.
void BM_Write(benchmark::State& state) {
    BookFile& b = Book(static_cast<int>(state.range(0)));
    const std::string path = bench::TempPath("write-" + std::to_string(b.elements) + ".geo");
    for (auto _ : state) {
        std::FILE* f = OpenForWriting(path);
        b.book->Write(f, 1);
        std::fclose(f);
    }
    Describe(state, b);
}

// The limit of writing: the same lines printed with fprintf into a file.
void BM_SaveFprintf(benchmark::State& state) {
    BookFile& b = Book(static_cast<int>(state.range(0)));
    const std::string path = bench::TempPath("fprintf-" + std::to_string(b.elements) + ".geo");
    for (auto _ : state) {
        std::FILE* f = OpenForWriting(path);
        bench::WriteWithFprintf(*b.book, b.optionLines, f);
        std::fclose(f);
    }
    Describe(state, b);
}

// Resident memory of a fresh process that loads the book: measured in a
// child of its own, so that nothing this run has allocated counts.
void BM_LoadMemory(benchmark::State& state) {
    BookFile& b = Book(static_cast<int>(state.range(0)));
    long long before = 0, peak = 0, after = 0, loaded = 0;
    for (auto _ : state) {
        const std::string command = "'" + bench::SelfPath() + "' --measure-load '" + b.path + "'";
        std::FILE* p = ::popen(command.c_str(), "r");
        if (!p || std::fscanf(p, "%lld %lld %lld %lld", &before, &peak, &after, &loaded) != 4) {
            if (p) ::pclose(p);
            state.SkipWithError("the measuring process failed");
            return;
        }
        ::pclose(p);
    }
    const double grown = static_cast<double>(peak - before) * 1024.0;
    state.counters["elements"] = b.elements;
    state.counters["loaded_elements"] = static_cast<double>(loaded);
    state.counters["file_bytes"] = static_cast<double>(b.bytes);
    state.counters["peak_bytes"] = grown;
    state.counters["peak_bytes_per_element"] = grown / b.elements;
    state.counters["peak_over_file"] = grown / static_cast<double>(b.bytes);
    state.counters["resident_over_file"] = static_cast<double>(after - before) * 1024.0 / static_cast<double>(b.bytes);
}

BENCHMARK(BM_Load)->Apply(bench::BookSizes)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_LoadGetline)->Apply(bench::BookSizes)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_LoadMinimalParse)->Apply(bench::BookSizes)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_Save)->Apply(bench::BookSizes)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_Write)->Apply(bench::BookSizes)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_SaveFprintf)->Apply(bench::BookSizes)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_LoadMemory)->Apply(bench::BookSizes)->Iterations(1)->Unit(benchmark::kMillisecond);

}  // namespace
