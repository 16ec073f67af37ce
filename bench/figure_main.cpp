// The main() of every benchmark program: runs the benchmarks as usual, then prints one figure per
// benchmark as "NAME VALUE UNIT". A benchmark that sets a counter of its own name reports that
// counter ("..._factor" and "..._speedup" in x, "..._frames" in frames, other names bare), and
// one that measures several things reports each counter named "..._ms" or "..._mb"; one
// named "..._ns" reports nanoseconds, "..._us" microseconds; any other its own time unit.
#include <benchmark/benchmark.h>

#include <QCoreApplication>

#include <cmath>
#include <cstdio>
#include <string>
#include <vector>

namespace {

struct Figure {
    std::string name;
    double value;
    std::string unit;
};

bool EndsWith(const std::string& name, const std::string& suffix) {
    return name.size() > suffix.size() &&
           name.compare(name.size() - suffix.size(), suffix.size(), suffix) == 0;
}

std::string CounterUnit(const std::string& name) {
    if (EndsWith(name, "_factor") || EndsWith(name, "_speedup")) return "x";
    if (EndsWith(name, "_frames")) return "frames";
    if (EndsWith(name, "_ms")) return "ms";
    if (EndsWith(name, "_mb")) return "MB";
    return "count";
}

class FigureReporter : public benchmark::ConsoleReporter {
  public:
    // Tables without colour codes, so the figures can be read by scripts.
    FigureReporter() : ConsoleReporter(OO_Tabular) {}
    void ReportRuns(const std::vector<Run>& runs) override {
        ConsoleReporter::ReportRuns(runs);
        for (const Run& run : runs) {
            if (run.error_occurred || run.run_type != Run::RT_Iteration) continue;
            // The bare function name: no "/iterations:3" and the like.
            const std::string name = run.run_name.function_name;
            if (const auto counter = run.counters.find(name); counter != run.counters.end()) {
                figures_.push_back({name, counter->second.value, CounterUnit(name)});
                continue;
            }
            // A benchmark that measures several things names each figure by a counter.
            bool reported = false;
            for (const auto& [counterName, counter] : run.counters) {
                if (EndsWith(counterName, "_ms") || EndsWith(counterName, "_mb")) {
                    figures_.push_back({counterName, counter.value, CounterUnit(counterName)});
                    reported = true;
                }
            }
            if (reported) continue;
            std::string unit = benchmark::GetTimeUnitString(run.time_unit);
            double value = run.GetAdjustedRealTime();
            if (name.size() > 3 && name.compare(name.size() - 3, 3, "_ns") == 0) {
                value *= benchmark::GetTimeUnitMultiplier(benchmark::kNanosecond) /
                         benchmark::GetTimeUnitMultiplier(run.time_unit);
                unit = "ns";
            } else if (name.size() > 3 && name.compare(name.size() - 3, 3, "_us") == 0) {
                value *= benchmark::GetTimeUnitMultiplier(benchmark::kMicrosecond) /
                         benchmark::GetTimeUnitMultiplier(run.time_unit);
                unit = "us";
            }
            figures_.push_back({name, value, unit});
        }
    }
    void Finalize() override {
        ConsoleReporter::Finalize();
        for (const Figure& figure : figures_) {
            const double rounded = figure.value >= 100 ? std::round(figure.value)
                                                       : std::round(figure.value * 100) / 100;
            std::printf("%s %g %s\n", figure.name.c_str(), rounded, figure.unit.c_str());
        }
        std::fflush(stdout);
    }

  private:
    std::vector<Figure> figures_;
};

}  // namespace

int main(int argc, char** argv) {
    QCoreApplication app(argc, argv);
    benchmark::Initialize(&argc, argv);
    FigureReporter reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    return 0;
}
