#include "recording/EventLine.h"

#include <cfloat>
#include <cmath>
#include <nlohmann/json.hpp>
#include <optional>
#include <utility>

#include "base/Bytes.h"
#include "base/Rendering.h"
#include "recording/PlainLine.h"

namespace qel {
namespace {

using Json = nlohmann::ordered_json;

// Deeper than any event dictionary; a bound for the recursion below.
constexpr int kDeepestNesting = 32;

LineFault fault(std::string reason) { return {true, std::move(reason)}; }

std::optional<Value> valueOf(const Json& json, int depth);

std::optional<Value> listOf(const Json& json, int depth) {
  List list;
  list.reserve(json.size());
  for (const Json& element : json) {
    auto value = valueOf(element, depth);
    if (!value) return std::nullopt;
    list.push_back(std::move(*value));
  }
  return Value(std::move(list));
}

std::optional<Value> dictionaryOf(const Json& json, int depth) {
  Dictionary dictionary;
  dictionary.reserve(json.size());
  for (const auto& [key, element] : json.items()) {
    auto value = valueOf(element, depth);
    if (!value) return std::nullopt;
    dictionary.append(key, std::move(*value));
  }
  return Value(std::move(dictionary));
}

// Nothing when nested too deep or a number is beyond what a value can hold.
std::optional<Value> valueOf(const Json& json, int depth) {
  if (depth > kDeepestNesting) return std::nullopt;
  switch (json.type()) {
    case Json::value_t::null:
      return Value();
    case Json::value_t::boolean:
      return Value(json.get<bool>());
    case Json::value_t::number_unsigned:
      return Value(json.get<std::uint64_t>());
    case Json::value_t::number_integer:
      return Value(json.get<std::int64_t>());
    case Json::value_t::number_float: {
      const double number = json.get<double>();
      if (std::abs(number) > static_cast<double>(FLT_MAX)) return std::nullopt;
      return Value(static_cast<float>(number));
    }
    case Json::value_t::string:
      return Value(json.get_ref<const std::string&>());
    case Json::value_t::array:
      return listOf(json, depth + 1);
    case Json::value_t::object:
      return dictionaryOf(json, depth + 1);
    default:
      return std::nullopt;
  }
}

std::variant<Json, LineFault> parseJson(std::string_view line) {
  if (line.find_first_not_of(" \t\r") == std::string_view::npos) return fault("empty line");
  try {
    return Json::parse(line);
  } catch (const Json::parse_error& error) {
    return LineFault{false, "not JSON, column " + std::to_string(error.byte)};
  }
}

std::optional<LineFault> readKind(const Json& json, RecordedEvent& event) {
  const auto name = json.find(kRecordedEventKey);
  if (name == json.end()) return fault("\"event\" is missing");
  if (!name->is_string()) return fault("\"event\" is no text");
  if (const auto kind = recordedKind(name->get_ref<const std::string&>())) {
    event.kind = *kind;
    return std::nullopt;
  }
  return fault("unknown \"event\" " + jsonText(Value(name->get_ref<const std::string&>())));
}

std::optional<LineFault> readTime(const Json& json, RecordedEvent& event) {
  const auto time = json.find(kRecordedTimeKey);
  if (time == json.end()) return fault("\"time_ms\" is missing");
  if (!time->is_number_unsigned()) return fault("\"time_ms\" is no unsigned integer");
  event.timeMs = time->get<std::uint64_t>();
  return std::nullopt;
}

std::optional<LineFault> readPayload(Value& value) {
  const auto text = value.asText();
  auto bytes = text ? bytesFromBase64(*text) : std::nullopt;
  if (!bytes) return fault("\"kKeyPayload\" is no standard base64 text");
  value = std::move(*bytes);
  return std::nullopt;
}

std::optional<LineFault> readEntries(const Json& json, RecordedEvent& event) {
  event.entries.reserve(json.size());
  for (const auto& [key, element] : json.items()) {
    if (key == kRecordedTimeKey || key == kRecordedEventKey) continue;
    auto value = valueOf(element, 0);
    if (!value) {
      return fault(jsonText(Value(key)) + " is nested too deep or out of range");
    }
    if (key == kRecordedPayloadKey) {
      if (auto bad = readPayload(*value)) return bad;
    }
    event.entries.append(key, std::move(*value));
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
  auto parsed = parseJson(line);
  if (auto* bad = std::get_if<LineFault>(&parsed)) return std::move(*bad);
  const Json& json = std::get<Json>(parsed);
  if (!json.is_object()) return fault("not a JSON object");
  RecordedEvent event;
  if (auto bad = readTime(json, event)) return std::move(*bad);
  if (auto bad = readKind(json, event)) return std::move(*bad);
  if (auto bad = readEntries(json, event)) return std::move(*bad);
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
