// What a recording hides: no identity is left, all else stays, and it can be read again.

#include <algorithm>

#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "recording/privacy/IdentityHider.h"
#include "recording/privacy/IdentityTable.h"
#include "recording/privacy/ImsiLayout.h"

namespace qel::fuzz {
namespace {

bool isNobody(const Value& value) {
  if (const Bytes* bytes = value.asBytes()) {
    return std::ranges::all_of(*bytes, [](std::uint8_t byte) { return byte == 0; });
  }
  return value.asUInt64() == 0xFFFFFFFFU;
}

// Digits of a subscriber, without which an IMSI names a network and nobody in it.
bool hasSubscriber(std::string_view field, const Value& value) {
  if (field != "imsi") return true;
  const Bytes* bytes = value.asBytes();
  const auto layout = imsiLayout(*bytes);
  return !layout || layout->digits > layout->networkDigits;
}

void compare(const Dictionary& before, const Dictionary& after);

void compareValues(std::string_view field, const Value& before, const Value& after) {
  const auto isMeant = [&](const IdentityField& row) { return row.field == field; };
  if (std::ranges::any_of(identityFields(), isMeant)) {
    law(before.kind() == after.kind(), "a pseudonym is of the same kind");
    if (before.asBytes()) {
      law(before.asBytes()->size() == after.asBytes()->size(), "a pseudonym has the same size");
    }
    if (isNobody(before) || !hasSubscriber(field, before)) return;
    law(!(before == after), "no identity is left");
  } else if (const Dictionary* nested = before.asDictionary()) {
    law(after.asDictionary() != nullptr, "what is nested stays");
    compare(*nested, *after.asDictionary());
  } else if (const List* list = before.asList()) {
    law(after.asList() && after.asList()->size() == list->size(), "lists keep their size");
    for (std::size_t i = 0; i < list->size(); ++i) {
      compareValues("", (*list)[i], (*after.asList())[i]);
    }
  } else {
    law(before == after, "what is no identity stays");
  }
}

void compare(const Dictionary& before, const Dictionary& after) {
  law(before.size() == after.size(), "every field stays");
  for (const auto& [key, value] : before) {
    const Value* hidden = after.find(key.view());
    law(hidden != nullptr, "every field stays");
    compareValues(key.view(), value, *hidden);
  }
}

void expectHarmless(const RecordedEvent& event) {
  for (const auto& [key, value] : event.entries) {
    const bool isText = value.asText() || value.asList() || value.asDictionary();
    law(!isText, "nothing of unknown meaning is left");
    const bool isPayload = key.view() == kRecordedPayloadKey;
    law(isPayload || !value.asBytes() || value.asBytes()->empty(), "no unknown bytes are left");
  }
}

}  // namespace

void tryInput(Input input) {
  const auto metrics = metricMessages();
  const std::size_t which = input.byte();
  const MetricMessage* metric = which < metrics.size() ? &metrics[which] : nullptr;
  const std::uint32_t identifier = metric ? metric->identifier : input.number<std::uint32_t>();
  const Bytes payload = input.piece();
  RecordedEvent event;
  event.kind = (input.byte() & 1) != 0 ? RecordedKind::trigger : RecordedKind::metric;
  event.entries = input.entries();
  event.entries.set(kRecordedMetricKey, std::int64_t{identifier} + std::int64_t{kMetricEventBase});
  event.entries.set(kRecordedPayloadKey, payload);

  SipKey key{};
  std::ranges::generate(key, [&] { return input.byte(); });
  IdentityHider hider{Pseudonyms(key)};
  const bool isKept = hider.hide(event);
  if (event.kind == RecordedKind::trigger || !metric) {
    if (isKept && !findMetricMessage(identifier)) expectHarmless(event);
    return;
  }
  const auto before = metric->describe(payload);
  law(isKept == before.has_value(), "an event is kept when its payload can be decoded");
  if (!isKept) return;
  expectHarmless(event);
  const Value* hidden = event.entries.find(kRecordedPayloadKey);
  law(hidden && hidden->asBytes(), "a payload stays a payload");
  const auto after = metric->describe(*hidden->asBytes());
  law(after.has_value(), "what is hidden can be decoded");
  compare(*before, *after);
}

}  // namespace qel::fuzz
