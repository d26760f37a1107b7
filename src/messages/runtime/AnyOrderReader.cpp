#include "messages/runtime/AnyOrderReader.h"

#include <array>
#include <cstdio>

#include "messages/catalogue/TagLog.h"
#include "messages/runtime/PBDataReader.h"

namespace qel {
namespace {

constexpr std::uint8_t kGroup = 3;
constexpr std::uint8_t kEndOfGroup = 4;

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

FoundField findField(const MessagePlan& plan, Cursor cursor) {
  while (!cursor.isAtEnd()) {
    const auto [tag, next] = readVarintHere(cursor);
    cursor.at = next;
    const auto wireType = static_cast<std::uint8_t>(tag & 7);
    if (cursor.isDamaged() || wireType == kEndOfGroup) break;
    const auto number = static_cast<std::uint32_t>(tag >> 3 & 0xFFFF);
    if (KBBMetricUtility::isValidMetricIdTag(number, plan.className)) {
      cursor = pastMetric(cursor, number);
    } else if (const std::uint8_t place = plan.find(number); place != MessagePlan::kNone) {
      return {place, cursor};
    } else {
      cursor = wireType == kGroup ? pastGroup(cursor, number) : skipScalar(cursor, wireType);
    }
  }
  return {MessagePlan::kNone, cursor};
}

}  // namespace qel
