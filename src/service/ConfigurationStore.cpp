#include "service/ConfigurationStore.h"

#include <utility>

namespace qel::service {

void ConfigurationStore::install(std::int64_t application, DeviceConfiguration configuration) {
  auto installed = std::make_shared<const DeviceConfiguration>(std::move(configuration));
  const std::lock_guard lock(_mutex);
  _byApplication.insert_or_assign(application, std::move(installed));
}

void ConfigurationStore::clear(std::int64_t application) {
  const std::lock_guard lock(_mutex);
  _byApplication.erase(application);
}

std::shared_ptr<const DeviceConfiguration> ConfigurationStore::find(
    std::int64_t application) const {
  const std::lock_guard lock(_mutex);
  const auto found = _byApplication.find(application);
  return found == _byApplication.end() ? nullptr : found->second;
}

std::map<std::int64_t, std::uint32_t> ConfigurationStore::sizes() const {
  const std::lock_guard lock(_mutex);
  std::map<std::int64_t, std::uint32_t> sizes;
  for (const auto& [application, configuration] : _byApplication) {
    sizes.emplace(application, static_cast<std::uint32_t>(configuration->metricCount()));
  }
  return sizes;
}

}  // namespace qel::service
