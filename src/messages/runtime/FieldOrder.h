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

// Whether the field's value is one varint.
template <class Field>
inline constexpr bool kIsVarint = kWireType<Field> == 0;

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

// Gives the field with this index to the target if it comes next. Whether reading is over: a field
// takes two bytes at least, so what stands at the `last` one is none that is in order.
template <class Message, std::size_t index, class Target>
[[gnu::always_inline]] inline bool readExpected(Target& target, Cursor& cursor,
                                                const std::uint8_t* last) {
  constexpr auto& field = std::get<index>(kFieldsOf<Message>);
  using Field = std::remove_cvref_t<decltype(field)>;
  using FieldTag = Tag<field.number << 3 | kWireType<Field>>;
  // A number that may be a metric's is left to the rules for any order.
  if constexpr (!KBBMetricUtility::mayBeMetric(field.number)) {
    if ((Target::kStopsAtEnd || cursor.at < last) && FieldTag::standsAt(cursor)) {
      const Cursor behind = FieldTag::behind(cursor);
      if constexpr (kIsVarint<Field>) {
        const auto [value, next] =
            FieldTag::kSize == 1 ? readVarintHere(behind) : readVarint(behind);
        target.template set<index>(field, value);
        cursor.at = next;
      } else {
        cursor = target.template read<FieldTag, index>(behind, field);
      }
      return Target::kStopsAtEnd && cursor.at >= last;
    }
  }
  target.template leaveOut<index>(field);
  return false;
}

template <class Message, class Target, std::size_t... index>
[[gnu::always_inline]] inline Cursor readInOrder(Target& target, Cursor cursor,
                                                 std::index_sequence<index...>) {
  if (Target::kStopsAtEnd && cursor.left() < 2) return cursor;
  const bool isEmpty = !Target::kStopsAtEnd && cursor.isAtEnd();
  const std::uint8_t* const last = isEmpty ? cursor.end : cursor.end - 1;
  static_cast<void>((readExpected<Message, index>(target, cursor, last) || ...));
  return cursor;
}

// Goes through the fields of the class once and gives those that are there to the target, which has
//   set<index>(field, varint)          the value of a field that is a varint; 0 where damaged
//   read<Tag, index>(Cursor, field)    reads what stands behind the tag, a repeated field whole;
//                                      gives the place behind it
//   leaveOut<index>(field)             the field is not there
//   kStopsAtEnd                        whether it need not hear of absent fields behind the last
// Stops in front of what is not in order.
template <class Message, class Target>
[[gnu::always_inline]] inline Cursor readInOrder(Target& target, Cursor cursor) {
  constexpr std::size_t kFieldCount = std::tuple_size_v<FieldsOf<Message>>;
  return readInOrder<Message>(target, cursor, std::make_index_sequence<kFieldCount>());
}

}  // namespace qel
