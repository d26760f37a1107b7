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
    fatalError("arithmetic overflow in \"" + std::string(rewrite.key.view()) + "\"");
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

Text listText(const Value& list) {
  static std::string text;  // kept for its memory
  text.clear();
  appendJson(text, list);
  return text;
}

// `value` is the one under the rewrite's key.
void rewriteValue(const Rewrite& rewrite, Value& value, Dictionary& record,
                  const BandwidthTable& bandwidths) {
  switch (rewrite.kind) {
    case Rewrite::Kind::addInteger:
      if (const auto integer = value.asInt64()) value = checkedSum(rewrite, *integer);
      break;
    case Rewrite::Kind::divideInteger:
      if (const auto integer = value.asInt64()) value = *integer / rewrite.operand;
      break;
    case Rewrite::Kind::scaleFloat:
      if (const auto number = value.asFloat()) value = *number * rewrite.factor + rewrite.offset;
      break;
    case Rewrite::Kind::divideFloat:
      if (const auto number = value.asFloat()) value = *number / rewrite.factor;
      break;
    case Rewrite::Kind::bandwidth:
      rewriteBandwidth(rewrite, value, record, bandwidths);
      break;
    case Rewrite::Kind::listText:
      if (value.asList()) value = listText(value);
      break;
    case Rewrite::Kind::integerListText:
      if (const List* list = value.asList(); list && allIntegers(*list)) value = listText(value);
      break;
  }
}

// Makes `entry` as reported, with room for what is carried.
void refill(Dictionary& entry, const Dictionary& reported, const ListCopy& copy) {
  entry.clear();
  Dictionary::Entries::Filling filling(entry.entries(), reported.size() + copy.carried.size());
  for (const Dictionary::Entry& each : reported) filling.append(each);
}

// Makes the list that of the reported dictionaries. What there is is used again.
void refill(EntryList::Entries& target, const List& reported, const ListCopy& copy) {
  target.reserve(reported.size());
  while (target.size() < reported.size()) target.emplace_back();
  while (target.size() > reported.size()) target.erase(target.end() - 1);
  for (std::size_t i = 0; i < reported.size(); ++i) {
    refill(target[i], *reported[i].asDictionary(), copy);
  }
}

}  // namespace

void copyEntries(const ListCopy& copy, const Dictionary& record, EntryList::Entries& target,
                 const BandwidthTable& bandwidths) {
  const Value* source = record.find(copy.key);
  const List* list = source ? source->asList() : nullptr;
  if (!list || !allDictionaries(*list)) return target.clear();
  refill(target, *list, copy);
  for (const Rewrite& rewrite : copy.rewrites) {
    std::size_t place = 0;
    for (Dictionary& entry : target) {
      Value* value = entry.find(rewrite.key, place);
      if (value) rewriteValue(rewrite, *value, entry, bandwidths);
    }
  }
  for (const Name key : copy.carried) {
    const Value* carried = record.find(key);
    for (Dictionary& entry : target) entry.assign(key, carried);
  }
}

void applyRewrite(const Rewrite& rewrite, Dictionary& record, const BandwidthTable& bandwidths) {
  Value* value = record.find(rewrite.key);
  if (value) rewriteValue(rewrite, *value, record, bandwidths);
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
  for (const ListCopy& copy : derivation.copies) {
    copy.target(store).copyLater(copy, record, bandwidths);
  }
}

}  // namespace qel
