// Runs ours and the peers on each work, interleaved in random order and repeated (5 times unless
// told otherwise), then prints one row per work: the medians, the fastest peer and the ratio
// ours / fastest peer. Below 1.0 we are faster.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstring>
#include <map>
#include <string>
#include <vector>

#include "PeerBench.h"

namespace {

double Milliseconds(const benchmark::BenchmarkReporter::Run& run)
{
    const double seconds = run.GetAdjustedRealTime() / benchmark::GetTimeUnitMultiplier(run.time_unit);
    return seconds * 1e3;
}

class RatioReporter : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override
    {
        ConsoleReporter::ReportRuns(runs);
        for (const Run& run : runs) {
            // The median of the repetitions; a run of one repetition has no aggregates.
            const bool median = run.run_type == Run::RT_Aggregate && run.aggregate_name == "median";
            const bool single = run.run_type == Run::RT_Iteration && run.repetitions <= 1;
            if (!median && !single)
                continue;
            const std::string& name = run.run_name.function_name;
            const size_t slash = name.rfind('/');
            medians_[name.substr(0, slash)][name.substr(slash + 1)] = Milliseconds(run);
        }
    }

    void Finalize() override
    {
        ConsoleReporter::Finalize();
        std::printf(
            "\n| work | avpost ms | fastest peer | peer ms | ours/peer | all peers |\n|---|---|---|---|---|---|\n");
        for (const auto& [work, times] : medians_) {
            const auto ours = times.find(peers::kOurs);
            std::string best, others;
            double bestTime = 0.0;
            for (const auto& [by, ms] : times) {
                if (by == peers::kOurs)
                    continue;
                char entry[96];
                std::snprintf(entry, sizeof entry, "%s%s %.3f", others.empty() ? "" : ", ", by.c_str(), ms);
                others += entry;
                if (best.empty() || ms < bestTime) {
                    best = by;
                    bestTime = ms;
                }
            }
            if (best.empty())
                continue;
            if (ours == times.end()) {  // a floor, such as a plain copy of the same bytes
                std::printf("| %s | | %s | %.3f | | |\n", work.c_str(), best.c_str(), bestTime);
                continue;
            }
            std::printf("| %s | %.3f | %s | %.3f | %.2f | %s |\n", work.c_str(), ours->second, best.c_str(), bestTime,
                        ours->second / bestTime, others.c_str());
        }
    }

private:
    std::map<std::string, std::map<std::string, double>> medians_;
};

bool Given(int argc, char** argv, const char* flag)
{
    for (int i = 1; i < argc; ++i)
        if (std::strncmp(argv[i], flag, std::strlen(flag)) == 0)
            return true;
    return false;
}

}  // namespace

int main(int argc, char** argv)
{
    std::vector<char*> args(argv, argv + argc);
    std::string repetitions = "--benchmark_repetitions=5";
    std::string interleave = "--benchmark_enable_random_interleaving=true";
    std::string aggregates = "--benchmark_report_aggregates_only=true";
    if (!Given(argc, argv, "--benchmark_repetitions"))
        args.push_back(repetitions.data());
    if (!Given(argc, argv, "--benchmark_enable_random_interleaving"))
        args.push_back(interleave.data());
    if (!Given(argc, argv, "--benchmark_report_aggregates_only"))
        args.push_back(aggregates.data());
    int count = static_cast<int>(args.size());
    benchmark::Initialize(&count, args.data());
    if (benchmark::ReportUnrecognizedArguments(count, args.data()))
        return 1;
    RatioReporter reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    benchmark::Shutdown();
    return 0;
}
