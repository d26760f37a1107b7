// The messages of the baseband manager: string keys, typed values, in order.
#pragma once

#include <cstdint>
#include <string_view>
#include <utility>

#include "base/Bytes.h"
#include "base/Value.h"

namespace tesk {

// A request, a reply or an event. Integers travel as 64-bit signed integers, data as bytes; a null
// stands where a value could not be made.
class Message {
 public:
  Message() = default;
  explicit Message(qel::Dictionary entries) : _entries(std::move(entries)) {}

  void setInt64(std::string_view key, std::int64_t value) { _entries.set(key, value); }
  void setData(std::string_view key, qel::Bytes value) { _entries.set(key, std::move(value)); }
  void setNull(std::string_view key) { _entries.set(key, qel::Value()); }

  const qel::Dictionary& entries() const& { return _entries; }
  qel::Dictionary entries() && { return std::move(_entries); }

 private:
  qel::Dictionary _entries;
};

// The message as a plain dictionary, key for key.
qel::Dictionary createDictionaryFromMessage(const Message& message);

}  // namespace tesk
