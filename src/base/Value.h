// The plain values that metrics, events and requests are made of.
#pragma once

#include <concepts>
#include <cstdint>
#include <cstring>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "base/Bytes.h"
#include "base/Text.h"

namespace qel {

class Value;
class Dictionary;
using List = std::vector<Value>;

// One value, owned. Copying copies everything below it. Two values are equal when they are of the
// same kind and hold the same; a signed and an unsigned integer of the same number are equal.
class Value {
 public:
  // Those from text on own something.
  enum class Kind : std::uint8_t {
    null,
    boolean,
    signedInteger,
    unsignedInteger,
    floating,
    text,
    bytes,
    list,
    dictionary,
  };

  Value() = default;
  Value(bool value) : _kind(Kind::boolean) { _as.boolean = value; }
  template <std::signed_integral T>
  Value(T value) : _kind(Kind::signedInteger) {
    _as.signedInteger = value;
  }
  template <std::unsigned_integral T>
  Value(T value) : _kind(Kind::unsignedInteger) {
    _as.unsignedInteger = value;
  }
  Value(float value) : _kind(Kind::floating) { _as.floating = value; }
  Value(double) = delete;  // values are single precision: convert in sight
  Value(Text value) : _kind(Kind::text) { new (&_as.text) Text(std::move(value)); }
  Value(std::string_view value) : Value(Text(value)) {}
  Value(const std::string& value) : Value(Text(value)) {}
  Value(const char* value) : Value(Text(value)) {}
  Value(Bytes value);
  Value(List value);
  Value(Dictionary value);
  Value(const void*) = delete;

  Value(const Value& other);
  Value(Value&& other) noexcept : _kind(std::exchange(other._kind, Kind::null)) {
    _as.takeOver(other._as);
  }
  Value& operator=(const Value& other);
  Value& operator=(Value&& other) noexcept;
  ~Value() {
    if (_kind >= Kind::text) destroy();
  }

  Kind kind() const { return _kind; }
  bool isNull() const { return _kind == Kind::null; }

  // The held value when it is of that kind, else nothing.
  std::optional<bool> asBoolean() const;
  std::optional<std::string_view> asText() const;
  const Bytes* asBytes() const { return _kind == Kind::bytes ? _as.bytes : nullptr; }
  const List* asList() const { return _kind == Kind::list ? _as.list : nullptr; }
  const Dictionary* asDictionary() const {
    return _kind == Kind::dictionary ? _as.dictionary : nullptr;
  }

  // Numbers by what they can stand for. A boolean is not a number.
  std::optional<std::uint64_t> asUInt64() const;  // any integer that is not negative
  std::optional<std::int64_t> asInt64() const;    // any integer that fits 64 bits signed
  std::optional<std::int32_t> asInt32() const;    // any integer that fits 32 bits signed
  std::optional<float> asFloat() const;           // any number exact in single precision
  std::optional<double> asDouble() const;         // any number, rounded to double precision

  friend bool operator==(const Value& a, const Value& b);

 private:
  void destroy();

  union Storage {
    Storage() : unsignedInteger(0) {}
    ~Storage() {}
    // Byte for byte; whatever the other one owns is then this one's.
    void takeOver(const Storage& other) {
      std::memcpy(static_cast<void*>(this), static_cast<const void*>(&other), sizeof *this);
    }
    bool boolean;
    std::int64_t signedInteger;
    std::uint64_t unsignedInteger;
    float floating;
    Text text;
    Bytes* bytes;
    List* list;
    Dictionary* dictionary;
  } _as;
  Kind _kind = Kind::null;
};

}  // namespace qel
