// Layouts of log packets as data, and the one reader of all of them.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "base/Bytes.h"
#include "sources/diagnostics/layouts/Values.h"

namespace qel::diagnostics {

// From the number in the packet to the value: number * step + addend.
struct Scale {
  double step = 1;
  double addend = 0;
  bool hasSign = false;  // the highest bit of the number is its sign
};

// `bits` bits, 1 to 32, that begin `firstBit` bits above the lowest one of the little-endian number
// at `offset`.
struct FieldRow {
  Field field = Field::earfcn;
  std::uint16_t offset = 0;
  std::uint8_t firstBit = 0;
  std::uint8_t bits = 0;
  Scale scale = {};
};

// One version of one log packet, or of a part of it.
struct Layout {
  std::uint16_t code = 0;
  std::uint8_t part = 0;  // the id of the subpacket; 0: the packet's body itself
  std::uint8_t version = 0;
  std::uint16_t bytes = 0;         // the least length, records left out
  std::span<const FieldRow> head;  // offsets from the beginning
  // What is at `firstRecord` and then at every `recordBytes`, as often as the head's Field::count
  // says, or once. Empty: there is no such thing. Offsets from the beginning of a record.
  std::span<const FieldRow> record = {};
  std::uint16_t firstRecord = 0;
  std::uint16_t recordBytes = 0;
};

// How many bytes those rows reach over.
constexpr std::size_t bytesOf(std::span<const FieldRow> rows) {
  std::size_t bytes = 0;
  for (const FieldRow& row : rows) {
    bytes = std::max<std::size_t>(bytes, row.offset + (row.firstBit + row.bits + 7U) / 8U);
  }
  return bytes;
}

struct Reading {
  Values head;
  std::vector<Values> records;
};

inline constexpr std::size_t kMostRecords = 255;

// Nothing when the bytes are fewer than the layout asks for, or the records more than that.
std::optional<Reading> read(const Layout& layout, ByteView bytes);

// The layouts of that code and part, by ascending version.
std::span<const Layout> layoutsOf(std::uint16_t code, std::uint8_t part = 0);

// Null when that version is not known.
const Layout* findLayout(std::uint16_t code, std::uint8_t part, unsigned version);

}  // namespace qel::diagnostics
