#include "history/ListFollower.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "base/Rendering.h"
#include "history/Words.h"
#include "metrics/MetricValidator.h"

namespace qel {
namespace {

// An access point's name is no longer (23.003, clause 9).
constexpr std::size_t kMostCharacters = 100;

std::string textAt(const Dictionary& entry, std::string_view key) {
  const Value* value = entry.find(key);
  return value ? cellText(*value) : std::string();
}

// The dictionaries of a list of the record.
std::vector<const Dictionary*> entriesOf(const Dictionary& record, std::string_view key) {
  std::vector<const Dictionary*> entries;
  const Value* value = record.find(key);
  const List* list = value ? value->asList() : nullptr;
  if (!list) return entries;
  for (const Value& entry : *list) {
    if (entries.size() == ListFollower::kMostEntries) break;
    if (const Dictionary* dictionary = entry.asDictionary()) entries.push_back(dictionary);
  }
  return entries;
}

void append(std::string& text, std::string_view word, const std::string& what) {
  if (what.empty()) return;
  if (!text.empty()) text += ", ";
  (text += word) += what;
}

}  // namespace

// By numbers and name alone: an address is nobody's business.
ListFollower::Entries ListFollower::bearersOf(const Dictionary& record) {
  Entries bearers;
  for (const Dictionary* entry : entriesOf(record, "bearer_contexts")) {
    const std::string name = textAt(*entry, "apn").substr(0, kMostCharacters);
    std::string text = name;
    append(text, "", wordsOf(entry->find("pdp_type"), "type"));
    if (name.empty()) append(text, "number ", textAt(*entry, "cid"));
    bearers.push_back(
        {textAt(*entry, "cid") + '/' + textAt(*entry, "nsapi") + '/' + name, std::move(text)});
  }
  return bearers;
}

ListFollower::Entries ListFollower::carriersOf(const Dictionary& record) {
  Entries carriers;
  for (const Dictionary* entry : entriesOf(record, "scc_list")) {
    if (textAt(*entry, "state") == "SCC_STATE_DECONFIGURED") continue;
    std::string text;
    append(text, "PCI ", textAt(*entry, "pci"));
    append(text, "EARFCN ", textAt(*entry, "dl_earfcn"));
    append(text, "band ", textAt(*entry, "dl_rf_band"));
    if (text.empty()) append(text, "number ", textAt(*entry, "index"));
    carriers.push_back(
        {textAt(*entry, "index") + '/' + textAt(*entry, "pci") + '/' + textAt(*entry, "dl_earfcn"),
         std::move(text)});
  }
  return carriers;
}

namespace {

template <class Entries, class Tell>
void tellDifference(Entries& known, Entries now, Tell tell) {
  const auto isIn = [](const Entries& entries, const auto& entry) {
    return std::ranges::any_of(entries, [&](const auto& one) { return one.key == entry.key; });
  };
  for (const auto& entry : known) {
    if (!isIn(now, entry)) tell(entry, false);
  }
  for (const auto& entry : now) {
    if (!isIn(known, entry)) tell(entry, true);
  }
  known = std::move(now);
}

}  // namespace

void ListFollower::followBearers(const Report& report, HappeningLog& log) {
  tellDifference(_bearers, bearersOf(report.record), [&](const Entry& bearer, bool hasCome) {
    const std::string what = hasCome ? "Connection up" : "Connection down";
    log.add(report, HappeningKind::bearer, std::nullopt,
            bearer.text.empty() ? what : what + ": " + bearer.text);
  });
}

void ListFollower::followCarriers(const Report& report, HappeningLog& log) {
  tellDifference(_carriers, carriersOf(report.record), [&](const Entry& carrier, bool hasCome) {
    const std::string what = hasCome ? "Carrier added" : "Carrier removed";
    log.add(report, HappeningKind::carrier, Technology::lte,
            carrier.text.empty() ? what : what + ": " + carrier.text);
  });
}

}  // namespace qel
