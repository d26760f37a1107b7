#include "metrics/MetricValidator.h"

#include <array>
#include <cinttypes>
#include <cstdio>

#include "base/FatalError.h"
#include "base/Rendering.h"
#include "metrics/DispatchTable.h"

namespace qel {
namespace {

// "%2X" of a 64-bit integer.
std::string hexadecimal(std::int64_t number) {
  std::array<char, 24> digits;
  const int length =
      std::snprintf(digits.data(), digits.size(), "%2" PRIX64, static_cast<std::uint64_t>(number));
  return {digits.data(), static_cast<std::size_t>(length)};
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
    : mySharedTeskInstance(std::move(wrapper)), _zone(zone) {
  // Handlers stand before there is a delegate: an event that comes in between is logged and gone.
  if (mySharedTeskInstance) mySharedTeskInstance->listen();
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
  standardOutput().write("Metric ID in Hex = " + hexadecimal(*metricID));

  const DispatchRow* row = findDispatchRow(*metricID);
  if (!row) {
    standardOutput().write("I dont care for this Metric");
    return false;
  }
  const Value* payload = event.find(payloadKey);
  const Bytes* bytes = payload ? payload->asBytes() : nullptr;
  const auto message = row->decode(bytes ? ByteView(*bytes) : ByteView());
  if (!message) fatalError("metric " + hexadecimal(*metricID) + " has an undecodable payload");

  Slot& slot = this->*row->slot;
  slot = message->dictionaryRepresentation();
  rewriteTimestamp(*slot);
  std::string line(row->logText);
  appendJson(line, *slot);
  standardOutput().write(line);
  applyDerivation(row->derivation, *slot, *this, dlbwlookup);
  return true;
}

void MetricValidator::rewriteTimestamp(Dictionary& record) const {
  constexpr std::string_view kTimestamp = "timestamp";
  Value* value = record.find(kTimestamp);
  if (!value) return;
  const auto milliseconds = value->asDouble();
  if (!milliseconds) fatalError("a \"timestamp\" that is no number");
  *value = dateText(*milliseconds, _zone);
}

}  // namespace qel
