// The heart: packets in, metrics out. No threads, no clocks.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/PacketCounts.h"
#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/packets/Packet.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

// One thread. What a packet says is in the picture when its call returns; damaged packets and those
// of another radio leave the picture as it is.
class DiagnosticsReader {
 public:
  // The packets of that radio, and those that name none.
  explicit DiagnosticsReader(unsigned radio = 1) : _radio(radio) {}

  // The metrics that it said something about; valid until the next call.
  const Told& take(const LogPacket& packet);
  const Told& take(const ModemEvent& event);

  // What has become old by then is gone; a packet does the same with its own time.
  void age(std::uint64_t nowMs);

  // The metric as it is known now; nothing when the port has told nothing of it.
  std::optional<Bytes> report(std::uint32_t metric, std::uint64_t timeMs) const;

  // The modem has begun anew: what was known of it holds no longer. The counts go on.
  void forget();

  const Picture& picture() const { return _picture; }
  const PacketCounts& counts() const { return _counts; }

 private:
  template <class Packet, class Row>
  const Told& take(const Packet& packet, const Row* row, const PacketCounts::Kind& kind);

  const unsigned _radio;
  Picture _picture;
  Told _told;
  Told _everTold;  // since the modem began
  PacketCounts _counts;
};

}  // namespace qel::diagnostics
