// Packets and frames as a modem writes them on its diagnostics port.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <string_view>
#include <vector>

#include "base/Bytes.h"

namespace qel::diagnostics::test {

// Little-endian numbers one after the other.
class BodyWriter {
 public:
  BodyWriter& u8(std::uint64_t value) { return number(value, 1); }
  BodyWriter& u16(std::uint64_t value) { return number(value, 2); }
  BodyWriter& u32(std::uint64_t value) { return number(value, 4); }
  BodyWriter& u64(std::uint64_t value) { return number(value, 8); }
  BodyWriter& bytes(ByteView bytes);
  BodyWriter& text(std::string_view text);  // without an end
  BodyWriter& zeros(std::size_t count);

  // Writes bits of a 32-bit word at that offset, which may lie past the end so far.
  BodyWriter& bitsAt(std::size_t offset, unsigned first, unsigned count, std::uint64_t value);

  const Bytes& written() const { return _bytes; }
  operator Bytes() const { return _bytes; }  // NOLINT(google-explicit-constructor)

 private:
  BodyWriter& number(std::uint64_t value, int bytes);

  Bytes _bytes;
};

// Some day in 2026, in milliseconds since 1970.
inline constexpr std::uint64_t kSomeTimeMs = 1'790'000'000'000;

// The stamp of 64 bits whose time in whole milliseconds is that.
std::uint64_t stampOf(std::uint64_t timeMs);

Bytes logPacket(std::uint16_t code, ByteView body, std::uint64_t timeMs = kSomeTimeMs);

// In front of any packet.
Bytes wrapped(std::uint32_t radio, ByteView packet);

struct WrittenEvent {
  std::uint16_t id = 0;
  Bytes payload;
  std::uint64_t timeMs = kSomeTimeMs;
  bool shortTime = false;
};
Bytes eventPacket(const std::vector<WrittenEvent>& events);

// CRC-16/X-25 bit by bit.
std::uint16_t slowCheckSum(ByteView bytes);
// The packet behind surplus first bytes: the check sum is that of the packet alone.
Bytes framed(ByteView packet, std::size_t surplus = 0);
Bytes joined(std::initializer_list<Bytes> parts);

}  // namespace qel::diagnostics::test
