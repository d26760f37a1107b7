// The metrics of a raw log, event by event.
#pragma once

#include <cstdint>
#include <deque>
#include <map>
#include <memory>
#include <optional>

#include "sources/SourceEvent.h"
#include "sources/diagnostics/DiagnosticsReader.h"
#include "sources/diagnostics/files/RawLog.h"
#include "sources/diagnostics/requests/Answers.h"

namespace qel::diagnostics {

// Every packet that says something about a metric makes one event of it, with all that is known
// then and the modem's time. Of a modem with several radios each is read by itself, and the events
// of the first have profile 0, those of the second profile 1 … One thread.
class RawLogEvents final : private PacketSink {
 public:
  // Of that radio, or of every one up to kMostRadios.
  RawLogEvents(std::unique_ptr<RawLog> log, std::optional<unsigned> radio);
  static constexpr unsigned kMostRadios = 16;

  // In the order of the packets. Nothing at the end: of the log, or by its fault.
  std::optional<sources::SourceEvent> next();

  const RawLog& log() const { return *_log; }
  // The packets by their kinds, of all radios that are read.
  std::map<PacketCounts::Kind, PacketCounts::Row> counts() const;
  // Those of the first radio that is read.
  PacketCounts ofFirstRadio() const;
  // Logs and events of other radios, which were passed over.
  std::uint64_t ofOtherRadios() const { return _ofOtherRadios; }
  // What the modem was asked about itself while the log was made.
  const std::optional<ModemBuild>& build() const { return _build; }

 private:
  void log(const LogPacket& packet) override { take(packet); }
  void event(const ModemEvent& event) override { take(event); }
  void answer(ByteView packet) override;

  template <class Packet>
  void take(Packet packet);
  std::uint64_t timeOf(std::uint64_t deviceMs);
  // Nothing for one that is passed over.
  struct Radio;
  Radio* radioOf(unsigned number);

  struct Radio {
    DiagnosticsReader reader;
    std::uint64_t lastMs = 0;
  };

  const std::unique_ptr<RawLog> _log;
  const std::optional<unsigned> _radio;
  std::map<unsigned, Radio> _radios;  // by their numbers; who names none is the first, or the one
  std::deque<sources::SourceEvent> _events;    // of the piece that was read last
  std::optional<std::uint64_t> _firstUnsetMs;  // of the modem's clock before it was set
  std::uint64_t _ofOtherRadios = 0;
  std::optional<ModemBuild> _build;
};

}  // namespace qel::diagnostics
