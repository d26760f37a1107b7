// A key of records that are alike.
#pragma once

#include <cstdint>
#include <string_view>

#include "base/Value.h"

namespace qel {

// Looks first where the key was found last: records of one metric have the same keys, names of the
// program, mostly in the same places. No record has the empty key.
class KnownPlace {
 public:
  explicit KnownPlace(Name key) : _key(key) {}

  const Value* in(const Dictionary& record) { return in(record, record.begin(), record.size()); }
  // The same, for who looks for many.
  const Value* in(const Dictionary& record, const Dictionary::Entry* entries, std::size_t size) {
    if (_place < size) {
      const Dictionary::Entry& entry = entries[_place];
      if (entry.key.view().data() == _found) return &entry.value;
    }
    return search(record);
  }

 private:
  [[gnu::noinline]] const Value* search(const Dictionary& record) {
    if (_key.empty()) return nullptr;
    for (const Dictionary::Entry& entry : record) {
      if (entry.key.view() != _key.view()) continue;
      _place = static_cast<std::size_t>(&entry - record.begin());
      _found = entry.key.isName() ? entry.key.view().data() : nullptr;
      return &entry.value;
    }
    return nullptr;
  }

  Name _key;
  const char* _found = nullptr;
  std::size_t _place = 0;
};

}  // namespace qel
