// What one application wants to be told: metrics and triggers.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "base/Bytes.h"
#include "service/CommandCodes.h"

namespace qel::service {

// Immutable once made, so that any thread may read it.
class DeviceConfiguration {
 public:
  // Nothing when the payload is no configuration, or larger than the service takes; `reason` then
  // says why, and `code` is the one to refuse it with. A payload that is too large is not read.
  static std::optional<DeviceConfiguration> fromPayload(ByteView payload, std::string& reason,
                                                        CommandCode& code);
  static std::optional<DeviceConfiguration> fromPayload(ByteView payload, std::string& reason);

  // The reporting period of a metric that is wanted (0: every report), by its 16-bit identifier.
  std::optional<std::uint32_t> periodMs(std::uint32_t metric) const;
  bool wantsTrigger(std::int64_t trigger) const;

  std::size_t metricCount() const { return _periodsMs.size(); }

 private:
  struct TriggerRange {
    std::int64_t first;
    std::int64_t last;
  };

  std::map<std::uint32_t, std::uint32_t> _periodsMs;
  std::vector<TriggerRange> _triggers;
};

}  // namespace qel::service
