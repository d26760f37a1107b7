// Which packets came, at which versions, and what became of them.
#pragma once

#include <cstdint>
#include <map>
#include <optional>

#include "sources/diagnostics/packets/Packet.h"

namespace qel::diagnostics {

// Holds kMostRows kinds; what comes of further kinds is counted together. One thread.
class PacketCounts {
 public:
  static constexpr std::size_t kMostRows = 1024;

  struct Kind {
    bool isEvent = false;
    std::uint16_t code = 0;
    std::optional<unsigned> version;

    friend auto operator<=>(const Kind&, const Kind&) = default;
  };
  struct Row {
    std::uint64_t understood = 0;
    std::uint64_t unknownVersion = 0;
    std::uint64_t damaged = 0;
    std::uint64_t notOurs = 0;

    std::uint64_t all() const { return understood + unknownVersion + damaged + notOurs; }
  };

  void count(const Kind& kind, Outcome outcome);

  const std::map<Kind, Row>& rows() const { return _rows; }
  const Row& ofFurtherKinds() const { return _further; }
  Row total() const;

 private:
  std::map<Kind, Row> _rows;
  Row _further;
};

}  // namespace qel::diagnostics
