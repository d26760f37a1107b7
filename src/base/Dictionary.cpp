#include "base/Value.h"

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "base/FatalError.h"

namespace qel {

Dictionary::Dictionary(std::initializer_list<Entry> entries) {
  reserve(entries.size());
  for (const Entry& entry : entries) set(entry.key, entry.value);
}

const Dictionary::Entry& Dictionary::at(std::size_t position) const {
  if (position >= _entries.size()) {
    fatalError("entry " + std::to_string(position) + " of a record with " +
               std::to_string(_entries.size()) + " entries");
  }
  return _entries[position];
}

namespace {

std::uint64_t eightAt(const char* at) {
  std::uint64_t word = 0;
  std::memcpy(&word, at, sizeof word);
  return word;
}

constexpr std::size_t kWord = sizeof(std::uint64_t);

// A key, and its two ends as numbers: most keys have eight to sixteen characters, of which they are
// all.
struct Wanted {
  explicit Wanted(std::string_view key)
      : data(key.data()),
        size(key.size()),
        first(eightAt(data)),
        last(eightAt(data + size - kWord)) {}
  static bool suits(std::string_view key) { return key.size() - kWord <= kWord; }

  bool isOf(const Dictionary::Entry& entry) const {
    const std::string_view other = entry.key;
    if (other.size() != size) return false;
    return other.data() == data ||
           (eightAt(other.data()) == first && eightAt(other.data() + size - kWord) == last);
  }

  const char* data;
  std::size_t size;
  std::uint64_t first;
  std::uint64_t last;
};

// Apart, so that the usual search calls nothing.
[[gnu::noinline]] const Dictionary::Entry* searchAnyKey(const Dictionary& dictionary,
                                                        std::string_view key) {
  for (const Dictionary::Entry& entry : dictionary) {
    if (entry.key.view() == key) return &entry;
  }
  return nullptr;
}

// The entry under the key, or null.
const Dictionary::Entry* search(const Dictionary& dictionary, std::string_view key) {
  if (!Wanted::suits(key)) return searchAnyKey(dictionary, key);
  const Wanted wanted(key);
  for (const Dictionary::Entry& entry : dictionary) {
    if (wanted.isOf(entry)) return &entry;
  }
  return nullptr;
}

bool isUnder(const Dictionary::Entry& entry, std::string_view key) {
  return Wanted::suits(key) ? Wanted(key).isOf(entry) : entry.key.view() == key;
}

}  // namespace

const Value* Dictionary::find(std::string_view key) const {
  const Entry* found = search(*this, key);
  return found ? &found->value : nullptr;
}

Value* Dictionary::find(std::string_view key) {
  const Entry* found = search(*this, key);
  return found ? &_entries[static_cast<std::size_t>(found - begin())].value : nullptr;
}

Value* Dictionary::find(std::string_view key, std::size_t& place) {
  if (place >= size() || !isUnder(begin()[place], key)) {
    const Entry* found = search(*this, key);
    if (!found) return nullptr;
    place = static_cast<std::size_t>(found - begin());
  }
  return &_entries[place].value;
}

void Dictionary::set(Text key, Value value) {
  if (Value* present = find(key)) {
    *present = std::move(value);
  } else {
    append(std::move(key), std::move(value));
  }
}

void Dictionary::remove(std::string_view key) {
  const Entry* found = search(*this, key);
  if (found) _entries.erase(_entries.begin() + (found - begin()));
}

void Dictionary::assign(Text key, const Value* value) {
  if (value) {
    set(std::move(key), *value);
  } else {
    remove(key);
  }
}

bool operator==(const Dictionary& a, const Dictionary& b) {
  return a.size() == b.size() && std::all_of(a.begin(), a.end(), [&b](const auto& entry) {
           const Value* other = b.find(entry.key);
           return other && *other == entry.value;
         });
}

}  // namespace qel
