// The metric that an event is about.
#pragma once

#include "base/Bytes.h"
#include "messages/catalogue/MetricMessages.h"
#include "messages/catalogue/MetricNumber.h"
#include "recording/RecordedEvent.h"

namespace qel {

// Its message class, or null.
inline const MetricMessage* messageOf(const Dictionary& event) {
  const Value* value = event.find(kRecordedMetricKey);
  const auto identifier = value ? value->asInt64() : std::nullopt;
  const auto metric = identifier ? metricOfNumber(*identifier) : std::nullopt;
  return metric ? findMetricMessage(*metric) : nullptr;
}

// Its payload; none is an empty one. Valid as long as the event is.
inline ByteView payloadOf(const Dictionary& event) {
  const Value* payload = event.find(kRecordedPayloadKey);
  const Bytes* bytes = payload ? payload->asBytes() : nullptr;
  return bytes ? ByteView(*bytes) : ByteView();
}

}  // namespace qel
