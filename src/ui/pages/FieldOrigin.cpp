#include "ui/pages/FieldOrigin.h"

#include <algorithm>

#include "messages/catalogue/KBBMetricUtility.h"

namespace qel {
namespace {

// One in which every slot is filled, to see which part of it a category shows.
MetricStore& probe() {
  static MetricStore store = [] {
    MetricStore filled;
    for (const DispatchRow& row : dispatchTable()) filled.*row.slot = Dictionary();
    return filled;
  }();
  return store;
}

bool showsRecord(const Category& category, const DispatchRow& row) {
  const Dictionary* shown = category.record(probe());
  const auto projection = row.derivation.projection;
  return shown == &*(probe().*row.slot) || (projection && shown == &projection(probe()));
}

FieldOrigin originIn(const DispatchRow& row, const ListCopy* copy) {
  const auto metric = static_cast<std::uint32_t>(row.identifier - kMetricEventBase);
  FieldOrigin origin{.row = &row, .copy = copy, .payload = findPayloadFacts(metric)};
  origin.entry = origin.payload;
  if (origin.payload && copy) {
    const FieldFacts* list = origin.payload->find(copy->key.view());
    origin.entry = list ? findMessageFacts(list->holds) : nullptr;
  }
  return origin;
}

const List* listOf(const Dictionary& report, const FieldOrigin& origin) {
  const Value* list = report.find(origin.copy->key.view());
  return list ? list->asList() : nullptr;
}

// Whether all fields that tell entries apart are the same; false as well without any.
bool areOneEntry(const MessageFacts& message, const Dictionary& a, const Dictionary& b) {
  bool compared = false;
  for (const FieldFacts& field : message.fields) {
    if (!field.identifies) continue;
    const Value* ofA = a.find(field.key);
    const Value* ofB = b.find(field.key);
    if ((ofA == nullptr) != (ofB == nullptr) || (ofA && !(*ofA == *ofB))) return false;
    compared = compared || ofA;
  }
  return compared;
}

}  // namespace

const FieldFacts* FieldOrigin::find(std::string_view field) const {
  const FieldFacts* facts = entry->find(field);
  if (facts || !copy) return facts;
  const bool carried = std::ranges::any_of(copy->carried, [&](Name name) { return name == field; });
  return carried ? payload->find(field) : nullptr;
}

std::optional<FieldOrigin> originOf(const Category& category) {
  for (const DispatchRow& row : dispatchTable()) {
    std::optional<FieldOrigin> origin;
    if (category.record && showsRecord(category, row)) origin = originIn(row, nullptr);
    for (const ListCopy& copy : row.derivation.copies) {
      const bool shown = category.list && category.list(probe()) == &copy.target(probe());
      if (shown) origin = originIn(row, &copy);
    }
    if (origin && origin->entry) return origin;
  }
  return std::nullopt;
}

const Dictionary* partOf(const Dictionary& report, const FieldOrigin& origin, int section) {
  if (!origin.copy) return &report;
  const List* list = listOf(report, origin);
  if (!list || section < 0 || static_cast<std::size_t>(section) >= list->size()) return nullptr;
  return (*list)[static_cast<std::size_t>(section)].asDictionary();
}

const Dictionary* sameEntry(const Dictionary& report, const FieldOrigin& origin,
                            const Dictionary& entry, int section) {
  const bool hasIdentity = std::ranges::any_of(origin.entry->fields, &FieldFacts::identifies);
  if (!origin.copy || !hasIdentity) return partOf(report, origin, section);
  const List* list = listOf(report, origin);
  if (!list) return nullptr;
  for (const Value& each : *list) {
    const Dictionary* other = each.asDictionary();
    if (other && areOneEntry(*origin.entry, entry, *other)) return other;
  }
  return nullptr;
}

}  // namespace qel
