// What the generated code of the plain structs is made of.
#pragma once

#include <algorithm>
#include <bit>
#include <cstdint>
#include <optional>
#include <protozero/pbf_reader.hpp>
#include <protozero/pbf_writer.hpp>
#include <string>
#include <string_view>
#include <vector>

#include "peers/Line.h"

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

inline void truth(Line& out, bool value) { value ? out.literal("true, ") : out.literal("false, "); }

inline void unknown(Line& out, std::int32_t value) {
  out.literal("\"(unknown: ");
  out.number(value);
  out.back(2);
  out.literal(")\", ");
}

inline void quoted(Line& out, std::string_view text) {
  out.literal("\"");
  out.escaped(text);
  out.literal("\", ");
}

inline void hexadecimal(Line& out, std::string_view bytes) {
  out.literal("\"<");
  out.hexadecimal(bytes);
  out.literal(">\", ");
}

// After the last element, behind which ", " stands unless there is none.
inline void close(Line& out, std::string_view end) {
  if (out.last() == ' ') out.back(2);
  out.append(end);
}

inline void appendTime(Line& out, const std::optional<std::uint64_t>& timestamp,
                       std::string_view time) {
  if (!timestamp) return;
  out.literal("\"timestamp\": ");
  if (time.empty()) {
    out.number(*timestamp);
  } else {
    out.literal("\"");
    out.append(time);
    out.literal("\", ");
  }
}

}  // namespace qel::bench::plain
