// The tool as a user runs it: `carnet check` on the generated book of a
// million elements, a whole process, beside a plain C program that reads the
// same file with getline, cuts every line at blanks and converts every word
// with strtod (bench/cloop). Wall-clock time is what a user waits; the CPU
// time and the peak resident size of each child come from wait4, in a fresh
// process started as `carnet_bench --run-child PROGRAM ARGS...`.
#include <benchmark/benchmark.h>

#include <fcntl.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>

#include <chrono>
#include <cstdio>
#include <string>

#include "book.h"
#include "sizes.h"

extern char** environ;

namespace {

double Seconds(const struct timeval& t) { return static_cast<double>(t.tv_sec) + static_cast<double>(t.tv_usec) / 1e6; }

void Measure(benchmark::State& state, const char* program, const std::string& args) {
    const bench::BookFile& b = bench::Book(1000000);
    // Started from a fresh, small process: a child of this one would count
    // this one's memory in its peak until it runs its own program.
    const std::string command = "'" + bench::SelfPath() + "' --run-child '" + program + "' " + args + " '" + b.path + "'";
    double wall = 0, cpu = 0, peak = 0;
    for (auto _ : state) {
        std::FILE* p = ::popen(command.c_str(), "r");
        const bool read = p && std::fscanf(p, "%lf %lf %lf", &wall, &cpu, &peak) == 3;
        if (p) ::pclose(p);
        if (!read) {
            state.SkipWithError((std::string(program) + " failed").c_str());
            return;
        }
        state.SetIterationTime(wall);
    }
    state.counters["child_cpu_s"] = cpu;
    state.counters["peak_over_file"] = peak / static_cast<double>(b.bytes);
    state.counters["lines"] = static_cast<double>(b.lines);
}

void BM_ToolCheck(benchmark::State& state) {
    if (!*CARNET_TOOL_PATH) {
        state.SkipWithError("the tool is not built (CARNET_BUILD_TOOL=OFF)");
        return;
    }
    Measure(state, CARNET_TOOL_PATH, "check");
}
void BM_CLoopCheck(benchmark::State& state) { Measure(state, CARNET_CLOOP_PATH, ""); }

// One run each, five times: the medians are compared.
BENCHMARK(BM_ToolCheck)->Iterations(1)->Repetitions(5)->UseManualTime()->Unit(benchmark::kMillisecond);
BENCHMARK(BM_CLoopCheck)->Iterations(1)->Repetitions(5)->UseManualTime()->Unit(benchmark::kMillisecond);

}  // namespace

int bench::RunChild(char** argv) {
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, 1, "/dev/null", O_WRONLY, 0);
    posix_spawn_file_actions_addopen(&actions, 2, "/dev/null", O_WRONLY, 0);
    pid_t pid = 0;
    const auto start = std::chrono::steady_clock::now();
    const int spawned = posix_spawn(&pid, argv[0], &actions, nullptr, argv, environ);
    posix_spawn_file_actions_destroy(&actions);
    int status = 0;
    struct rusage usage {};
    if (spawned != 0 || ::wait4(pid, &status, 0, &usage) != pid || !WIFEXITED(status) || WEXITSTATUS(status) != 0)
        return 1;
    const double wall = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    std::printf("%.6f %.6f %.0f\n", wall, Seconds(usage.ru_utime) + Seconds(usage.ru_stime),
                static_cast<double>(usage.ru_maxrss) * 1024.0);
    return 0;
}
