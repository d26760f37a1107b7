#include "messages/runtime/AnyOrderReader.h"

#include <array>
#include <cstdio>

#include "messages/catalogue/TagLog.h"
#include "messages/runtime/PBDataReader.h"

namespace qel {
namespace {

constexpr std::uint8_t kGroup = 3;

void logUnknownTag(std::uint32_t fieldNumber, std::uint32_t value) {
  std::array<char, 48> line;
  const int length =
      std::snprintf(line.data(), line.size(), "Unknown tag: %x:%u", fieldNumber, value);
  writeTagLine({line.data(), static_cast<std::size_t>(length)});
}

// A metric identifier in place of a field: its varint is taken and logged, never stored.
[[gnu::noinline]] Cursor pastMetric(Cursor cursor, std::uint32_t number) {
  const auto [value, next] = readVarint(cursor);
  logUnknownTag(number, decodedScalar<Encoding::uint32>(value));
  return {next, cursor.end};
}

[[gnu::noinline]] Cursor pastGroup(Cursor cursor, std::uint32_t number) {
  PBDataReader reader({cursor.at, cursor.left()});
  if (!PBReaderSkipValueWithTag(reader, number, kGroup)) return Cursor::damaged();
  return {cursor.at + reader._pos, cursor.end};
}

}  // namespace

Cursor pastOthers(const MessagePlan& plan, Cursor cursor) {
  while (!cursor.isAtEnd()) {
    const auto [tag, next] = readVarintHere(cursor);
    if (next == kDamaged) return Cursor::damaged();
    if (isEndOfGroup(tag)) return {next, next};
    const std::uint16_t number = numberOfTag(tag);
    const auto wireType = static_cast<std::uint8_t>(tag & 7);
    const Cursor value{next, cursor.end};
    if (KBBMetricUtility::isValidMetricIdTag(number, plan.className)) {
      cursor = pastMetric(value, number);
    } else if (plan.find(number) != MessagePlan::kNone) {
      return cursor;
    } else {
      cursor = wireType == kGroup ? pastGroup(value, number) : skipScalar(value, wireType);
    }
  }
  return cursor;
}

}  // namespace qel
