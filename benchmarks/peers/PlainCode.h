// What the generated code of the plain structs is made of.
#pragma once

#include <fmt/format.h>

#include <algorithm>
#include <bit>
#include <cstdint>
#include <optional>
#include <protozero/pbf_reader.hpp>
#include <protozero/pbf_writer.hpp>
#include <string>
#include <string_view>
#include <vector>

namespace qel::bench::plain {

using protozero::pbf_reader;
using protozero::pbf_writer;
using protozero::tag_and_type;

inline constexpr auto kVarint = protozero::pbf_wire_type::varint;
inline constexpr auto kLength = protozero::pbf_wire_type::length_delimited;

// Most lists have some such number of elements.
template <class Element>
Element& another(std::vector<Element>& list) {
  if (list.empty()) list.reserve(4);
  return list.emplace_back();
}

template <class Message>
Message& made(std::optional<Message>& message) {
  return message ? *message : message.emplace();
}

template <class Range, class Number>
void addAll(const Range& range, std::vector<Number>& list) {
  list.insert(list.end(), range.begin(), range.end());
}

// Numbers as they are written, and how long they then are.
inline std::uint64_t plainly(std::uint64_t value) { return value; }
inline std::uint64_t zigzag(std::int32_t value) {
  return (static_cast<std::uint32_t>(value) << 1) ^ static_cast<std::uint32_t>(value >> 31);
}
inline std::uint64_t extended(std::int64_t value) { return static_cast<std::uint64_t>(value); }

inline std::size_t sizeOf(std::uint64_t value) {
  return (static_cast<std::size_t>(std::bit_width(value | 1)) * 9 + 64) / 64;
}
inline std::size_t lengthOf(const std::string& text) { return text.size(); }

inline char* put(char* at, std::uint64_t value) {
  for (; value >= 128; value >>= 7) *at++ = static_cast<char>(value | 128);
  *at++ = static_cast<char>(value);
  return at;
}
inline char* put(char* at, const std::string& text) {
  return std::copy(text.begin(), text.end(), at);
}

template <class Number>
void number(std::string& out, Number value) {
  const fmt::format_int digits(value);
  out.append(digits.data(), digits.size());
}

inline void truth(std::string& out, bool value) { out += value ? "true" : "false"; }

inline void unknown(std::string& out, std::int32_t value) {
  out += "\"(unknown: ";
  number(out, value);
  out += ")\"";
}

inline void quoted(std::string& out, std::string_view text) {
  out += '"';
  for (const char c : text) {
    if (c == '"' || c == '\\') {
      out += '\\';
      out += c;
    } else if (static_cast<unsigned char>(c) < 0x20) {
      fmt::format_to(std::back_inserter(out), "\\u{:04x}", static_cast<int>(c));
    } else {
      out += c;
    }
  }
  out += '"';
}

inline void hexadecimal(std::string& out, std::string_view bytes) {
  out += "\"<";
  for (const char byte : bytes) {
    const auto value = static_cast<unsigned char>(byte);
    out += "0123456789abcdef"[value >> 4];
    out += "0123456789abcdef"[value & 15];
  }
  out += ">\"";
}

// After the last element, which ", " follows.
inline void close(std::string& out, char end) {
  if (out.back() == ' ') out.resize(out.size() - 2);
  out += end;
}

inline void appendTime(std::string& out, const std::optional<std::uint64_t>& timestamp,
                       std::string_view time) {
  if (!timestamp) return;
  out += "\"timestamp\": ";
  if (time.empty()) {
    number(out, *timestamp);
  } else {
    out += '"';
    out += time;
    out += '"';
  }
  out += ", ";
}

}  // namespace qel::bench::plain
