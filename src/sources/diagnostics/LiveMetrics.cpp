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
  if (mayBeOld || _now >= _keeper.waitingUntil()) updateAll();
}

void LiveMetrics::sendAll() {
  _keeper.sendAll();
  updateAll();
}

void LiveMetrics::updateAll() {
  _updatedAt = _now;
  _packets = false;
  _keeper.update(_build, _packetMs, _now, _send);
}

void LiveMetrics::forget() {
  const std::lock_guard lock(_mutex);
  _reader.forget();
  _clock.beginAnew();
  _keeper.clear();
}

PacketCounts LiveMetrics::counts() const {
  const std::lock_guard lock(_mutex);
  return _reader.counts();
}

}  // namespace qel::diagnostics
