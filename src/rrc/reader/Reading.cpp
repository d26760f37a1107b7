#include "rrc/reader/Reading.h"

#include "rrc/reader/BitReader.h"

namespace qel::rrc {

const Found& Node::found() const { return _reading->found[_index]; }

Mark Node::mark() const { return _reading ? found().mark : Mark::none; }

Node Node::operator[](Mark mark) const {
  Node result;
  each([&](const Node& node) {
    if (!result && node.mark() == mark) result = node;
  });
  return result;
}

Node Node::first() const {
  if (!_reading || found().end == _index + 1) return {};
  return {*_reading, _index + 1};
}

std::optional<std::int64_t> Node::index() const {
  if (!_reading) return std::nullopt;
  return found().value;
}

std::optional<std::int64_t> Node::number() const {
  if (!_reading) return std::nullopt;
  const Type& type = _reading->schema()[found().type];
  const std::int64_t value = found().value;
  switch (type.kind) {
    case Kind::boolean:
    case Kind::integer:
      return value;
    case Kind::bits:
      return found().bits <= 64 ? std::optional(value) : std::nullopt;
    case Kind::enumerated: {
      if (type.count == 0) return value;
      if (value >= type.count) return std::nullopt;
      const auto number = _reading->schema().numbers[type.first + static_cast<std::size_t>(value)];
      return number != kNoNumber ? std::optional(number) : std::nullopt;
    }
    default:
      return std::nullopt;
  }
}

Bytes Node::octets() const {
  if (!_reading) return {};
  BitReader reader(_reading->message());
  reader.skip(found().bit);
  Bytes bytes(found().bits / 8);
  for (auto& byte : bytes) byte = static_cast<std::uint8_t>(reader.bits(8));
  return bytes;
}

BitRange Node::bits() const {
  if (!_reading) return {};
  return {_reading->message(), found().bit, found().bits};
}

}  // namespace qel::rrc
