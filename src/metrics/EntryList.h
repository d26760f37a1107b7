// A list of the store: one dictionary for each entry of a report's list.
#pragma once

#include <cstddef>
#include <initializer_list>
#include <utility>

#include "base/Value.h"
#include "metrics/BandwidthTable.h"

namespace qel {

struct ListCopy;

// As a Sequence of dictionaries in what it has of one. A report's list is copied into it when
// somebody looks first: most reports are replaced by the next before anybody does. One thread; a
// copy of it owes nothing to the report.
class EntryList {
 public:
  using Entries = Sequence<Dictionary>;
  using value_type = Dictionary;
  using const_iterator = Entries::const_iterator;

  EntryList() = default;
  EntryList(std::initializer_list<Dictionary> entries) : _entries(entries) {}
  EntryList(std::size_t count, const Dictionary& entry) : _entries(count, entry) {}
  EntryList(const EntryList& other) : _entries(other.entries()) {}
  EntryList& operator=(const EntryList& other) {
    _entries = Entries(other.entries());
    _due = {};
    return *this;
  }

  // All that was in it goes. What is given outlives the list; until somebody looks, the record
  // stays as it is or is the next one that this is called for.
  void copyLater(const ListCopy& copy, const Dictionary& record, const BandwidthTable& bandwidths) {
    _due = {&copy, &record, &bandwidths};
  }

  std::size_t size() const { return entries().size(); }
  bool empty() const { return size() == 0; }
  const Dictionary* begin() const { return entries().begin(); }
  const Dictionary* end() const { return entries().end(); }
  const Dictionary& operator[](std::size_t index) const { return entries()[index]; }

  Dictionary* begin() { return entries().begin(); }
  Dictionary* end() { return entries().end(); }
  void push_back(Dictionary entry) { entries().push_back(std::move(entry)); }
  void clear() {
    _entries.clear();
    _due = {};
  }

  friend bool operator==(const EntryList& a, const EntryList& b) {
    return a.entries() == b.entries();
  }

 private:
  // What is still to be copied, if anything.
  struct Due {
    const ListCopy* copy = nullptr;
    const Dictionary* record = nullptr;
    const BandwidthTable* bandwidths = nullptr;
  };

  const Entries& entries() const {
    if (_due.copy) copyNow();
    return _entries;
  }
  Entries& entries() { return const_cast<Entries&>(std::as_const(*this).entries()); }
  void copyNow() const;

  mutable Entries _entries;
  mutable Due _due;
};

}  // namespace qel
