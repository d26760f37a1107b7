#include "sources/diagnostics/PacketCounts.h"

namespace qel::diagnostics {
namespace {

std::uint64_t& field(PacketCounts::Row& row, Outcome outcome) {
  switch (outcome) {
    case Outcome::understood:
      return row.understood;
    case Outcome::unknownVersion:
      return row.unknownVersion;
    case Outcome::damaged:
      return row.damaged;
    case Outcome::notOurs:
      break;
  }
  return row.notOurs;
}

}  // namespace

void PacketCounts::count(const Kind& kind, Outcome outcome) {
  auto found = _rows.find(kind);
  if (found == _rows.end() && _rows.size() < kMostRows) found = _rows.emplace(kind, Row{}).first;
  ++field(found == _rows.end() ? _further : found->second, outcome);
}

PacketCounts::Row PacketCounts::total() const {
  Row sum = _further;
  for (const auto& [kind, row] : _rows) {
    sum.understood += row.understood;
    sum.unknownVersion += row.unknownVersion;
    sum.damaged += row.damaged;
    sum.notOurs += row.notOurs;
  }
  return sum;
}

}  // namespace qel::diagnostics
