// What a packet of the port is: a log, events, or something else.
#pragma once

#include <array>
#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/packets/Packet.h"

namespace qel::diagnostics {

// What is handed over is valid during the call.
class PacketSink {
 public:
  virtual ~PacketSink() = default;
  virtual void log(const LogPacket& packet) = 0;
  virtual void event(const ModemEvent& event) = 0;
  // Neither, or an answer: the packet from its command on.
  virtual void answer(ByteView /*packet*/) {}
};

// Looks through a wrapper that names the radio. A log packet or a packet of events that is against
// itself gives nothing. One thread.
class PacketReader {
 public:
  struct Counts {
    std::uint64_t logs = 0;
    std::uint64_t events = 0;
    std::uint64_t damaged = 0;
    std::array<std::uint64_t, 256> others = {};  // by command
  };

  explicit PacketReader(PacketSink& sink) : _sink(sink) {}

  void take(ByteView packet);

  const Counts& counts() const { return _counts; }

 private:
  void takeInner(ByteView packet, unsigned radio);
  bool takeLog(ByteView packet, unsigned radio);
  bool takeEvents(ByteView packet, unsigned radio);

  PacketSink& _sink;
  std::optional<std::uint64_t> _eventStamp;  // of the event last seen: short stamps go on from it
  Counts _counts;
};

}  // namespace qel::diagnostics
