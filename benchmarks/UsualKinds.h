// What phones report in everyday use, as shares: of the kinds, of the messages that have a field,
// of the lengths of lists, and how often a value is that of the report before.
#pragma once

#include <cstdint>
#include <span>
#include <string_view>

namespace qel::bench {

struct FieldShare {
  std::string_view field;  // "rssi"; within a list or a message "rx_info.rssi", after "rx_info"
  unsigned percent;        // of the messages it belongs to
  unsigned staysPercent;   // of these: as in the payload of the kind before, where that had it
  std::int64_t low, high;  // else drawn evenly: values, elements of a list, bytes of a text
};

struct KindShare {
  std::uint32_t metric;                // catalogue identifier
  unsigned perMille;                   // of the payloads; all kinds together 1,000
  std::span<const FieldShare> fields;  // besides the timestamp, in their order
};

// A kind may stand there twice, with other lists.
std::span<const KindShare> usualKinds();

}  // namespace qel::bench
