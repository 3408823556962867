#ifndef PLOTAID_BENCH_BENCHSUPPORT_H
#define PLOTAID_BENCH_BENCHSUPPORT_H

// What every benchmark program shares: each operation is judged against a floor measured in the
// same run, by the best CPU time of its repetitions.

#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstdio>
#include <map>
#include <string>
#include <vector>

namespace bench {

// Keeps the best CPU time per iteration of each benchmark ("name" or "name/args") while the console
// shows everything as usual. CPU time, because the machine is shared and time spent descheduled is
// nobody's cost here.
class BestTimes : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) {
            if (run.run_type != Run::RT_Iteration || run.error_occurred || run.iterations == 0)
                continue;
            const double perIteration = run.cpu_accumulated_time / static_cast<double>(run.iterations);
            const std::string name =
                run.run_name.function_name + (run.run_name.args.empty() ? "" : "/" + run.run_name.args);
            auto [it, inserted] = times.emplace(name, perIteration);
            if (!inserted)
                it->second = std::min(it->second, perIteration);
            const double wall = run.real_accumulated_time / static_cast<double>(run.iterations);
            auto [at, fresh] = wallTimes.emplace(name, wall);
            if (!fresh)
                at->second = std::min(at->second, wall);
        }
        ConsoleReporter::ReportRuns(runs);
    }

    // Seconds per iteration, or 0 when the benchmark did not run (filtered out or failed).
    double best(const std::string& name) const {
        const auto it = times.find(name);
        return it == times.end() ? 0.0 : it->second;
    }

    std::map<std::string, double> times;
    // The same by wall-clock time, for work spread over threads of its own.
    std::map<std::string, double> wallTimes;
};

// Initialises Google Benchmark with random interleaving of repetitions (the caller's own flags come
// later and win); false when the command line holds flags it does not know.
inline bool initialize(int argc, char** argv) {
    std::vector<char*> args(argv, argv + argc);
    char interleave[] = "--benchmark_enable_random_interleaving=true";
    args.insert(args.begin() + 1, interleave);
    int count = static_cast<int>(args.size());
    benchmark::Initialize(&count, args.data());
    return !benchmark::ReportUnrecognizedArguments(count, args.data());
}

// Prints an operation beside its floor and says whether the ratio stays within the limit (a limit
// of 0 only reports). With megabytes, throughput is printed too. True when either did not run.
inline bool within(const BestTimes& times, const std::string& measured, const std::string& floor,
                   double limit, double megabytes = 0, bool wall = false) {
    const auto best = [&](const std::string& name) {
        const auto it = times.wallTimes.find(name);
        return !wall ? times.best(name) : it == times.wallTimes.end() ? 0.0 : it->second;
    };
    const double m = best(measured);
    const double f = best(floor);
    if (m <= 0 || f <= 0)
        return true;
    const double ratio = m / f;
    const bool tooSlow = limit > 0 && ratio > limit;
    std::printf("%-32s %12.3f us", measured.c_str(), m * 1e6);
    if (megabytes > 0)
        std::printf(" %8.1f MB/s", megabytes / m);
    std::printf("  vs %-24s %12.3f us", floor.c_str(), f * 1e6);
    if (megabytes > 0)
        std::printf(" %8.1f MB/s", megabytes / f);
    std::printf("  ratio %.3f", ratio);
    if (limit > 0)
        std::printf(" (limit %.2f)", limit);
    std::printf("%s\n", tooSlow ? "  TOO SLOW" : "");
    return !tooSlow;
}

} // namespace bench

#endif
