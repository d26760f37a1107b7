#include "recording/privacy/IdentityHider.h"

#include <utility>
#include <vector>

#include "recording/RecordedMetric.h"
#include "recording/privacy/IdentityTable.h"

namespace qel {
namespace {

const MetricMessage* messageOf(const RecordedEvent& event) {
  return event.kind == RecordedKind::metric ? qel::messageOf(event.entries) : nullptr;
}

bool isNumber(const Value& value) {
  switch (value.kind()) {
    case Value::Kind::null:
    case Value::Kind::boolean:
    case Value::Kind::signedInteger:
    case Value::Kind::unsignedInteger:
    case Value::Kind::floating:
      return true;
    default:
      return false;
  }
}

}  // namespace

bool IdentityHider::hidePayload(RecordedEvent& event) {
  Value* value = event.entries.find(kRecordedPayloadKey);
  const Bytes* payload = value ? value->asBytes() : nullptr;
  const MetricMessage* metric = messageOf(event);
  if (!payload || !metric) return true;
  auto hidden = withPseudonyms(*metric, *payload, _pseudonyms);
  if (!hidden) return false;
  *value = std::move(*hidden);
  return true;
}

bool IdentityHider::hide(RecordedEvent& event) {
  if (!hidePayload(event)) {
    ++_undecodable;
    return false;
  }
  const bool payloadIsKnown = messageOf(event) != nullptr;
  Dictionary kept;
  kept.reserve(event.entries.size());
  for (const auto& [key, value] : event.entries) {
    const bool isKnownPayload =
        payloadIsKnown && key.view() == kRecordedPayloadKey && value.asBytes();
    const bool isEmpty = value.asBytes() && value.asBytes()->empty();
    if (isKnownPayload || isEmpty || isNumber(value)) kept.append(key, value);
  }
  if (kept.size() != event.entries.size()) ++_stripped;
  event.entries = std::move(kept);
  return true;
}

}  // namespace qel
