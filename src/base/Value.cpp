#include "base/Value.h"

#include <cmath>
#include <limits>
#include <new>

namespace qel {

Value::Value(Bytes value) : _kind(Kind::bytes), _owns(true) {
  _as.bytes = new (SmallBlocks::take(sizeof(Bytes))) Bytes(std::move(value));
}

void Value::copy(const Value& other) {
  switch (other._kind) {
    case Kind::text:
      new (this) Value(*other.asText());
      break;
    case Kind::bytes:
      new (this) Value(*other._as.bytes);
      break;
    case Kind::list:
      new (this) Value(other._as.list);
      break;
    case Kind::dictionary:
      new (this) Value(other._as.dictionary);
      break;
    default:
      break;
  }
}

// Apart, so that the rest of destroy keeps nothing over a call.
void Value::destroyBytes() {
  _as.bytes->~Bytes();
  SmallBlocks::give(_as.bytes, sizeof(Bytes));
}

void Value::destroy() {
  switch (_kind) {
    case Kind::text:
      SmallBlocks::give(const_cast<char*>(_as.characters), _size);
      break;
    case Kind::bytes:
      destroyBytes();
      break;
    case Kind::list:
      _as.list.~List();
      break;
    case Kind::dictionary:
      _as.dictionary.~Dictionary();
      break;
    default:
      break;
  }
}

std::optional<std::uint64_t> Value::otherAsUInt64() const {
  const auto narrow = asInt64();
  if (!narrow || *narrow < 0) return std::nullopt;
  return static_cast<std::uint64_t>(*narrow);
}

std::optional<std::int64_t> Value::otherAsInt64() const {
  if (_kind == Kind::unsignedInteger &&
      _as.unsignedInteger <= std::uint64_t{std::numeric_limits<std::int64_t>::max()}) {
    return static_cast<std::int64_t>(_as.unsignedInteger);
  }
  if (_kind == Kind::floating && std::trunc(_as.floating) == _as.floating &&
      _as.floating >= -0x1p63F && _as.floating < 0x1p63F) {
    return static_cast<std::int64_t>(_as.floating);
  }
  return std::nullopt;
}

std::optional<std::int32_t> Value::asInt32() const {
  const auto wide = asInt64();
  if (!wide || *wide < std::numeric_limits<std::int32_t>::min() ||
      *wide > std::numeric_limits<std::int32_t>::max()) {
    return std::nullopt;
  }
  return static_cast<std::int32_t>(*wide);
}

std::optional<float> Value::otherAsFloat() const {
  // Every integer up to 2^64 is below the range of single precision; only its digits may not fit.
  if (_kind == Kind::signedInteger) {
    const float rounded = static_cast<float>(_as.signedInteger);
    if (rounded < 0x1p63F && static_cast<std::int64_t>(rounded) == _as.signedInteger)
      return rounded;
  }
  if (_kind == Kind::unsignedInteger) {
    const float rounded = static_cast<float>(_as.unsignedInteger);
    if (rounded < 0x1p64F && static_cast<std::uint64_t>(rounded) == _as.unsignedInteger) {
      return rounded;
    }
  }
  return std::nullopt;
}

std::optional<double> Value::asDouble() const {
  switch (_kind) {
    case Kind::signedInteger:
      return static_cast<double>(_as.signedInteger);
    case Kind::unsignedInteger:
      return static_cast<double>(_as.unsignedInteger);
    case Kind::floating:
      return _as.floating;
    default:
      return std::nullopt;
  }
}

bool operator==(const Value& a, const Value& b) {
  using Kind = Value::Kind;
  if (a._kind != b._kind) {
    const auto integral = [](Kind kind) {
      return kind == Kind::signedInteger || kind == Kind::unsignedInteger;
    };
    return integral(a._kind) && integral(b._kind) && a.asInt64() && a.asInt64() == b.asInt64();
  }
  switch (a._kind) {
    case Kind::null:
      return true;
    case Kind::boolean:
      return a._as.boolean == b._as.boolean;
    case Kind::signedInteger:
      return a._as.signedInteger == b._as.signedInteger;
    case Kind::unsignedInteger:
      return a._as.unsignedInteger == b._as.unsignedInteger;
    case Kind::floating:
      return a._as.floating == b._as.floating;
    case Kind::text:
      return a._size == b._size && (a._as.characters == b._as.characters ||
                                    std::memcmp(a._as.characters, b._as.characters, a._size) == 0);
    case Kind::bytes:
      return *a._as.bytes == *b._as.bytes;
    case Kind::list:
      return a._as.list == b._as.list;
    case Kind::dictionary:
      return a._as.dictionary == b._as.dictionary;
  }
  return false;
}

}  // namespace qel
