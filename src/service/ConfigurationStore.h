// The installed configurations, by application identifier.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>

#include "service/DeviceConfiguration.h"

namespace qel::service {

// Any thread. Its lock is held for a look-up only and nothing is called under it.
class ConfigurationStore {
 public:
  // In place of an earlier one.
  void install(std::int64_t application, DeviceConfiguration configuration);
  void clear(std::int64_t application);
  // Nothing when none is installed.
  std::shared_ptr<const DeviceConfiguration> find(std::int64_t application) const;

  // Application identifiers and the number of metrics that each asks for.
  std::map<std::int64_t, std::uint32_t> sizes() const;

 private:
  mutable std::mutex _mutex;
  std::map<std::int64_t, std::shared_ptr<const DeviceConfiguration>> _byApplication;
};

}  // namespace qel::service
