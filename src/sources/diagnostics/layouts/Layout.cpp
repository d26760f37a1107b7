#include "sources/diagnostics/layouts/Layout.h"

#include <algorithm>

#include "sources/diagnostics/layouts/LteLayouts.h"

namespace qel::diagnostics {
namespace {

// Of the bits that the row names; they may begin in one byte and end four further on.
std::uint32_t numberAt(const FieldRow& row, ByteView bytes) {
  const std::size_t last = row.offset + (row.firstBit + row.bits - 1U) / 8U;
  std::uint64_t word = 0;
  for (std::size_t i = last + 1; i-- > row.offset;) word = word << 8U | bytes[i];
  return static_cast<std::uint32_t>(word >> row.firstBit & ((std::uint64_t{1} << row.bits) - 1U));
}

double valueOf(const FieldRow& row, ByteView bytes) {
  const double number = numberAt(row, bytes);
  const double range = static_cast<double>(std::uint64_t{1} << row.bits);
  const bool isNegative = row.scale.hasSign && number >= range / 2;
  return (isNegative ? number - range : number) * row.scale.step + row.scale.addend;
}

Values valuesOf(std::span<const FieldRow> rows, ByteView bytes) {
  Values values;
  for (const FieldRow& row : rows) values.set(row.field, valueOf(row, bytes));
  return values;
}

}  // namespace

std::optional<Reading> read(const Layout& layout, ByteView bytes) {
  if (bytes.size() < layout.bytes) return std::nullopt;
  Reading reading;
  reading.head = valuesOf(layout.head, bytes);
  if (layout.record.empty()) return reading;
  const std::size_t count = reading.head.has(Field::count) ? reading.head.number(Field::count) : 1;
  if (count == 0) return reading;
  const std::size_t lastRecord = layout.firstRecord + (count - 1) * layout.recordBytes;
  if (count > kMostRecords || bytes.size() < lastRecord + bytesOf(layout.record)) {
    return std::nullopt;
  }
  reading.records.reserve(count);
  for (std::size_t at = layout.firstRecord; at <= lastRecord; at += layout.recordBytes) {
    reading.records.push_back(valuesOf(layout.record, bytes.subspan(at)));
    if (layout.recordBytes == 0) break;
  }
  return reading;
}

std::span<const Layout> layoutsOf(std::uint16_t code, std::uint8_t part) {
  const std::span<const Layout> all = lteLayouts();
  const auto isOther = [&](const Layout& row) { return row.code != code || row.part != part; };
  const auto first = std::find_if_not(all.begin(), all.end(), isOther);
  return {first, std::find_if(first, all.end(), isOther)};
}

const Layout* findLayout(std::uint16_t code, std::uint8_t part, unsigned version) {
  for (const Layout& layout : layoutsOf(code, part)) {
    if (layout.version == version) return &layout;
  }
  return nullptr;
}

}  // namespace qel::diagnostics
