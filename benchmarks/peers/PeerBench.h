#ifndef AVPOST_BENCHMARKS_PEERS_PEERBENCH_H
#define AVPOST_BENCHMARKS_PEERS_PEERBENCH_H

#include <benchmark/benchmark.h>

#include <functional>
#include <string>

// The side-by-side benchmark: every work is registered once per library that does it, as
// "<work>/<by>" with `by` = kOurs or the peer's name. All ways of one work get identical input.
// The run interleaves and repeats them and ends with a table of medians and the ratio of ours to
// the fastest peer (PeerMain.cpp).
namespace peers {

inline constexpr const char* kOurs = "avpost";

inline void AddWork(const std::string& work, const std::string& by, std::function<void(benchmark::State&)> body)
{
    benchmark::RegisterBenchmark((work + "/" + by).c_str(), std::move(body))->Unit(benchmark::kMillisecond);
}

}  // namespace peers

#endif
