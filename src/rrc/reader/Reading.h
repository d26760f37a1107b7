// What the walker found of a message: the marked fields, as a tree in the order of the message.
//
// A field that is not marked is not there; what is marked inside of it hangs on the nearest marked
// field around it. Nodes look into their Reading, which looks into the message's bytes: both must
// outlive them.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "rrc/reader/Schema.h"

namespace qel::rrc {

struct Found {
  Mark mark = Mark::none;
  TypeIndex type = TypeIndex::none;
  std::uint32_t end = 0;   // behind the last found inside of it
  std::int64_t value = 0;  // integer, boolean; index of an enumerated value or of an alternative;
                           // elements of a list; up to 64 bits
  std::uint32_t bit = 0;   // bits, octets: where they begin in the message …
  std::uint32_t bits = 0;  // … and how many there are
};

class Reading;

// A string of bits inside of a message.
struct BitRange {
  ByteView message;
  std::size_t first = 0;
  std::size_t count = 0;

  bool at(std::size_t index) const {
    const std::size_t bit = first + index;
    return (message[bit / 8] >> (7 - bit % 8) & 1) != 0;
  }
};

class Node {
 public:
  Node() = default;
  Node(const Reading& reading, std::size_t index) : _reading(&reading), _index(index) {}

  explicit operator bool() const { return _reading != nullptr; }
  Mark mark() const;

  // The first with that mark directly below; none gives a node that is none.
  Node operator[](Mark mark) const;
  // The first of all directly below.
  Node first() const;
  // Calls `visit` with each node directly below.
  template <class Visit>
  void each(Visit&& visit) const;

  // Nothing when it is none, holds no number, or is enumerated and stands for none.
  std::optional<std::int64_t> number() const;
  // An enumerated value's place, or an alternative's.
  std::optional<std::int64_t> index() const;
  // A whole number of bytes; empty when it is none.
  Bytes octets() const;
  // Of a string; without bits when it is none.
  BitRange bits() const;

 private:
  const Found& found() const;

  const Reading* _reading = nullptr;
  std::size_t _index = 0;
};

class Reading {
 public:
  Reading(const Schema& schema, ByteView message) : _schema(&schema), _message(message) {}

  // The message itself; everything hangs on it.
  Node top() const { return {*this, 0}; }

  const Schema& schema() const { return *_schema; }
  ByteView message() const { return _message; }

  std::vector<Found> found;  // the first is the message; filled by the walker

 private:
  const Schema* _schema;
  ByteView _message;
};

// Puts a number where it belongs; leaves the place alone when there is none.
template <class Number>
void take(const Node& node, Number& into) {
  if (const auto number = node.number()) into = static_cast<Number>(*number);
}
template <class Number>
void take(const Node& node, std::optional<Number>& into) {
  if (const auto number = node.number()) into = static_cast<Number>(*number);
}

template <class Visit>
void Node::each(Visit&& visit) const {
  if (!_reading) return;
  const std::vector<Found>& found = _reading->found;
  for (std::size_t i = _index + 1; i < found[_index].end; i = found[i].end) {
    visit(Node(*_reading, i));
  }
}

}  // namespace qel::rrc
