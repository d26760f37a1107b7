#include "recording/EventLine.h"

#include <optional>
#include <utility>

#include "base/Bytes.h"
#include "base/Rendering.h"
#include "recording/LineLimits.h"
#include "recording/PlainLine.h"

namespace qel {
namespace {

LineFault fault(std::string reason) { return {true, std::move(reason)}; }

std::optional<LineFault> readKind(const Dictionary& line, RecordedEvent& event) {
  const Value* name = line.find(kRecordedEventKey);
  if (!name) return fault("\"event\" is missing");
  if (!name->asText()) return fault("\"event\" is no text");
  if (const auto kind = recordedKind(*name->asText())) {
    event.kind = *kind;
    return std::nullopt;
  }
  return fault("unknown \"event\" " + quoted(*name->asText()));
}

std::optional<LineFault> readTime(const Dictionary& line, RecordedEvent& event) {
  const Value* time = line.find(kRecordedTimeKey);
  if (!time) return fault("\"time_ms\" is missing");
  if (time->kind() != Value::Kind::unsignedInteger) {
    return fault("\"time_ms\" is no unsigned integer");
  }
  event.timeMs = *time->asUInt64();
  if (event.timeMs > kLastRecordedMs) return fault("\"time_ms\" is after the year 9999");
  return std::nullopt;
}

std::optional<LineFault> readPayload(Value& value) {
  const auto text = value.asText();
  auto bytes = text ? bytesFromBase64(*text) : std::nullopt;
  if (!bytes) return fault("\"kKeyPayload\" is no standard base64 text");
  value = std::move(*bytes);
  return std::nullopt;
}

std::optional<LineFault> readEntries(Dictionary line, RecordedEvent& event) {
  event.entries.reserve(line.size());
  for (auto& [key, value] : line.entries()) {
    if (key.view() == kRecordedTimeKey || key.view() == kRecordedEventKey) continue;
    if (key.view() == kRecordedPayloadKey) {
      if (auto bad = readPayload(value)) return bad;
    }
    event.entries.append(std::move(key), std::move(value));
  }
  return std::nullopt;
}

std::optional<LineFault> checkMetric(const RecordedEvent& event) {
  if (event.kind != RecordedKind::metric) return std::nullopt;
  const Value* metric = event.entries.find(kRecordedMetricKey);
  if (!metric) return fault("\"kKeyMetricID\" is missing");
  if (metric->kind() == Value::Kind::floating || !metric->asInt64())
    return fault("\"kKeyMetricID\" is no 64-bit integer");
  return std::nullopt;
}

std::variant<RecordedEvent, LineFault> parseAnyLine(std::string_view line) {
  auto parsed = parseJsonLine(line);
  if (auto* bad = std::get_if<LineFault>(&parsed)) return std::move(*bad);
  Dictionary& entries = std::get<Dictionary>(parsed);
  RecordedEvent event;
  if (auto bad = readTime(entries, event)) return std::move(*bad);
  if (auto bad = readKind(entries, event)) return std::move(*bad);
  if (auto bad = readEntries(std::move(entries), event)) return std::move(*bad);
  return event;
}

}  // namespace

std::variant<RecordedEvent, LineFault> parseEventLine(std::string_view line) {
  std::variant<RecordedEvent, LineFault> parsed;
  if (auto plain = readPlainLine(line)) {
    parsed = std::move(*plain);
  } else {
    parsed = parseAnyLine(line);
  }
  if (const auto* event = std::get_if<RecordedEvent>(&parsed)) {
    if (auto bad = checkMetric(*event)) return std::move(*bad);
  }
  return parsed;
}

bool hasReadableForm(const RecordedEvent& event) {
  const Value* payload = event.entries.find(kRecordedPayloadKey);
  return event.timeMs <= kLastRecordedMs && (!payload || payload->asBytes()) &&
         !checkMetric(event) && isWithinLineLimits(event.entries);
}

std::string eventLine(const RecordedEvent& event) {
  std::string line = "{\"time_ms\": " + std::to_string(event.timeMs) + ", \"event\": ";
  for (const RecordedKindName& row : kRecordedKindNames) {
    if (row.kind == event.kind) appendJsonString(line, row.name);
  }
  for (const auto& [key, value] : event.entries) {
    // These two say what the event is; a dictionary cannot say otherwise.
    if (key.view() == kRecordedTimeKey || key.view() == kRecordedEventKey) continue;
    line += ", ";
    appendJsonString(line, key);
    line += ": ";
    const Bytes* payload = key.view() == kRecordedPayloadKey ? value.asBytes() : nullptr;
    if (payload) {
      appendJsonString(line, base64Text(*payload));
    } else {
      appendJson(line, value);
    }
  }
  line += '}';
  return line;
}

}  // namespace qel
