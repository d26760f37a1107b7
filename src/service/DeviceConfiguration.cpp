#include "service/DeviceConfiguration.h"

#include <algorithm>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/device_config.h"
#include "service/Limits.h"

namespace qel::service {
namespace {

constexpr std::uint32_t kFormat = 1;

bool inCatalogue(std::uint32_t metric) {
  return std::ranges::find(KBBMetricUtility::catalogue(), metric, &MetricName::identifier) !=
         KBBMetricUtility::catalogue().end();
}

bool isTooMany(const char* what, std::size_t count, std::size_t limit, std::string& reason) {
  if (count <= limit) return false;
  reason = "has " + std::to_string(count) + " " + what + ", at most " + std::to_string(limit) +
           " are taken";
  return true;
}

}  // namespace

std::optional<DeviceConfiguration> DeviceConfiguration::fromPayload(ByteView payload,
                                                                    std::string& reason) {
  CommandCode code{};
  return fromPayload(payload, reason, code);
}

std::optional<DeviceConfiguration> DeviceConfiguration::fromPayload(ByteView payload,
                                                                    std::string& reason,
                                                                    CommandCode& code) {
  code = CommandCode::configurationTooLarge;
  if (isTooMany("bytes", payload.size(), limits::kPayloadBytes, reason)) return std::nullopt;
  const auto message = DeviceConfig::initWithData(payload);
  const std::size_t entries = message ? message->metricsCount() + message->triggersCount() : 0;
  if (isTooMany("entries", entries, limits::kConfigurationEntries, reason)) return std::nullopt;
  code = CommandCode::notAConfiguration;
  if (!message || message->format() != kFormat) {
    reason = "is no configuration";
    return std::nullopt;
  }
  DeviceConfiguration configuration;
  for (const auto& metric : message->metrics()) {
    if (!metric->hasIdentifier() || !inCatalogue(metric->identifier())) {
      reason = "names an unknown metric " + std::to_string(metric->identifier());
      return std::nullopt;
    }
    configuration._periodsMs.insert_or_assign(metric->identifier(), metric->periodMs());
  }
  for (const auto& trigger : message->triggers()) {
    const std::uint32_t last = trigger->hasLast() ? trigger->last() : trigger->first();
    if (!trigger->hasFirst() || last < trigger->first()) {
      reason = "names triggers without a first or with a last before it";
      return std::nullopt;
    }
    configuration._triggers.push_back({trigger->first(), last});
  }
  if (configuration._periodsMs.empty() && configuration._triggers.empty()) {
    reason = "asks for nothing";
    return std::nullopt;
  }
  return configuration;
}

std::optional<std::uint32_t> DeviceConfiguration::periodMs(std::uint32_t metric) const {
  const auto found = _periodsMs.find(metric);
  if (found == _periodsMs.end()) return std::nullopt;
  return found->second;
}

bool DeviceConfiguration::wantsTrigger(std::int64_t trigger) const {
  return std::ranges::any_of(_triggers, [trigger](const TriggerRange& range) {
    return range.first <= trigger && trigger <= range.last;
  });
}

}  // namespace qel::service
