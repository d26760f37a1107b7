// Time and allocations of each work, for one payload. Takes --recording FILE and the options of
// Google Benchmark.

#include <benchmark/benchmark.h>

#include <string>
#include <vector>

#include "AllocationCounter.h"
#include "Mixes.h"
#include "Report.h"
#include "Works.h"
#include "base/LogSink.h"
#include "peers/PeerWorks.h"

namespace qel::bench {
namespace {

void measure(benchmark::State& state, const Work& work) {
  const auto step = work.prepare(*work.payloads);
  const std::size_t count = work.payloads->size();
  for (std::size_t i = 0; i < count; ++i) step(i);
  std::uint64_t allocated = 0;
  for (auto _ : state) {
    const std::uint64_t before = allocations();
    for (std::size_t i = 0; i < count; ++i) step(i);
    allocated += allocations() - before;
  }
  const auto pieces = static_cast<double>(work.pieces);
  state.counters["payloads"] = pieces;
  state.counters["allocations"] =
      static_cast<double>(allocated) / (static_cast<double>(state.iterations()) * pieces);
}

}  // namespace
}  // namespace qel::bench

int main(int argc, char** argv) {
  qel::setSystemLog(nullptr);
  std::vector<char*> given(argv, argv + argc);
  const auto mixes = qel::bench::takeMixes(given);
  qel::bench::checkPeers(mixes);
  std::vector<std::string> names;
  for (const auto& work : qel::bench::works(mixes)) {
    names.push_back(work.group + '|' + std::string(work.who) + '|' + std::string(work.mix));
    benchmark::RegisterBenchmark(names.back().c_str(), qel::bench::measure, work);
  }
  // Short repetitions by turns, so that what else the machine does falls on all alike.
  std::string repetitions = "--benchmark_repetitions=7";
  std::string time = "--benchmark_min_time=0.05";
  std::string turns = "--benchmark_enable_random_interleaving=true";
  std::vector<char*> arguments{argv[0], repetitions.data(), time.data(), turns.data()};
  arguments.insert(arguments.end(), given.begin() + 1, given.end());
  auto count = static_cast<int>(arguments.size());
  benchmark::Initialize(&count, arguments.data());
  if (benchmark::ReportUnrecognizedArguments(count, arguments.data())) return 1;
  qel::bench::Report report(names);
  benchmark::RunSpecifiedBenchmarks(&report);
}
