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

// Both are so long. Most keys have eight to sixteen characters: their ends are all of them.
bool areSame(const char* a, const char* b, std::size_t size) {
  constexpr std::size_t kWord = sizeof(std::uint64_t);
  if (a == b) return true;
  if (size < kWord || size > 2 * kWord) return std::memcmp(a, b, size) == 0;
  const std::size_t last = size - kWord;
  return eightAt(a) == eightAt(b) && eightAt(a + last) == eightAt(b + last);
}

bool isUnder(const Dictionary::Entry& entry, std::string_view key) {
  const std::string_view other = entry.key;
  return other.size() == key.size() && areSame(other.data(), key.data(), key.size());
}

// The entry under the key, or the end.
const Dictionary::Entry* search(const Dictionary& dictionary, std::string_view key) {
  return std::ranges::find_if(dictionary, [key](const auto& entry) { return isUnder(entry, key); });
}

}  // namespace

const Value* Dictionary::find(std::string_view key) const {
  const Entry* found = search(*this, key);
  return found == end() ? nullptr : &found->value;
}

Value* Dictionary::find(std::string_view key) {
  const Entry* found = search(*this, key);
  return found == end() ? nullptr : &_entries[static_cast<std::size_t>(found - begin())].value;
}

Value* Dictionary::find(std::string_view key, std::size_t& place) {
  if (place >= size() || !isUnder(begin()[place], key)) {
    const Entry* found = search(*this, key);
    if (found == end()) return nullptr;
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
  if (found != end()) _entries.erase(_entries.begin() + (found - begin()));
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
