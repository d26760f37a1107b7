#include "support/diagnostics/Packets.h"

#include <algorithm>

namespace qel::diagnostics::test {

BodyWriter& BodyWriter::number(std::uint64_t value, int bytes) {
  for (int i = 0; i < bytes; ++i) _bytes.push_back(static_cast<std::uint8_t>(value >> 8 * i));
  return *this;
}

BodyWriter& BodyWriter::bytes(ByteView bytes) {
  _bytes.insert(_bytes.end(), bytes.begin(), bytes.end());
  return *this;
}

BodyWriter& BodyWriter::text(std::string_view text) {
  _bytes.insert(_bytes.end(), text.begin(), text.end());
  return *this;
}

BodyWriter& BodyWriter::zeros(std::size_t count) {
  _bytes.resize(_bytes.size() + count);
  return *this;
}

BodyWriter& BodyWriter::bitsAt(std::size_t offset, unsigned first, unsigned count,
                               std::uint64_t value) {
  _bytes.resize(std::max(_bytes.size(), offset + 4));
  for (unsigned i = 0; i < count; ++i) {
    const unsigned at = first + i;
    const auto bit = static_cast<std::uint8_t>(1U << at % 8);
    std::uint8_t& byte = _bytes[offset + at / 8];
    byte = static_cast<std::uint8_t>((value >> i & 1) != 0 ? byte | bit : byte & ~bit);
  }
  return *this;
}

std::uint64_t stampOf(std::uint64_t timeMs) {
  constexpr std::uint64_t kFrom1970To1980Ms = 315'964'800'000;
  const std::uint64_t quarters = (timeMs - kFrom1970To1980Ms) * 4;  // of a millisecond
  const std::uint64_t steps = quarters / 5;
  const std::uint64_t parts = (quarters % 5 * 49152 + 4) / 5;  // rounded up
  return steps << 16 | parts;
}

Bytes logPacket(std::uint16_t code, ByteView body, std::uint64_t timeMs) {
  const std::size_t length = 12 + body.size();
  return BodyWriter()
      .u8(0x10)
      .u8(0)
      .u16(length)
      .u16(length)
      .u16(code)
      .u64(stampOf(timeMs))
      .bytes(body);
}

Bytes wrapped(std::uint32_t radio, ByteView packet) {
  return BodyWriter().u8(0x98).u8(1).u16(0).u32(radio).bytes(packet);
}

Bytes eventPacket(const std::vector<WrittenEvent>& events) {
  BodyWriter body;
  for (const WrittenEvent& event : events) {
    const std::size_t form = std::min<std::size_t>(event.payload.size(), 3);
    body.u16(event.id | form << 13 | (event.shortTime ? 1U << 15 : 0U));
    const std::uint64_t stamp = stampOf(event.timeMs);
    if (event.shortTime) {
      body.u16(stamp >> 8);
    } else {
      body.u64(stamp);
    }
    if (form == 3) body.u8(event.payload.size());
    body.bytes(event.payload);
  }
  return BodyWriter().u8(0x60).u16(body.written().size()).bytes(body.written());
}

std::uint16_t slowCheckSum(ByteView bytes) {
  std::uint16_t sum = 0xFFFF;
  for (const std::uint8_t byte : bytes) {
    for (unsigned bit = 0; bit < 8; ++bit) {
      const bool differs = ((sum ^ byte >> bit) & 1) != 0;
      sum = static_cast<std::uint16_t>(sum >> 1);
      if (differs) sum ^= 0x8408;
    }
  }
  return static_cast<std::uint16_t>(~sum);
}

Bytes framed(ByteView packet, std::size_t surplus) {
  BodyWriter content;
  for (std::size_t i = 0; i < surplus; ++i) content.u8(packet[0]);
  content.bytes(packet).u16(slowCheckSum(packet));
  BodyWriter frame;
  for (const std::uint8_t byte : content.written()) {
    if (byte == 0x7E || byte == 0x7D) {
      frame.u8(0x7D).u8(byte ^ 0x20U);
    } else {
      frame.u8(byte);
    }
  }
  return frame.u8(0x7E);
}

Bytes joined(std::initializer_list<Bytes> parts) {
  BodyWriter all;
  for (const Bytes& part : parts) all.bytes(part);
  return all;
}

}  // namespace qel::diagnostics::test
