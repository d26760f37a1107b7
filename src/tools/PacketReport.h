// What the owner of a modem can send to those who teach this program new layouts.
#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "sources/diagnostics/DiagnosticsReader.h"
#include "sources/diagnostics/packets/PacketReader.h"
#include "sources/diagnostics/port/FrameReader.h"
#include "sources/diagnostics/requests/Answers.h"

namespace qel::tools {

// Counts and lengths of packets by their kinds, and the chip and its software by name. Of what is
// in the packets nothing is kept. One thread.
class PacketReport final : public diagnostics::PacketSink {
 public:
  void log(const diagnostics::LogPacket& packet) override;
  void event(const diagnostics::ModemEvent& event) override;
  void answer(ByteView packet) override;
  void note(const std::optional<diagnostics::ModemVersion>& version,
            const std::optional<diagnostics::ModemBuild>& build);

  std::vector<std::string> lines(const diagnostics::FrameReader::Counts& frames) const;

 private:
  using Kind = diagnostics::PacketCounts::Kind;
  struct Lengths {
    std::size_t shortest;
    std::size_t longest;
  };

  diagnostics::DiagnosticsReader& readerOf(unsigned radio);
  void measure(const Kind& kind, std::size_t length);
  void addKinds(std::vector<std::string>& lines, unsigned radio,
                const diagnostics::PacketCounts& counts) const;

  std::map<unsigned, diagnostics::DiagnosticsReader> _readers;  // by radio
  std::map<Kind, Lengths> _lengths;
  std::optional<diagnostics::ModemVersion> _version;
  std::optional<diagnostics::ModemBuild> _build;
};

}  // namespace qel::tools
