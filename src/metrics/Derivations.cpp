#include "metrics/Derivations.h"

#include <algorithm>
#include <string>

#include "base/FatalError.h"
#include "base/Rendering.h"

namespace qel {
namespace {

std::int64_t checkedSum(const Rewrite& rewrite, std::int64_t value) {
  std::int64_t sum = 0;
  if (__builtin_add_overflow(value, std::int64_t{rewrite.operand}, &sum)) {
    fatalError("arithmetic overflow in \"" + std::string(rewrite.key) + "\"");
  }
  return sum;
}

void rewriteBandwidth(const Rewrite& rewrite, Value& value, Dictionary& record,
                      const BandwidthTable& bandwidths) {
  const auto code = value.asInt32();
  if (!code) return;
  const auto found = bandwidths.find(*code);
  if (found == bandwidths.end()) {
    record.remove(rewrite.key);
  } else {
    value = found->second;
  }
}

bool allIntegers(const List& list) {
  return std::ranges::all_of(list, [](const Value& value) { return value.asInt64().has_value(); });
}

bool allDictionaries(const List& list) {
  return std::ranges::all_of(
      list, [](const Value& value) { return value.kind() == Value::Kind::dictionary; });
}

void copyList(const ListCopy& copy, const Dictionary& record, MetricStore& store,
              const BandwidthTable& bandwidths) {
  EntryList& target = copy.target(store);
  target.clear();
  const Value* source = record.find(copy.key);
  const List* list = source ? source->asList() : nullptr;
  if (!list || !allDictionaries(*list)) return;
  target.reserve(list->size());
  for (const Value& value : *list) {
    Dictionary& entry = target.emplace_back(*value.asDictionary());
    for (const Rewrite& rewrite : copy.rewrites) applyRewrite(rewrite, entry, bandwidths);
    for (const std::string_view key : copy.carried) {
      entry.assign(Text::borrowed(key), record.find(key));
    }
  }
}

}  // namespace

void applyRewrite(const Rewrite& rewrite, Dictionary& record, const BandwidthTable& bandwidths) {
  Value* value = record.find(rewrite.key);
  if (!value) return;
  const auto integer = value->asInt64();
  const auto number = value->asFloat();
  const List* list = value->asList();
  switch (rewrite.kind) {
    case Rewrite::Kind::addInteger:
      if (integer) *value = checkedSum(rewrite, *integer);
      break;
    case Rewrite::Kind::divideInteger:
      if (integer) *value = *integer / rewrite.operand;
      break;
    case Rewrite::Kind::scaleFloat:
      if (number) *value = *number * rewrite.factor + rewrite.offset;
      break;
    case Rewrite::Kind::divideFloat:
      if (number) *value = *number / rewrite.factor;
      break;
    case Rewrite::Kind::bandwidth:
      rewriteBandwidth(rewrite, *value, record, bandwidths);
      break;
    case Rewrite::Kind::listText:
      if (list) *value = jsonText(*value);
      break;
    case Rewrite::Kind::integerListText:
      if (list && allIntegers(*list)) *value = jsonText(*value);
      break;
  }
}

void project(const Dictionary& record, Dictionary& projection) {
  Dictionary kept;
  kept.reserve(projection.size());
  for (const auto& [key, old] : projection) {
    if (const Value* value = record.find(key)) kept.append(key, *value);
  }
  projection = std::move(kept);
}

void applyDerivation(const Derivation& derivation, Dictionary& record, MetricStore& store,
                     const BandwidthTable& bandwidths) {
  for (const Rewrite& rewrite : derivation.inPlace) applyRewrite(rewrite, record, bandwidths);
  if (derivation.projection) project(record, derivation.projection(store));
  for (const ListCopy& copy : derivation.copies) copyList(copy, record, store, bandwidths);
}

}  // namespace qel
