#include "history/recorded/QuietDispatcher.h"

#include "base/DroppedOutput.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "messages/catalogue/TagLog.h"
#include "recording/RecordedEvent.h"

namespace qel {

QuietDispatcher::QuietDispatcher(MetricObserver* observer)
    : _validator(MetricValidator::create(nullptr)) {
  setObserver(observer);
}

bool QuietDispatcher::isReadable(const Dictionary& event) {
  const Value* metric = event.find(kRecordedMetricKey);
  const auto identifier = metric ? metric->asInt64() : std::nullopt;
  if (!identifier || *identifier < kMetricEventBase || *identifier > kMetricEventBase + 0xFFFF) {
    return true;
  }
  const auto* message =
      findMetricMessage(static_cast<std::uint32_t>(*identifier - kMetricEventBase));
  const Value* payload = event.find(kRecordedPayloadKey);
  const Bytes* bytes = payload ? payload->asBytes() : nullptr;
  const CountedTagLines tagLines;
  return !message || message->isReadable(bytes ? ByteView(*bytes) : ByteView());
}

bool QuietDispatcher::take(const Dictionary& event, std::uint64_t receivedMs) {
  _receivedMs = receivedMs;
  const DroppedOutput output;
  const CountedTagLines tagLines;
  return _validator->processMetric(event);
}

}  // namespace qel
