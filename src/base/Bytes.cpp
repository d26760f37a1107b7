#include "base/Bytes.h"

#include <algorithm>
#include <array>

namespace qel {
namespace {

constexpr std::string_view kHexDigits = "0123456789abcdef";
constexpr std::string_view kBase64Digits =
    "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

int hexDigit(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}

constexpr std::array<int, 256> makeBase64Values() {
  std::array<int, 256> values{};
  values.fill(-1);
  for (std::size_t i = 0; i < kBase64Digits.size(); ++i) {
    values[static_cast<unsigned char>(kBase64Digits[i])] = static_cast<int>(i);
  }
  return values;
}

constexpr auto kBase64Values = makeBase64Values();

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
  Bytes bytes;
  bytes.reserve(text.size() / 2);
  for (std::size_t i = 0; i < text.size(); i += 2) {
    const int high = hexDigit(text[i]);
    const int low = hexDigit(text[i + 1]);
    if (high < 0 || low < 0) return std::nullopt;
    bytes.push_back(static_cast<std::uint8_t>(high * 16 + low));
  }
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
  std::size_t padding = 0;
  while (padding < 2 && padding < text.size() && text[text.size() - 1 - padding] == '=') ++padding;
  const std::size_t digits = text.size() - padding;
  const std::size_t size = text.size() / 4 * 3 - padding;
  Bytes bytes(size);
  for (std::size_t group = 0; group * 4 < digits; ++group) {
    int value = 0;  // of four digits; negative once one of them is none
    for (std::size_t i = group * 4; i < group * 4 + 4; ++i) {
      value = value << 6 | (i < digits ? kBase64Values[static_cast<unsigned char>(text[i])] : 0);
    }
    const auto bits = static_cast<std::uint32_t>(value);
    const std::size_t end = std::min(group * 3 + 3, size);
    std::uint32_t left = bits << 8;
    for (std::size_t i = group * 3; i < end; ++i, left <<= 8) {
      bytes[i] = static_cast<std::uint8_t>(left >> 24);
    }
    if (value < 0 || left != 0) return std::nullopt;
  }
  return bytes;
}

}  // namespace qel
