#include "metrics/MetricValidator.h"

#include <algorithm>
#include <array>
#include <string>

#include "base/FatalError.h"
#include "base/Rendering.h"
#include "metrics/DispatchTable.h"

namespace qel {
namespace {

constexpr std::size_t kLongestHexadecimal = 16;

// The two digits of every byte.
constexpr auto kHexadecimal = [] {
  std::array<std::array<char, 2>, 256> texts{};
  for (std::size_t byte = 0; byte < texts.size(); ++byte) {
    texts[byte] = {"0123456789ABCDEF"[byte >> 4], "0123456789ABCDEF"[byte & 0xF]};
  }
  return texts;
}();

// "%2X" of a 64-bit integer before a place; where it begins.
char* putHexadecimal(std::int64_t number, char* end) {
  const auto put = [&end](std::uint64_t byte) {
    end -= 2;
    std::ranges::copy(kHexadecimal[byte & 0xFF], end);
  };
  auto left = static_cast<std::uint64_t>(number);
  for (; left > 0xFF; left >>= 8) put(left);
  put(left);
  if (left > 0xF) return end;
  if (left != static_cast<std::uint64_t>(number)) return end + 1;
  *end = ' ';
  return end;
}

void logHexadecimal(std::int64_t identifier, LogSink& output) {
  if (!output.wantsLines()) return;
  constexpr std::string_view kText = "Metric ID in Hex = ";
  std::array<char, kText.size() + kLongestHexadecimal> line;
  char* const end = line.data() + line.size();
  char* const number = putHexadecimal(identifier, end);
  std::ranges::copy(kText, number - kText.size());
  output.write({number - kText.size(), end});
}

[[noreturn]] void refusePayload(std::int64_t identifier) {
  std::array<char, kLongestHexadecimal> text;
  char* const end = text.data() + text.size();
  fatalError("metric " + std::string(putHexadecimal(identifier, end), end) +
             " has an undecodable payload");
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
  LogSink& output = standardOutput();
  if (process(*event, output)) output.write("Received Valid Metric");
}

void MetricValidator::eventsDidUpdate(const std::optional<Dictionary>&) {
  standardOutput().write("I dont care for events");
}

bool MetricValidator::processMetric(const Dictionary& event) {
  return process(event, standardOutput());
}

bool MetricValidator::process(const Dictionary& event, LogSink& output) {
  const Value* identifier = event.find(metricIDKey);
  metricID = identifier ? identifier->asInt64() : std::nullopt;
  if (!metricID) fatalError("a metric event without an integer under \"" + metricIDKey + "\"");
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

void MetricValidator::logRecord(std::string_view text, const Dictionary& record, LogSink& output) {
  if (!output.wantsLines()) return;
  _line.clear();
  _line.append(text);
  appendJson(_line, record);
  output.write(_line.view());
}

}  // namespace qel
