// An ordered dictionary: keys in the order in which they came.
#pragma once

#include <initializer_list>
#include <string_view>
#include <vector>

#include "base/Text.h"
#include "base/Value.h"

namespace qel {

// Small by nature (at most some thirty entries), so a flat row of entries searched from the front.
// Equal when the same keys hold equal values, in whatever order.
class Dictionary {
 public:
  struct Entry {
    Text key;
    Value value;
  };

  Dictionary() = default;
  Dictionary(std::initializer_list<Entry> entries);

  std::size_t size() const { return _entries.size(); }
  bool empty() const { return _entries.empty(); }
  auto begin() const { return _entries.begin(); }
  auto end() const { return _entries.end(); }

  // Entry by position, in key order. A position outside is a fatal error.
  const Entry& at(std::size_t position) const;

  // The value under the key, or nothing. Valid until the dictionary changes.
  const Value* find(std::string_view key) const;
  Value* find(std::string_view key);
  bool contains(std::string_view key) const { return find(key) != nullptr; }

  // Replaces the value in its place, or appends the entry.
  void set(Text key, Value value);
  // Appends without a look: the key must be new.
  void append(Text key, Value value) { _entries.push_back({std::move(key), std::move(value)}); }
  void remove(std::string_view key);
  // Sets the value, or removes the key where there is none.
  void assign(Text key, const Value* value);

  void reserve(std::size_t entries) { _entries.reserve(entries); }
  void clear() { _entries.clear(); }

  friend bool operator==(const Dictionary& a, const Dictionary& b);

 private:
  std::vector<Entry> _entries;
};

}  // namespace qel
