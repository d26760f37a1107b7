#include "messages/runtime/PBDataReader.h"

#include <type_traits>
#include <vector>

#include "messages/runtime/Cursor.h"

namespace qel {

namespace {

constexpr unsigned kLongest = 10;

// Up to `count` bytes, all of which are there; a length that is known is unrolled.
template <class Count>
[[gnu::always_inline]] inline Varint readVarintWithin(const std::uint8_t* at, Count count,
                                                      Varint unended) {
  std::uint64_t value = 0;
  for (unsigned i = 0; i < count; ++i) {
    const std::uint64_t byte = at[i];
    value |= (byte & 0x7F) << 7 * i;
    if (byte < 0x80) return {value, at + i + 1};
  }
  return unended;
}

}  // namespace

Varint readLongVarint(const std::uint8_t* at, const std::uint8_t* end) {
  if (end - at >= std::ptrdiff_t{kLongest}) {
    return readVarintWithin(at, std::integral_constant<unsigned, kLongest>(), {0, at + kLongest});
  }
  return readVarintWithin(at, static_cast<unsigned>(end - at), {0, kDamaged});
}

std::uint64_t PBReaderReadVarint(PBDataReader& reader) {
  const ByteView left = reader.left();
  const auto [value, next] = readLongVarint(left.data(), left.data() + left.size());
  const bool damaged = next == kDamaged;
  reader._error = reader._error || damaged;
  reader._pos = damaged ? reader._length : static_cast<std::uint64_t>(next - reader._bytes);
  return value;
}

namespace {

// The next `count` bytes, or nothing with the error flag set when there are fewer.
std::optional<ByteView> take(PBDataReader& reader, std::uint64_t count) {
  const ByteView left = reader.left();
  if (reader._error || count > left.size()) {
    reader._error = true;
    return std::nullopt;
  }
  reader._pos += count;
  return left.first(count);
}

std::optional<ByteView> takeDelimited(PBDataReader& reader) {
  return take(reader, PBReaderReadVarint(reader));
}

// Field numbers have 16 bits, here as in the messages.
std::uint16_t numberOf(std::uint64_t tag) { return static_cast<std::uint16_t>(tag >> 3); }

bool skipScalar(PBDataReader& reader, std::uint8_t wireType) {
  switch (wireType) {
    case 0:
      PBReaderReadVarint(reader);
      return !reader._error;
    case 1:
      return take(reader, 8).has_value();
    case 2:
      return takeDelimited(reader).has_value();
    case 5:
      return take(reader, 4).has_value();
    default:
      return false;
  }
}

// Skips everything up to the end tag of the group `fieldNumber`. Groups within are kept on a heap
// stack, so that no input can exhaust the call stack.
bool skipGroup(PBDataReader& reader, std::uint32_t fieldNumber) {
  std::vector<std::uint16_t> open = {numberOf(std::uint64_t{fieldNumber} << 3)};
  while (!open.empty()) {
    const std::uint64_t tag = PBReaderReadVarint(reader);
    if (reader._error) return false;
    const auto wireType = static_cast<std::uint8_t>(tag & 7);
    if (wireType == 3) {
      open.push_back(numberOf(tag));
    } else if (wireType == 4) {
      if (numberOf(tag) != open.back()) return false;
      open.pop_back();
    } else if (!skipScalar(reader, wireType)) {
      return false;
    }
  }
  return true;
}

}  // namespace

std::optional<Bytes> PBReaderReadData(PBDataReader& reader) {
  const auto taken = takeDelimited(reader);
  if (!taken) return std::nullopt;
  return Bytes(taken->begin(), taken->end());
}

std::optional<std::string> PBReaderReadString(PBDataReader& reader) {
  const auto taken = takeDelimited(reader);
  if (!taken) return std::nullopt;
  return std::string(taken->begin(), taken->end());
}

bool PBReaderPlaceMark(PBDataReader& reader, PBReaderMark& mark) {
  mark.length = reader._length;
  const std::uint64_t length = PBReaderReadVarint(reader);
  if (length > reader.left().size()) return false;
  reader._length = reader._pos + length;
  return true;
}

void PBReaderRecallMark(PBDataReader& reader, const PBReaderMark& mark) {
  reader._length = mark.length;
}

bool PBReaderSkipValueWithTag(PBDataReader& reader, std::uint32_t fieldNumber,
                              std::uint8_t wireType) {
  return wireType == 3 ? skipGroup(reader, fieldNumber) : skipScalar(reader, wireType);
}

}  // namespace qel
