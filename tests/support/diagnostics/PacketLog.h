// Keeps what a packet reader hands over.
#pragma once

#include <cstdint>
#include <vector>

#include "sources/diagnostics/packets/PacketReader.h"

namespace qel::diagnostics::test {

struct PacketLog final : PacketSink {
  struct Log {
    std::uint16_t code;
    std::uint64_t timeMs;
    unsigned radio;
    Bytes body;
  };
  struct Event {
    std::uint16_t id;
    std::uint64_t timeMs;
    unsigned radio;
    Bytes payload;
  };

  void log(const LogPacket& packet) override {
    logs.push_back(
        {packet.code, packet.timeMs, packet.radio, {packet.body.begin(), packet.body.end()}});
  }
  void event(const ModemEvent& event) override {
    events.push_back(
        {event.id, event.timeMs, event.radio, {event.payload.begin(), event.payload.end()}});
  }
  void answer(ByteView packet) override { answers.emplace_back(packet.begin(), packet.end()); }

  std::vector<Log> logs;
  std::vector<Event> events;
  std::vector<Bytes> answers;
};

}  // namespace qel::diagnostics::test
