#include "sources/support/DriveLog.h"

#include <gtest/gtest.h>

#include <map>
#include <utility>

#include "messages/catalogue/MetricMessages.h"
#include "sources/simulated/SimulatedDrive.h"
#include "tesk/Constants.h"

namespace qel::testing {
namespace {

DriveEvent decoded(sources::SourceEvent raw) {
  DriveEvent event;
  event.elapsedMs = raw.timeMs - kDriveStartMs;
  if (raw.stream == tesk::kEventTrigger) {
    event.trigger = integerOf(raw.entries, tesk::kKeyTriggerID);
  } else {
    event.metric =
        static_cast<std::uint32_t>(integerOf(raw.entries, tesk::kKeyMetricID) - 0x3C0000);
    const Bytes* payload = raw.entries.find(tesk::kKeyPayload)->asBytes();
    if (const MetricMessage* kind = findMetricMessage(event.metric)) {
      const auto message = kind->decode(*payload);
      if (!message) {
        ADD_FAILURE() << kind->className << " does not decode";
      } else {
        event.message = message->dictionaryRepresentation();
      }
    }
  }
  event.raw = std::move(raw);
  return event;
}

}  // namespace

const std::vector<DriveEvent>& drive(std::uint64_t seed, std::uint64_t durationMs) {
  static std::map<std::pair<std::uint64_t, std::uint64_t>, std::vector<DriveEvent>> drives;
  auto [place, isNew] = drives.try_emplace({seed, durationMs});
  if (!isNew) return place->second;
  sources::SimulatedDrive simulated(seed, kDriveStartMs);
  while (auto event = simulated.next()) {
    if (event->timeMs >= kDriveStartMs + durationMs) break;
    place->second.push_back(decoded(std::move(*event)));
  }
  return place->second;
}

std::vector<DriveEvent> driveOf(std::uint64_t seed, std::uint32_t metric) {
  std::vector<DriveEvent> some;
  for (const DriveEvent& event : drive(seed)) {
    if (event.metric == metric) some.push_back(event);
  }
  return some;
}

std::int64_t integerOf(const Dictionary& dictionary, std::string_view key) {
  const Value* value = dictionary.find(key);
  const auto number = value ? value->asInt64() : std::nullopt;
  if (!number) ADD_FAILURE() << key << " is missing or no integer";
  return number.value_or(0);
}

std::string_view textOf(const Dictionary& dictionary, std::string_view key) {
  const Value* value = dictionary.find(key);
  const auto text = value ? value->asText() : std::nullopt;
  if (!text) ADD_FAILURE() << key << " is missing or no text";
  return text.value_or("");
}

std::vector<Dictionary> entriesOf(const Dictionary& dictionary, std::string_view key) {
  std::vector<Dictionary> entries;
  const Value* value = dictionary.find(key);
  const List* list = value ? value->asList() : nullptr;
  if (!list) return entries;
  for (const Value& entry : *list) entries.push_back(*entry.asDictionary());
  return entries;
}

}  // namespace qel::testing
