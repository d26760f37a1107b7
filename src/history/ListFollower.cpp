#include "history/ListFollower.h"

#include <algorithm>
#include <string_view>
#include <utility>

namespace qel {
namespace {

// At most as much as an access point's name has (23.003, clause 9), and no part of a character.
std::string_view shortened(std::string_view name) {
  constexpr std::size_t kMostBytes = 100;
  if (name.size() <= kMostBytes) return name;
  std::size_t end = kMostBytes;
  while (end > 0 && (static_cast<unsigned char>(name[end]) & 0xC0U) == 0x80U) --end;
  return name.substr(0, end);
}

Value numberIn(const Dictionary& entry, KnownPlace& place) {
  const Value* value = place.in(entry);
  return value && value->asInt64() ? *value : Value();
}

bool isIn(const std::vector<ToldEntry>& entries, const ToldEntry& entry) {
  return std::ranges::any_of(entries, [&](const ToldEntry& one) {
    return one.numbers == entry.numbers && one.name == entry.name;
  });
}

}  // namespace

void ListFollower::read(Followed& followed, const Dictionary& record) {
  followed.now.clear();
  const Value* value = followed.list.in(record);
  const List* list = value ? value->asList() : nullptr;
  if (!list) return;
  for (const Value& one : *list) {
    const Dictionary* entry = one.asDictionary();
    if (!entry || followed.now.size() == kMostEntries) continue;
    const Value* state = followed.state.in(*entry);
    if (state && state->asText() == "SCC_STATE_DECONFIGURED") continue;
    ToldEntry& told = followed.now.emplace_back();
    for (std::size_t i = 0; i < told.numbers.size(); ++i) {
      told.numbers[i] = numberIn(*entry, followed.numbers[i]);
    }
    const Value* name = followed.name.in(*entry);
    if (name) told.name = shortened(name->asText().value_or(""));
    if (const Value* type = followed.type.in(*entry)) told.type = *type;
  }
}

void ListFollower::follow(Followed& followed, const Report& report, HappeningLog& log) {
  read(followed, report.record);
  const auto tell = [&](ToldEntry entry, bool hasCome) {
    entry.hasCome = hasCome;
    log.tell<ToldEntry>(report, followed.kind, followed.technology, std::move(entry));
  };
  for (ToldEntry& entry : followed.known) {
    if (!isIn(followed.now, entry)) tell(std::move(entry), false);
  }
  for (const ToldEntry& entry : followed.now) {
    if (!isIn(followed.known, entry)) tell(entry, true);
  }
  std::swap(followed.known, followed.now);
}

}  // namespace qel
