// What a modem's packets come to while it is watched: metrics, thinned, by the host's clock.
#pragma once

#include <chrono>
#include <cstdint>
#include <mutex>
#include <optional>

#include "sources/MetricKeeper.h"
#include "sources/diagnostics/DiagnosticsReader.h"
#include "sources/diagnostics/packets/PacketReader.h"
#include "sources/diagnostics/session/ModemClock.h"

namespace qel::diagnostics {

// Levels are sent once a second at most, others at every change within reason, and all of them
// again after the period for as long as packets come. One thread but for query() and counts().
class LiveMetrics final : public PacketSink {
 public:
  using Clock = sources::MetricKeeper::Clock;
  using Send = sources::MetricKeeper::Send;

  LiveMetrics(unsigned radio, std::chrono::milliseconds period, Send send);

  // At each turn, before its packets: what the clocks say.
  void atTime(Clock::time_point now, std::uint64_t wallMs);
  // After them: sends what had to wait, and looks once a second for what has become old.
  void refresh();
  // When refresh() has something to do without a packet. A modem that goes quiet is looked at twice
  // more, when its last signal and its last neighbour have become old.
  Clock::time_point due() const;

  // A new listener is told everything.
  void sendAll();
  // Nothing that was known holds any longer.
  void forget();
  // The host has slept: the modem's clock has to be compared anew.
  void compareClocksAnew() { _clock.beginAnew(); }

  bool knowsCell() const { return _reader.picture().technology.has_value(); }
  sources::SourceAnswer query(std::uint32_t metric) const { return _keeper.query(metric); }
  PacketCounts counts() const;

  void log(const LogPacket& packet) override;
  void event(const ModemEvent& event) override;

 private:
  template <class Packet>
  void take(Packet packet);
  void updateAll();
  Clock::time_point agesAt() const;

  const Send _send;
  const sources::MetricKeeper::Build _build;
  sources::MetricKeeper _keeper;
  ModemClock _clock;
  mutable std::mutex _mutex;  // guards the reader's counts
  DiagnosticsReader _reader;
  Clock::time_point _now;
  Clock::time_point _updatedAt;
  std::uint64_t _wallMs = 0;
  std::uint64_t _packetMs = 0;  // of the last one
  std::optional<Clock::time_point> _packetAt;
  bool _packets = false;  // since all metrics were looked at
};

}  // namespace qel::diagnostics
