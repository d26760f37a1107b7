#include "base/Dictionary.h"

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

const Value* Dictionary::find(std::string_view key) const {
  for (const Entry& entry : _entries) {
    if (entry.key.view() == key) return &entry.value;
  }
  return nullptr;
}

Value* Dictionary::find(std::string_view key) {
  return const_cast<Value*>(std::as_const(*this).find(key));
}

void Dictionary::set(Text key, Value value) {
  if (Value* present = find(key)) {
    *present = std::move(value);
  } else {
    append(std::move(key), std::move(value));
  }
}

void Dictionary::remove(std::string_view key) {
  std::erase_if(_entries, [key](const Entry& entry) { return entry.key.view() == key; });
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
