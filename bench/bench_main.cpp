#include "bench_main.h"

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <cstdio>
#include <map>
#include <set>
#include <string>
#include <vector>

namespace ulk_bench {
namespace {

struct Line {
    std::string label;
    std::string numerator;
    std::string denominator;  // empty: a time, not a ratio
    Goal goal;
    double limit;
};

std::vector<Line>& Lines() {
    static std::vector<Line> lines;
    return lines;
}

// The console output as usual, keeping each benchmark's real time per
// iteration: the median when repetitions were asked for, else the run itself.
class RecordingReporter : public benchmark::ConsoleReporter {
  public:
    explicit RecordingReporter(OutputOptions options) : ConsoleReporter(options) {}

    void ReportRuns(const std::vector<Run>& runs) override {
        for (const Run& run : runs) {
            if (run.error_occurred || run.iterations <= 0) continue;
            const std::string name = run.run_name.str();
            const bool median = run.run_type == Run::RT_Aggregate && run.aggregate_name == "median";
            if (run.run_type == Run::RT_Aggregate && !median) continue;
            if (median) mMedians.insert(name);
            if (median || !mMedians.count(name))
                mSeconds[name] = run.real_accumulated_time / static_cast<double>(run.iterations);
        }
        ConsoleReporter::ReportRuns(runs);
    }

    bool Seconds(const std::string& name, double* seconds) const {
        auto found = mSeconds.find(name);
        if (found == mSeconds.end()) return false;
        *seconds = found->second;
        return true;
    }

  private:
    std::map<std::string, double> mSeconds;
    std::set<std::string> mMedians;
};

std::string TimeText(double seconds) {
    char text[32];
    if (seconds < 1e-6)
        std::snprintf(text, sizeof text, "%.1f ns", seconds * 1e9);
    else if (seconds < 1e-3)
        std::snprintf(text, sizeof text, "%.2f us", seconds * 1e6);
    else
        std::snprintf(text, sizeof text, "%.2f ms", seconds * 1e3);
    return text;
}

std::string GoalText(Goal goal, double value, double limit, const char* unit) {
    if (goal == Goal::kNone) return "";
    const bool met = goal == Goal::kAtMost ? value <= limit : value >= limit;
    char text[96];
    std::snprintf(text, sizeof text, "  [goal: %s %g%s: %s]",
                  goal == Goal::kAtMost ? "at most" : "at least", limit, unit,
                  met ? "met" : "NOT met");
    return text;
}

void PrintLines(const RecordingReporter& reporter) {
    if (!Lines().empty()) std::printf("\n");
    for (const Line& line : Lines()) {
        double a = 0.0, b = 0.0;
        if (!reporter.Seconds(line.numerator, &a) ||
            (!line.denominator.empty() && !reporter.Seconds(line.denominator, &b)) ||
            (!line.denominator.empty() && b <= 0.0)) {
            std::printf("%-7s%s: not measured in this run\n",
                        line.denominator.empty() ? "time" : "ratio", line.label.c_str());
            continue;
        }
        if (line.denominator.empty()) {
            std::printf("time   %s: %s%s\n", line.label.c_str(), TimeText(a).c_str(),
                        GoalText(line.goal, a * 1e9, line.limit, " ns").c_str());
        } else {
            std::printf("ratio  %s: %.3f (%s / %s)%s\n", line.label.c_str(), a / b,
                        TimeText(a).c_str(), TimeText(b).c_str(),
                        GoalText(line.goal, a / b, line.limit, "").c_str());
        }
    }
    std::fflush(stdout);
}

}  // namespace

bool AddRatio(const char* label, const char* numerator, const char* denominator, Goal goal,
              double limit) {
    Lines().push_back({label, numerator, denominator, goal, limit});
    return true;
}

bool AddTime(const char* label, const char* benchmark, Goal goal, double limitNs) {
    Lines().push_back({label, benchmark, "", goal, limitNs});
    return true;
}

}  // namespace ulk_bench

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
    ulk_bench::RecordingReporter reporter(isatty(STDOUT_FILENO)
                                              ? benchmark::ConsoleReporter::OO_Color
                                              : benchmark::ConsoleReporter::OO_None);
    benchmark::RunSpecifiedBenchmarks(&reporter);
    ulk_bench::PrintLines(reporter);
    benchmark::Shutdown();
    return 0;
}
