#include "base/Rendering.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>

#include "base/Utf8.h"

namespace qel {
namespace {

template <class Integer>
void appendInteger(std::string& out, Integer value) {
  std::array<char, 24> digits;
  const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), value).ptr;
  out.append(digits.data(), end);
}

void appendFloat(std::string& out, float value) {
  if (!std::isfinite(value)) {
    out += "null";
    return;
  }
  std::array<char, 80> digits;  // the longest is the smallest subnormal, 48 characters
  const auto end =
      std::to_chars(digits.data(), digits.data() + digits.size(), value, std::chars_format::fixed)
          .ptr;
  const std::string_view text(digits.data(), static_cast<std::size_t>(end - digits.data()));
  out += text;
  if (text.find('.') == std::string_view::npos) out += ".0";
}

void appendBytes(std::string& out, const Bytes& bytes) {
  out += '<';
  appendHex(out, bytes);
  out += '>';
}

void appendEscaped(std::string& out, char c) {
  switch (c) {
    case '"':
      out += "\\\"";
      break;
    case '\\':
      out += "\\\\";
      break;
    case '\b':
      out += "\\b";
      break;
    case '\f':
      out += "\\f";
      break;
    case '\n':
      out += "\\n";
      break;
    case '\r':
      out += "\\r";
      break;
    case '\t':
      out += "\\t";
      break;
    default:
      out += "\\u00";
      appendHex(out, std::array{static_cast<std::uint8_t>(c)});
  }
}

// Characters that stand for themselves: printable ASCII without quote and backslash.
constexpr std::array<bool, 256> makePlainCharacters() {
  std::array<bool, 256> plain{};
  for (std::size_t c = 0x20; c < 0x80; ++c) plain[c] = c != '"' && c != '\\';
  return plain;
}

constexpr auto kPlain = makePlainCharacters();

bool isPlain(char c) { return kPlain[static_cast<unsigned char>(c)]; }

void appendSpecial(std::string& out, char c) {
  if (static_cast<unsigned char>(c) >= 0x80) {
    out += c;  // part of a longer UTF-8 sequence
  } else {
    appendEscaped(out, c);
  }
}

void appendList(std::string& out, const List& list) {
  out += '[';
  const char* separator = "";
  for (const Value& value : list) {
    out += separator;
    appendJson(out, value);
    separator = ", ";
  }
  out += ']';
}

}  // namespace

void appendJsonString(std::string& out, std::string_view text) {
  auto special = std::ranges::find_if_not(text, isPlain);
  if (special != text.end() && !isValidUtf8(text)) {
    appendJsonString(out, withReplacements(text));
    return;
  }
  out += '"';
  auto plain = text.begin();
  while (special != text.end()) {
    out.append(plain, special);
    appendSpecial(out, *special);
    plain = special + 1;
    special = std::find_if_not(plain, text.end(), isPlain);
  }
  out.append(plain, special);
  out += '"';
}

void appendJson(std::string& out, const Dictionary& dictionary) {
  out += '{';
  const char* separator = "";
  for (const auto& [key, value] : dictionary) {
    out += separator;
    appendJsonString(out, key);
    out += ": ";
    appendJson(out, value);
    separator = ", ";
  }
  out += '}';
}

void appendJson(std::string& out, const Value& value) {
  switch (value.kind()) {
    case Value::Kind::null:
      out += "null";
      break;
    case Value::Kind::boolean:
      out += *value.asBoolean() ? "true" : "false";
      break;
    case Value::Kind::signedInteger:
      appendInteger(out, *value.asInt64());
      break;
    case Value::Kind::unsignedInteger:
      appendInteger(out, *value.asUInt64());
      break;
    case Value::Kind::floating:
      appendFloat(out, *value.asFloat());
      break;
    case Value::Kind::text:
      appendJsonString(out, *value.asText());
      break;
    case Value::Kind::bytes:
      out += '"';
      appendBytes(out, *value.asBytes());
      out += '"';
      break;
    case Value::Kind::list:
      appendList(out, *value.asList());
      break;
    case Value::Kind::dictionary:
      appendJson(out, *value.asDictionary());
      break;
  }
}

std::string jsonText(const Value& value) {
  std::string out;
  appendJson(out, value);
  return out;
}

std::string jsonText(const Dictionary& dictionary) {
  std::string out;
  appendJson(out, dictionary);
  return out;
}

std::string cellText(const Value& value) {
  std::string out;
  switch (value.kind()) {
    case Value::Kind::boolean:
      out = *value.asBoolean() ? "1" : "0";
      break;
    case Value::Kind::text:
      out = *value.asText();
      break;
    case Value::Kind::bytes:
      appendBytes(out, *value.asBytes());
      break;
    default:
      appendJson(out, value);
  }
  return out;
}

}  // namespace qel
