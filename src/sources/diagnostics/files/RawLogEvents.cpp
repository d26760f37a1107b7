#include "sources/diagnostics/files/RawLogEvents.h"

#include <utility>

#include "messages/catalogue/EventNames.h"

namespace qel::diagnostics {
namespace {

constexpr std::uint8_t kBuildAnswer = 0x7C;
// A modem that has heard no network counts from 1980.
constexpr std::uint64_t kClockSetMs = 1'262'304'000'000;  // 2010-01-01
// Further back than packets overtake each other: the log goes on with another one.
constexpr std::uint64_t kAnotherLogMs = 60'000;

}  // namespace

RawLogEvents::RawLogEvents(std::unique_ptr<RawLog> log, std::optional<unsigned> radio)
    : _log(std::move(log)), _radio(radio) {}

RawLogEvents::Radio* RawLogEvents::radioOf(unsigned number) {
  if (number == 0) number = _radio.value_or(1);
  if (number > kMostRadios || (_radio && number != *_radio)) return nullptr;
  return &_radios.try_emplace(number, Radio{DiagnosticsReader(number), 0}).first->second;
}

PacketCounts RawLogEvents::ofFirstRadio() const {
  return _radios.empty() ? PacketCounts() : _radios.begin()->second.reader.counts();
}

std::map<PacketCounts::Kind, PacketCounts::Row> RawLogEvents::counts() const {
  std::map<PacketCounts::Kind, PacketCounts::Row> sum;
  for (const auto& [number, radio] : _radios) {
    for (const auto& [kind, row] : radio.reader.counts().rows()) {
      PacketCounts::Row& all = sum[kind];
      all.understood += row.understood;
      all.unknownVersion += row.unknownVersion;
      all.damaged += row.damaged;
      all.notOurs += row.notOurs;
    }
  }
  return sum;
}

std::optional<sources::SourceEvent> RawLogEvents::next() {
  while (_events.empty()) {
    if (!_log->read(*this)) return std::nullopt;
  }
  auto event = std::move(_events.front());
  _events.pop_front();
  return event;
}

std::uint64_t RawLogEvents::timeOf(std::uint64_t deviceMs) {
  if (deviceMs >= kClockSetMs) return deviceMs;
  if (!_firstUnsetMs || deviceMs < *_firstUnsetMs) _firstUnsetMs = deviceMs;
  return _log->writtenMs() + (deviceMs - *_firstUnsetMs);
}

template <class Packet>
void RawLogEvents::take(Packet packet) {
  Radio* radio = radioOf(packet.radio);
  if (!radio) {
    ++_ofOtherRadios;
    return;
  }
  const unsigned number = packet.radio;
  packet.timeMs = timeOf(packet.timeMs);
  if (packet.timeMs + kAnotherLogMs < radio->lastMs) radio->reader.forget();
  radio->lastMs = packet.timeMs;
  for (const std::uint32_t metric : radio->reader.take(packet)) {
    auto payload = radio->reader.report(metric, packet.timeMs);
    if (!payload) continue;
    _events.push_back(sources::metricEvent(metric, std::move(*payload), packet.timeMs));
    if (!_radio && number > 1) {
      _events.back().entries.set(tesk::kKeyProfileID, std::int64_t{number} - 1);
    }
  }
}

void RawLogEvents::answer(ByteView packet) {
  if (packet.empty() || packet[0] != kBuildAnswer) return;
  if (auto build = buildIn(packet)) _build = std::move(build);
}

}  // namespace qel::diagnostics
