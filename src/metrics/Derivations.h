// Rewrites of decoded records into the units that the tables show, as data.
#pragma once

#include <cstdint>
#include <span>
#include <string_view>

#include "metrics/BandwidthTable.h"
#include "metrics/MetricStore.h"

namespace qel {

// How a value under a key is rewritten. A value of another kind is left as it is.
struct Rewrite {
  enum class Kind : std::uint8_t {
    addInteger,      // integer + operand; an overflow is a fatal error
    divideInteger,   // integer ÷ operand, toward zero
    scaleFloat,      // float × operand + offset, single precision
    divideFloat,     // float ÷ operand, single precision
    bandwidth,       // LTE bandwidth code → MHz; a code without an entry removes the key
    listText,        // list → its text
    integerListText  // list of integers → its text
  };

  Name key;
  Kind kind;
  std::int32_t operand = 0;
  float factor = 0;
  float offset = 0;
};

// Copies the dictionaries of a list of the record into a list of the store: emptied, then one entry
// each, rewritten, with the record's values under `carried` (absent there: removed from the entry).
// Without such a list, or with anything else in it, the list of the store is empty.
struct ListCopy {
  Name key;
  EntryList& (*target)(MetricStore&);
  std::span<const Rewrite> rewrites;
  std::span<const Name> carried;
};

// What a handler does with its record after storing it, in this order.
struct Derivation {
  std::span<const Rewrite> inPlace = {};              // of the stored record itself
  Dictionary& (*projection)(MetricStore&) = nullptr;  // reselection keys, if any
  std::span<const ListCopy> copies = {};
};

void applyRewrite(const Rewrite& rewrite, Dictionary& record, const BandwidthTable& bandwidths);

// Sets every key of `projection` to the record's value; a key that the record lacks is removed and
// never comes back.
void project(const Dictionary& record, Dictionary& projection);

void copyEntries(const ListCopy& copy, const Dictionary& record, EntryList::Entries& target,
                 const BandwidthTable& bandwidths);

// `record` is the stored one; `store` holds the lists, which copy from it when somebody looks.
void applyDerivation(const Derivation& derivation, Dictionary& record, MetricStore& store,
                     const BandwidthTable& bandwidths);

}  // namespace qel
