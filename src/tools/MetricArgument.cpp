#include "tools/MetricArgument.h"

#include <algorithm>
#include <charconv>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

std::optional<std::int64_t> parseNumber(std::string_view text) {
  int base = 10;
  if (text.starts_with("0x") || text.starts_with("0X")) {
    base = 16;
    text.remove_prefix(2);
  }
  std::int64_t number = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number, base);
  if (error != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return number;
}

std::optional<std::uint32_t> findByName(std::string_view name) {
  const auto catalogue = KBBMetricUtility::catalogue();
  const auto named = std::ranges::find(catalogue, name, &MetricName::name);
  if (named != catalogue.end()) return named->identifier;
  const auto messages = metricMessages();
  const auto classed = std::ranges::find(messages, name, &MetricMessage::className);
  if (classed != messages.end()) return classed->identifier;
  return std::nullopt;
}

}  // namespace

std::optional<std::uint32_t> catalogueIdentifier(std::int64_t number) {
  constexpr std::int64_t kWidest = 0xFFFF;
  if (number > kWidest) number -= kMetricEventBase;
  if (number < 0 || number > kWidest) return std::nullopt;
  return static_cast<std::uint32_t>(number);
}

std::uint32_t parseMetric(const std::string& text) {
  const auto number = parseNumber(text);
  const auto identifier = number ? catalogueIdentifier(*number) : findByName(text);
  if (!identifier) throw ToolError(EX_USAGE, text, "no such metric");
  return *identifier;
}

}  // namespace qel::tools
