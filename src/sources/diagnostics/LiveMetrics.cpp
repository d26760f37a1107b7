#include "sources/diagnostics/LiveMetrics.h"

#include <algorithm>
#include <array>
#include <utility>
#include <vector>

#include "messages/catalogue/KBBMetricUtility.h"
#include "sources/Metrics.h"
#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {
namespace {

using sources::MetricKeeper;

// They change with every measurement.
constexpr std::array kLevels = {
    metric::kLteServingMeasurement, metric::kLteRsrpRsrqSinr, metric::kLteNeighbours,
    metric::kLteInterRat,           metric::kLteTxPower,      metric::kUmtsServingMeasurement,
    metric::kUmtsNeighbours,        metric::kUmtsTxPower,     metric::kGsmIdleMeasurement,
    metric::kGsmCallMeasurement,    metric::kGsmNeighbours,
};
// When a signal and when a neighbour have just become old.
constexpr std::array kOldAfter = {std::chrono::milliseconds{10'001},
                                  std::chrono::milliseconds{30'001}};
constexpr unsigned kLevelsPerSecond = 1;
constexpr unsigned kMostPerSecond = 20;  // of a modem that says the opposite all the time

std::vector<MetricKeeper::Row> keptRows() {
  std::vector<MetricKeeper::Row> rows;
  for (const MetricName& name : KBBMetricUtility::catalogue()) {
    if (findReport(name.identifier) == nullptr) continue;
    const bool isLevel = std::ranges::count(kLevels, name.identifier) != 0;
    rows.push_back({name.identifier, isLevel ? kLevelsPerSecond : kMostPerSecond});
  }
  return rows;
}

}  // namespace

LiveMetrics::LiveMetrics(unsigned radio, std::chrono::milliseconds period, Send send)
    : _send(std::move(send)),
      _build([this](std::uint32_t metric, std::uint64_t timeMs) {
        return _reader.report(metric, timeMs);
      }),
      _keeper(keptRows(), period),
      _reader(radio) {}

void LiveMetrics::atTime(Clock::time_point now, std::uint64_t wallMs) {
  _now = now;
  _wallMs = wallMs;
}

void LiveMetrics::log(const LogPacket& packet) { take(packet); }

void LiveMetrics::event(const ModemEvent& event) { take(event); }

template <class Packet>
void LiveMetrics::take(Packet packet) {
  packet.timeMs = _clock.hostMs(packet.timeMs, _wallMs);
  _packetMs = packet.timeMs;
  _packetAt = _now;
  _packets = true;
  const Told* told = nullptr;
  {
    const std::lock_guard lock(_mutex);
    told = &_reader.take(packet);
  }
  _keeper.update({told->begin(), told->end()}, _build, _packetMs, _now, _send);
}

void LiveMetrics::refresh() {
  constexpr std::chrono::seconds kPause{1};
  const bool mayBeOld = _packets && _now >= _updatedAt + kPause;
  if (mayBeOld || _now >= due()) updateAll();
}

LiveMetrics::Clock::time_point LiveMetrics::due() const {
  return std::min(_keeper.waitingUntil(), agesAt());
}

LiveMetrics::Clock::time_point LiveMetrics::agesAt() const {
  if (_packetAt) {
    for (const auto age : kOldAfter) {
      if (_updatedAt < *_packetAt + age) return *_packetAt + age;
    }
  }
  return Clock::time_point::max();
}

void LiveMetrics::sendAll() {
  _keeper.sendAll();
  updateAll();
}

void LiveMetrics::updateAll() {
  _updatedAt = _now;
  _packets = false;
  if (_packetAt) {
    const auto quiet = std::chrono::floor<std::chrono::milliseconds>(_now - *_packetAt);
    _reader.age(_packetMs + static_cast<std::uint64_t>(quiet.count()));
  }
  _keeper.update(_build, _packetMs, _now, _send);
}

void LiveMetrics::forget() {
  const std::lock_guard lock(_mutex);
  _reader.forget();
  _clock.beginAnew();
  _packetAt.reset();
  _keeper.clear();
}

PacketCounts LiveMetrics::counts() const {
  const std::lock_guard lock(_mutex);
  return _reader.counts();
}

}  // namespace qel::diagnostics
