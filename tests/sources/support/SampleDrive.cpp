#include "sources/support/SampleDrive.h"

#include <utility>

#include "sources/Metrics.h"
#include "sources/simulated/SimulatedDrive.h"
#include "tesk/Constants.h"

namespace qel::testing {
namespace {

constexpr std::uint64_t kSeed = 1;
constexpr std::uint64_t kStartMs = 1'700'000'000'000;
constexpr std::uint64_t kDurationMs = 600'000;

}  // namespace

std::vector<RecordedEvent> sampleDrive() {
  sources::SimulatedDrive drive(kSeed, kStartMs);
  std::vector<RecordedEvent> events;
  // A viewer asks for the SIM files as soon as it is up.
  sources::SourceAnswer sim = drive.query(metric::kSimFiles);
  events.push_back({sim.timeMs, RecordedKind::metric, std::move(sim.entries)});
  while (auto event = drive.next()) {
    if (event->timeMs >= kStartMs + kDurationMs) break;
    const auto kind =
        event->stream == tesk::kEventMetric ? RecordedKind::metric : RecordedKind::trigger;
    events.push_back({event->timeMs, kind, std::move(event->entries)});
  }
  return events;
}

}  // namespace qel::testing
