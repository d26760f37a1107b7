#include "base/Value.h"

#include <algorithm>

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

// Most keys that differ do so in length or in their first character.
bool isUnder(const Dictionary::Entry& entry, std::string_view key) {
  const std::string_view other = entry.key;
  return other.size() == key.size() &&
         (key.empty() || (other.front() == key.front() && other == key));
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
