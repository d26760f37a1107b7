#include "recording/PayloadLine.h"

#include <optional>
#include <utility>

#include "recording/JsonLine.h"
#include "recording/PlainScanner.h"

namespace qel {
namespace {

constexpr KnownText kMetricText("\"metric\":");
constexpr KnownText kPayloadText("\"payload\":");

// Nothing for a line with anything else than the two in this order, each once and plain, as nearly
// every line is: the JSON parser judges it.
std::optional<PayloadLine> readPlainPayload(std::string_view line) {
  PlainScanner scanner(line);
  if (!scanner.take('{') || !scanner.take(kMetricText)) return std::nullopt;
  const auto metric = scanner.number();
  if (!metric || !scanner.take(',') || !scanner.take(kPayloadText)) return std::nullopt;
  const auto text = scanner.quoted();
  if (!text || !scanner.take('}') || !scanner.atEnd()) return std::nullopt;
  auto payload = bytesFromHex(*text);
  if (!payload) return std::nullopt;
  return PayloadLine{static_cast<std::int64_t>(*metric), std::move(*payload)};
}

bool isInteger(const Value& value) {
  return value.kind() == Value::Kind::signedInteger || value.kind() == Value::Kind::unsignedInteger;
}

}  // namespace

std::variant<PayloadLine, std::string> parsePayloadLine(std::string_view line) {
  if (auto plain = readPlainPayload(line)) return std::move(*plain);
  const auto parsed = parseJsonLine(line);
  if (const auto* fault = std::get_if<LineFault>(&parsed)) {
    return fault->isJson ? fault->reason : "not a JSON object";
  }
  const Dictionary& object = std::get<Dictionary>(parsed);
  const Value* metric = object.find("metric");
  if (!metric) return "\"metric\" is not an integer";
  const Value* payload = object.find("payload");
  const auto hex = payload ? payload->asText() : std::nullopt;
  if (!hex) return "\"payload\" is not a string";
  auto bytes = bytesFromHex(*hex);
  if (!bytes) return "\"payload\" is not hexadecimal bytes";
  if (!isInteger(*metric)) return "\"metric\" is not an integer";
  return PayloadLine{metric->asInt64().value_or(-1), std::move(*bytes)};
}

}  // namespace qel
