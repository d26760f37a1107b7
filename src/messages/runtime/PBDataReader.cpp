#include "messages/runtime/PBDataReader.h"

#include <bit>
#include <cstring>
#include <vector>

#include "messages/runtime/Cursor.h"

namespace qel {

namespace {

constexpr std::uint64_t kTops = 0x8080808080808080;

// The first of the bytes in the lowest place, whatever the machine's order.
std::uint64_t eightBytes(const std::uint8_t* at) {
  std::uint64_t word = 0;
  std::memcpy(&word, at, sizeof word);
  if constexpr (std::endian::native == std::endian::big) word = __builtin_bswap64(word);
  return word;
}

// The low seven bits of eight bytes whose top bits are clear, one behind the other.
std::uint64_t joinedSevens(std::uint64_t bytes) {
  bytes = (bytes & 0x007F007F007F007F) | (bytes & 0x7F007F007F007F00) >> 1;
  bytes = (bytes & 0x00003FFF00003FFF) | (bytes & 0x3FFF00003FFF0000) >> 2;
  return (bytes & 0x000000000FFFFFFF) | (bytes & 0x0FFFFFFF00000000) >> 4;
}

}  // namespace

Varint readLongVarint(const std::uint8_t* at, const std::uint8_t* end) {
  constexpr std::ptrdiff_t kLongest = 10;
  const std::ptrdiff_t left = end - at;
  if (left >= std::ptrdiff_t{sizeof(std::uint64_t)}) {
    const std::uint64_t word = eightBytes(at);
    if (const std::uint64_t ends = ~word & kTops) [[likely]] {
      const std::uint64_t upToFirst = ends ^ (ends - 1);
      return {joinedSevens(word & upToFirst & ~kTops), at + std::countr_zero(ends) / 8 + 1};
    }
  }
  std::uint64_t value = 0;
  for (std::ptrdiff_t i = 0; i < std::min(left, kLongest); ++i) {
    const std::uint64_t byte = at[i];
    value |= (byte & 0x7F) << 7 * i;
    if (byte < 0x80) return {value, at + i + 1};
  }
  return {0, left < kLongest ? kDamaged : at + kLongest};
}

Cursor skipScalar(Cursor cursor, std::uint8_t wireType) {
  const auto skip = [cursor](std::size_t count) {
    return count <= cursor.left() ? Cursor{cursor.at + count, cursor.end} : Cursor::damaged();
  };
  switch (wireType) {
    case 0:
      return {readVarint(cursor).next, cursor.end};
    case 1:
      return skip(8);
    case 2: {
      const Cursor part = readDelimited(cursor);
      return part.isDamaged() ? part : Cursor{part.end, cursor.end};
    }
    case 5:
      return skip(4);
    default:
      return Cursor::damaged();
  }
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
  return left.first(static_cast<std::size_t>(count));
}

std::optional<ByteView> takeDelimited(PBDataReader& reader) {
  return take(reader, PBReaderReadVarint(reader));
}

// Field numbers have 16 bits, here as in the messages.
std::uint16_t numberOf(std::uint64_t tag) { return static_cast<std::uint16_t>(tag >> 3); }

bool skipScalar(PBDataReader& reader, std::uint8_t wireType) {
  const ByteView left = reader.left();
  const Cursor next = skipScalar(Cursor{left.data(), left.data() + left.size()}, wireType);
  const bool isKnown = wireType <= 2 || wireType == 5;
  if (next.isDamaged()) {
    reader._error = reader._error || isKnown;
    return false;
  }
  reader._pos = static_cast<std::uint64_t>(next.at - reader._bytes);
  return !reader._error;
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
