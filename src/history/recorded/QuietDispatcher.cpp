#include "history/recorded/QuietDispatcher.h"

#include "base/DroppedOutput.h"
#include "messages/catalogue/TagLog.h"
#include "recording/RecordedMetric.h"

namespace qel {

QuietDispatcher::QuietDispatcher(MetricObserver* observer)
    : _validator(MetricValidator::create(nullptr)) {
  setObserver(observer);
}

bool QuietDispatcher::isReadable(const Dictionary& event) {
  const MetricMessage* message = messageOf(event);
  const CountedTagLines tagLines;
  return !message || message->isReadable(payloadOf(event));
}

bool QuietDispatcher::take(const Dictionary& event, std::uint64_t receivedMs) {
  _receivedMs = receivedMs;
  const DroppedOutput output;
  const CountedTagLines tagLines;
  return _validator->processMetric(event);
}

}  // namespace qel
