#include "metrics/MetricValidator.h"

#include <array>
#include <string>

#include "base/FatalError.h"
#include "base/Rendering.h"
#include "metrics/DispatchTable.h"

namespace qel {
namespace {

// "%2X" of a 64-bit integer.
void appendHexadecimal(std::string& out, std::int64_t number) {
  std::array<char, 16> digits;
  char* const end = digits.data() + digits.size();
  char* first = end;
  auto left = static_cast<std::uint64_t>(number);
  do {
    *--first = "0123456789ABCDEF"[left & 0xF];
    left >>= 4;
  } while (left != 0);
  if (end - first < 2) out += ' ';
  out.append(first, end);
}

[[noreturn]] void refusePayload(std::int64_t identifier) {
  std::string reason = "metric ";
  appendHexadecimal(reason, identifier);
  fatalError(reason + " has an undecodable payload");
}

}  // namespace

const std::shared_ptr<MetricValidator>& MetricValidator::shared() {
  static auto& instance =
      *new std::shared_ptr<MetricValidator>(create(TeskWrapper::sharedInstance()));
  return instance;
}

std::shared_ptr<MetricValidator> MetricValidator::create(std::shared_ptr<TeskWrapper> wrapper,
                                                         const TimeZone& zone) {
  const std::shared_ptr<MetricValidator> validator(new MetricValidator(std::move(wrapper), zone));
  if (validator->mySharedTeskInstance) validator->mySharedTeskInstance->setDelegate(validator);
  return validator;
}

MetricValidator::MetricValidator(std::shared_ptr<TeskWrapper> wrapper, const TimeZone& zone)
    : mySharedTeskInstance(std::move(wrapper)), _dates(zone) {
  // Handlers stand before there is a delegate: an event that comes in between is logged and gone.
  if (mySharedTeskInstance) mySharedTeskInstance->listen();
}

void MetricValidator::setObserver(MetricObserver* observer, const Clock& clock) {
  _observer = observer;
  _clock = &clock;
}

void MetricValidator::metricsDidUpdate(const std::optional<Dictionary>& event) {
  if (!event) fatalError("a metric event without a dictionary");
  if (processMetric(*event)) standardOutput().write("Received Valid Metric");
}

void MetricValidator::eventsDidUpdate(const std::optional<Dictionary>&) {
  standardOutput().write("I dont care for events");
}

bool MetricValidator::processMetric(const Dictionary& event) {
  const Value* identifier = event.find(metricIDKey);
  metricID = identifier ? identifier->asInt64() : std::nullopt;
  if (!metricID) fatalError("a metric event without an integer under \"" + metricIDKey + "\"");
  LogSink& output = standardOutput();
  logHexadecimal(*metricID, output);

  const Value* payload = event.find(payloadKey);
  const Bytes* bytes = payload ? payload->asBytes() : nullptr;
  const ByteView view = bytes ? ByteView(*bytes) : ByteView();
  const DispatchRow* row = findDispatchRow(*metricID);
  if (!row) {
    output.write("I dont care for this Metric");
    if (_observer) _observer->metricWasPassedOver({*metricID, view, _clock->nowMs()});
    return false;
  }
  auto record = row->describe(view);
  if (!record) refusePayload(*metricID);

  Slot& slot = this->*row->slot;
  slot = std::move(record);
  rewriteTimestamp(*slot);
  logRecord(row->logText, *slot, output);
  applyDerivation(row->derivation, *slot, *this, dlbwlookup);
  if (_observer) _observer->metricWasStored({*row, *slot, view, _clock->nowMs()});
  return true;
}

void MetricValidator::rewriteTimestamp(Dictionary& record) {
  Value* value = record.find("timestamp");
  if (!value) return;
  const auto milliseconds = value->asDouble();
  if (!milliseconds) fatalError("a \"timestamp\" that is no number");
  *value = _dates.at(*milliseconds);
}

void MetricValidator::logHexadecimal(std::int64_t identifier, LogSink& output) {
  if (!output.wantsLines()) return;
  _line = "Metric ID in Hex = ";
  appendHexadecimal(_line, identifier);
  output.write(_line);
}

void MetricValidator::logRecord(std::string_view text, const Dictionary& record, LogSink& output) {
  if (!output.wantsLines()) return;
  _line = text;
  appendJson(_line, record);
  output.write(_line);
}

}  // namespace qel
