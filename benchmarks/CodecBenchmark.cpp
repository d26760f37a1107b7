// Time and allocations of each work, for one payload.

#include <benchmark/benchmark.h>

#include <string>

#include "AllocationCounter.h"
#include "Works.h"
#include "base/LogSink.h"

namespace qel::bench {
namespace {

void measure(benchmark::State& state, const Work& work) {
  const auto step = work.prepare();
  for (std::size_t i = 0; i < kPayloads; ++i) step(i);
  std::uint64_t allocated = 0;
  for (auto _ : state) {
    const std::uint64_t before = allocations();
    for (std::size_t i = 0; i < kPayloads; ++i) step(i);
    allocated += allocations() - before;
  }
  const double total = static_cast<double>(state.iterations()) * double{kPayloads};
  state.counters["allocations"] = static_cast<double>(allocated) / total;
  state.counters["each"] =
      benchmark::Counter(total, benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

}  // namespace
}  // namespace qel::bench

int main(int argc, char** argv) {
  qel::setSystemLog(nullptr);
  for (const auto& work : qel::bench::works()) {
    const std::string name = std::string(work.group) + " (" + std::string(work.who) + ")";
    benchmark::RegisterBenchmark(name.c_str(), qel::bench::measure, work);
  }
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
}
