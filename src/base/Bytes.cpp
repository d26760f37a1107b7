#include "base/Bytes.h"

#include <algorithm>
#include <array>

namespace qel {
namespace {

constexpr std::string_view kHexDigits = "0123456789abcdef";
constexpr std::string_view kBase64Digits =
    "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

constexpr std::uint8_t kNoHexDigit = 0xF0;

// The value of each character as a digit.
constexpr std::array<std::uint8_t, 256> makeHexValues() {
  std::array<std::uint8_t, 256> values{};
  values.fill(kNoHexDigit);
  for (std::size_t i = 0; i < 10; ++i) values['0' + i] = static_cast<std::uint8_t>(i);
  for (std::size_t i = 0; i < 6; ++i) {
    values['a' + i] = values['A' + i] = static_cast<std::uint8_t>(10 + i);
  }
  return values;
}

constexpr auto kHexValues = makeHexValues();

// Beyond the 24 bits that four digits make.
constexpr std::uint32_t kNoBase64Digit = 1U << 31;

// For each of the four places in a group of digits, what each character stands for there.
using Base64Places = std::array<std::array<std::uint32_t, 256>, 4>;
constexpr Base64Places makeBase64Places() {
  Base64Places places{};
  for (std::size_t place = 0; place < places.size(); ++place) {
    places[place].fill(kNoBase64Digit);
    for (std::uint32_t i = 0; i < kBase64Digits.size(); ++i) {
      places[place][static_cast<unsigned char>(kBase64Digits[i])] = i << (18 - 6 * place);
    }
  }
  return places;
}

constexpr Base64Places kBase64Places = makeBase64Places();

std::uint32_t base64Group(const char* digits, std::size_t count) {
  std::uint32_t group = 0;
  for (std::size_t place = 0; place < count; ++place) {
    group |= kBase64Places[place][static_cast<unsigned char>(digits[place])];
  }
  return group;
}

}  // namespace

void appendHex(std::string& out, ByteView bytes) {
  for (const std::uint8_t byte : bytes) {
    out += kHexDigits[byte >> 4];
    out += kHexDigits[byte & 0x0F];
  }
}

std::string hexText(ByteView bytes) {
  std::string out;
  out.reserve(bytes.size() * 2);
  appendHex(out, bytes);
  return out;
}

std::optional<Bytes> bytesFromHex(std::string_view text) {
  if (text.size() % 2 != 0) return std::nullopt;
  Bytes bytes(text.size() / 2);
  const char* digits = text.data();
  unsigned seen = 0;
  for (std::uint8_t& byte : bytes) {
    const unsigned high = kHexValues[static_cast<unsigned char>(*digits++)];
    const unsigned low = kHexValues[static_cast<unsigned char>(*digits++)];
    byte = static_cast<std::uint8_t>(high << 4 | low);
    seen |= high | low;
  }
  if ((seen & kNoHexDigit) != 0) return std::nullopt;
  return bytes;
}

std::string base64Text(ByteView bytes) {
  std::string out;
  out.reserve((bytes.size() + 2) / 3 * 4);
  for (std::size_t i = 0; i < bytes.size(); i += 3) {
    const std::size_t taken = std::min<std::size_t>(3, bytes.size() - i);
    std::uint32_t group = 0;
    for (std::size_t k = 0; k < 3; ++k) group = group << 8 | (k < taken ? bytes[i + k] : 0U);
    for (std::size_t k = 0; k < 4; ++k) {
      out += k <= taken ? kBase64Digits[group >> (18 - 6 * k) & 0x3F] : '=';
    }
  }
  return out;
}

std::optional<Bytes> bytesFromBase64(std::string_view text) {
  if (text.size() % 4 != 0) return std::nullopt;
  if (text.empty()) return Bytes();
  std::size_t padding = 0;
  while (padding < 2 && text[text.size() - 1 - padding] == '=') ++padding;
  Bytes bytes(text.size() / 4 * 3 - padding);
  const char* digits = text.data();
  const char* const last = digits + text.size() - 4;
  std::uint8_t* next = bytes.data();
  std::uint32_t seen = 0;
  for (; digits != last; digits += 4, next += 3) {
    const std::uint32_t group = base64Group(digits, 4);
    seen |= group;
    next[0] = static_cast<std::uint8_t>(group >> 16);
    next[1] = static_cast<std::uint8_t>(group >> 8);
    next[2] = static_cast<std::uint8_t>(group);
  }
  std::uint32_t group = base64Group(last, 4 - padding);
  seen |= group;
  for (std::uint8_t* const end = bytes.data() + bytes.size(); next != end; ++next) {
    *next = static_cast<std::uint8_t>(group >> 16);
    group <<= 8;
  }
  const bool isRestZero = (group & 0xFFFFFF) == 0;
  if ((seen & kNoBase64Digit) != 0 || !isRestZero) return std::nullopt;
  return bytes;
}

}  // namespace qel
