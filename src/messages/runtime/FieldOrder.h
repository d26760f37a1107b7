// Reading fields in the order in which they are written, which is that of nearly all payloads.
#pragma once

#include <cstdint>
#include <tuple>
#include <type_traits>
#include <utility>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/runtime/Cursor.h"
#include "messages/runtime/Fields.h"

namespace qel {

// The value that a varint on the wire stands for.
template <Encoding encoding>
auto decodedScalar(std::uint64_t varint) {
  const auto low = static_cast<std::uint32_t>(varint);
  if constexpr (encoding == Encoding::uint64) return varint;
  if constexpr (encoding == Encoding::uint32) return low;
  if constexpr (encoding == Encoding::int32) return static_cast<std::int32_t>(low);
  if constexpr (encoding == Encoding::sint32) {
    return static_cast<std::int32_t>(low >> 1 ^ (0U - (low & 1)));
  }
  if constexpr (encoding == Encoding::boolean) return varint != 0;
}

// The part of the input that a varint length in front of it gives; damaged when it is not all
// there.
[[gnu::always_inline]] inline Cursor readDelimited(Cursor cursor) {
  const auto [length, next] = readVarint(cursor);
  if (next > cursor.end || length > static_cast<std::uint64_t>(cursor.end - next)) {
    return Cursor::damaged();
  }
  return {next, next + length};
}

// Makes room for the elements of a repeated message field, which seldom has more; the first of them
// stands here. A few bytes cannot hold as many: room for no more than they can is what keeps memory
// in proportion to the input.
template <class Elements>
[[gnu::always_inline]] inline void reserveUsual(Elements& elements, Cursor cursor) {
  constexpr std::size_t kUsualCount = 8;
  if (cursor.left() >= kUsualCount) [[likely]] {
    elements.reserve(kUsualCount);
  } else {
    elements.reserve(cursor.left() / 2 + 1);
  }
}

// The wire type with which a field is written.
template <class Field>
inline constexpr std::uint32_t kWireType = 2;
template <class Message, class T, Encoding encoding>
inline constexpr std::uint32_t kWireType<ScalarField<Message, T, encoding>> = 0;
template <class Message>
inline constexpr std::uint32_t kWireType<EnumField<Message>> = 0;

// A tag in as few bytes as it needs.
template <std::uint32_t tag>
struct Tag {
  static_assert(tag < 1U << 14, "field numbers of messages are below 2048");
  static constexpr std::ptrdiff_t kSize = tag < 0x80 ? 1 : 2;

  // Whether it stands here. There is at least one byte.
  static bool standsAt(Cursor cursor) {
    if constexpr (kSize == 1) return cursor.at[0] == tag;
    return cursor.at[0] == ((tag & 0x7F) | 0x80) && cursor.left() >= 2 && cursor.at[1] == tag >> 7;
  }
  static Cursor behind(Cursor cursor) { return {cursor.at + kSize, cursor.end}; }
};

// Gives the field with this index to the target if it comes next. Whether reading is over.
template <class Message, std::size_t index, class Target>
[[gnu::always_inline]] inline bool readExpected(Target& target, Cursor& cursor) {
  constexpr auto& field = std::get<index>(kFieldsOf<Message>);
  using Field = std::remove_cvref_t<decltype(field)>;
  using FieldTag = Tag<field.number << 3 | kWireType<Field>>;
  // A number that may be a metric's is left to the rules for any order.
  if constexpr (!KBBMetricUtility::mayBeMetric(field.number)) {
    if ((Target::kStopsAtEnd || !cursor.isAtEnd()) && FieldTag::standsAt(cursor)) {
      cursor = target.template read<FieldTag>(FieldTag::behind(cursor), field);
      return Target::kStopsAtEnd && cursor.isAtEnd();
    }
  }
  target.leaveOut(field);
  return false;
}

template <class Message, class Target, std::size_t... index>
[[gnu::always_inline]] inline Cursor readInOrder(Target& target, Cursor cursor,
                                                 std::index_sequence<index...>) {
  if (Target::kStopsAtEnd && cursor.isAtEnd()) return cursor;
  static_cast<void>((readExpected<Message, index>(target, cursor) || ...));
  return cursor;
}

// Goes through the fields of the class once and gives those that are there to the target, which has
//   Cursor read<Tag>(Cursor, field)  reads what stands behind the tag; a repeated field whole
//   void leaveOut(field)             the field is not there
//   kStopsAtEnd                      whether it need not hear of absent fields behind the last one
// Stops in front of what is not in order.
template <class Message, class Target>
[[gnu::always_inline]] inline Cursor readInOrder(Target& target, Cursor cursor) {
  constexpr std::size_t kFieldCount = std::tuple_size_v<FieldsOf<Message>>;
  return readInOrder<Message>(target, cursor, std::make_index_sequence<kFieldCount>());
}

}  // namespace qel
