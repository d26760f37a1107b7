// From which change on a modem reports its signal by itself.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <cstdint>
#include <optional>
#include <tuple>

#include "sources/modem_manager/BusValues.h"
#include "sources/modem_manager/Names.h"

namespace qel::sources {

struct SignalThresholds {
  std::uint32_t rssiDb = 0;  // 0: none
  bool errorRate = false;
  friend bool operator==(const SignalThresholds&, const SignalThresholds&) = default;
};

// As SetupThresholds takes them.
inline sdbus::Message& operator<<(sdbus::Message& message, const SignalThresholds& thresholds) {
  return message << BusProperties{{"rssi-threshold", sdbus::Variant(thresholds.rssiDb)},
                                  {"error-rate-threshold", sdbus::Variant(thresholds.errorRate)}};
}

// Nothing where the modem does not offer them (before ModemManager 1.20).
inline std::optional<std::tuple<SignalThresholds>> thresholdsIn(const BusInterfaces& modem) {
  const BusProperties& signal = propertiesOf(modem, mm::kSignal);
  const auto rssiDb = busUnsigned(signal, "RssiThreshold");
  if (!rssiDb) return std::nullopt;
  return SignalThresholds{*rssiDb, busValue<bool>(signal, "ErrorRateThreshold").value_or(false)};
}

}  // namespace qel::sources
