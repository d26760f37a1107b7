// Which report the values of a category come from.
#pragma once

#include <optional>
#include <string_view>

#include "base/Value.h"
#include "messages/catalogue/FieldFacts.h"
#include "metrics/DispatchTable.h"
#include "ui/screens/CategoryTable.h"

namespace qel {

struct FieldOrigin {
  const DispatchRow* row = nullptr;
  const ListCopy* copy = nullptr;  // of the list that has an entry a section; null: the record
  const MessageFacts* payload = nullptr;
  const MessageFacts* entry = nullptr;  // of what stands in a section

  // What the field of that name means; null: the store's own placeholder. Entries carry some fields
  // of their report.
  const FieldFacts* find(std::string_view field) const;
  bool isCarried(std::string_view field) const { return !entry->find(field); }
};

// As the dispatch table has it. Nothing for a category whose values no metric brings.
std::optional<FieldOrigin> originOf(const Category& category);

// The part of a report, as it came, that a section shows; null: it has no such entry.
const Dictionary* partOf(const Dictionary& report, const FieldOrigin& origin, int section);
// The entry that is the same one as `entry`, by the fields that tell entries apart, or else by its
// place; null: it has none.
const Dictionary* sameEntry(const Dictionary& report, const FieldOrigin& origin,
                            const Dictionary& entry, int section);

}  // namespace qel
