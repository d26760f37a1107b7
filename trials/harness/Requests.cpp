#include "harness/Requests.h"

#include <array>
#include <fstream>
#include <iterator>
#include <memory>

#include "messages/device_config.h"

namespace qel::trials {

Request installRequest(std::int64_t application, const Bytes& payload) {
  const std::vector<std::uint8_t> bytes(payload.begin(), payload.end());
  return {{"kKeyAppID", sdbus::Variant(application)},
          {"kKeyPayload", sdbus::Variant(bytes)},
          {"kKeyPayloadType", sdbus::Variant(std::int64_t{0})}};
}

Bytes viewersConfiguration() {
  std::ifstream file(QEL_CONFIGURATION, std::ios::binary);
  return Bytes(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
}

Bytes configurationOfMetrics(std::size_t count) {
  constexpr std::array<std::uint32_t, 4> kMetrics = {19972, 19992, 20005, 16578};
  DeviceConfig configuration;
  configuration.setFormat(1);
  for (std::size_t i = 0; i < count; ++i) {
    auto wanted = std::make_shared<ConfiguredMetric>();
    wanted->setIdentifier(kMetrics.at(i));
    configuration.addMetric(std::move(wanted));
  }
  return configuration.data();
}

Bytes configurationOfTriggers(std::uint32_t count) {
  DeviceConfig configuration;
  configuration.setFormat(1);
  for (std::uint32_t i = 0; i < count; ++i) {
    auto wanted = std::make_shared<ConfiguredTrigger>();
    wanted->setFirst(2 * i);
    configuration.addTrigger(std::move(wanted));
  }
  return configuration.data();
}

Bytes payloadOfMetricTags(std::size_t size) {
  // Field 19, a number; 19 is also the metric of the SIM files.
  const Bytes field = {0x98, 0x01, 0x00};
  Bytes payload = {0x08, 0x01};
  while (payload.size() < size) payload.insert(payload.end(), field.begin(), field.end());
  return payload;
}

}  // namespace qel::trials
