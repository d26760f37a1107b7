// The plain values that metrics, events and requests are made of.
#pragma once

#include <concepts>
#include <cstdint>
#include <cstring>
#include <initializer_list>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "base/Bytes.h"
#include "base/Sequence.h"
#include "base/Text.h"

namespace qel {

class Value;
using List = Sequence<Value>;

// An ordered dictionary: keys in the order in which they came. Small by nature (at most some thirty
// entries), so a flat row of entries searched from the front. Equal when the same keys hold equal
// values, in whatever order.
class Dictionary {
 public:
  struct Entry;
  using Entries = Sequence<Entry>;

  Dictionary() = default;
  Dictionary(std::initializer_list<Entry> entries);

  std::size_t size() const;
  bool empty() const { return size() == 0; }
  const Entry* begin() const;
  const Entry* end() const;

  // Entry by position, in key order. A position outside is a fatal error.
  const Entry& at(std::size_t position) const;

  // The value under the key, or nothing. Valid until the dictionary changes.
  const Value* find(std::string_view key) const;
  Value* find(std::string_view key);
  // The same for dictionaries that are alike: looks first at the place where the key was found
  // last.
  Value* find(std::string_view key, std::size_t& place);
  bool contains(std::string_view key) const { return find(key) != nullptr; }

  // Replaces the value in its place, or appends the entry.
  void set(Text key, Value value);
  // Appends without a look: the key must be new.
  void append(Text key, Value value);
  void remove(std::string_view key);
  // Sets the value, or removes the key where there is none.
  void assign(Text key, const Value* value);

  void reserve(std::size_t entries);
  void clear();
  // For filling: entries whose keys are new.
  Entries& entries() { return _entries; }

  friend bool operator==(const Dictionary& a, const Dictionary& b);

 private:
  Entries _entries;
};

// One value, owned. Copying copies everything below it. Two values are equal when they are of the
// same kind and hold the same; a signed and an unsigned integer of the same number are equal.
class Value {
 public:
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
  Value(Text value) : _kind(Kind::text), _owns(value._owned != 0), _size(value._size) {
    _as.characters = value._data;
    value._owned = 0;
  }
  Value(Name value) : Value(Text(value)) {}
  Value(std::string_view value) : Value(Text(value)) {}
  Value(const std::string& value) : Value(Text(value)) {}
  Value(const char* value) : Value(Text(value)) {}
  Value(Bytes value);
  Value(List value) : _kind(Kind::list), _owns(true) { new (&_as.list) List(std::move(value)); }
  Value(Dictionary value) : _kind(Kind::dictionary), _owns(true) {
    new (&_as.dictionary) Dictionary(std::move(value));
  }
  Value(const void*) = delete;

  Value(const Value& other) {
    if (other._owns) {
      copy(other);
    } else {
      takeOver(other);
    }
  }
  Value(Value&& other) noexcept {
    takeOver(other);
    other._kind = Kind::null;
    other._owns = false;
  }
  Value& operator=(const Value& other) { return *this = Value(other); }
  Value& operator=(Value&& other) noexcept {
    Value taken(std::move(other));  // `other` may live below this value
    if (_owns) destroy();
    takeOver(taken);
    taken._owns = false;
    return *this;
  }
  ~Value() {
    if (_owns) destroy();
  }

  Kind kind() const { return _kind; }
  // Whether it is all there is, without memory of its own elsewhere.
  bool ownsNothing() const { return !_owns; }
  bool isNull() const { return _kind == Kind::null; }

  // The held value when it is of that kind, else nothing.
  std::optional<bool> asBoolean() const {
    if (_kind != Kind::boolean) return std::nullopt;
    return _as.boolean;
  }
  std::optional<std::string_view> asText() const {
    if (_kind != Kind::text) return std::nullopt;
    return std::string_view(_as.characters, _size);
  }
  // The text made from a name (or no text), which needs no escaping anywhere.
  bool isName() const { return _kind == Kind::text && !_owns; }
  const Bytes* asBytes() const { return _kind == Kind::bytes ? _as.bytes : nullptr; }
  const List* asList() const { return _kind == Kind::list ? &_as.list : nullptr; }
  const Dictionary* asDictionary() const {
    return _kind == Kind::dictionary ? &_as.dictionary : nullptr;
  }
  // The list or the dictionary, to add to; an empty one in place of whatever else is held.
  List& growingList() {
    if (_kind != Kind::list) *this = List();
    return _as.list;
  }
  Dictionary& growingDictionary() {
    if (_kind != Kind::dictionary) *this = Dictionary();
    return _as.dictionary;
  }

  // Numbers by what they can stand for. A boolean is not a number.
  std::optional<std::uint64_t> asUInt64() const {  // any integer that is not negative
    if (_kind == Kind::unsignedInteger) return _as.unsignedInteger;
    return otherAsUInt64();
  }
  std::optional<std::int64_t> asInt64() const {  // any integer that fits 64 bits signed
    if (_kind == Kind::signedInteger) return _as.signedInteger;
    return otherAsInt64();
  }
  std::optional<std::int32_t> asInt32() const;  // any integer that fits 32 bits signed
  std::optional<float> asFloat() const {        // any number exact in single precision
    if (_kind == Kind::floating) return _as.floating;
    return otherAsFloat();
  }
  std::optional<double> asDouble() const;  // any number, rounded to double precision

  friend bool operator==(const Value& a, const Value& b);

 private:
  std::optional<std::uint64_t> otherAsUInt64() const;
  std::optional<std::int64_t> otherAsInt64() const;
  std::optional<float> otherAsFloat() const;
  void copy(const Value& other);
  void destroy();
  [[gnu::noinline]] void destroyBytes();
  // Byte for byte; what the other one owns is then also this one's.
  void takeOver(const Value& other) {
    std::memcpy(static_cast<void*>(this), static_cast<const void*>(&other), sizeof *this);
  }

  union Storage {
    Storage() : unsignedInteger(0) {}
    ~Storage() {}
    bool boolean;
    std::int64_t signedInteger;
    std::uint64_t unsignedInteger;
    float floating;
    const char* characters;
    Bytes* bytes;
    List list;
    Dictionary dictionary;
  } _as;
  // In this order, and without a gap, all of a number's are one small number to store.
  Kind _kind = Kind::null;
  bool _owns = false;  // whether there is something to give back
  std::uint16_t _unused = 0;
  std::uint32_t _size = 0;  // of a text
};

static_assert(sizeof(Value) == 16);

struct Dictionary::Entry {
  bool ownsNothing() const { return key.isName() && value.ownsNothing(); }

  Text key;
  Value value;
};

inline std::size_t Dictionary::size() const { return _entries.size(); }
inline const Dictionary::Entry* Dictionary::begin() const { return _entries.begin(); }
inline const Dictionary::Entry* Dictionary::end() const { return _entries.end(); }
inline void Dictionary::append(Text key, Value value) {
  _entries.emplace_back(std::move(key), std::move(value));
}
inline void Dictionary::reserve(std::size_t entries) { _entries.reserve(entries); }
inline void Dictionary::clear() { _entries.clear(); }

}  // namespace qel
