// A modem on LTE, whose messages over the air and in the clear a reader takes.
#pragma once

#include <nlohmann/json.hpp>

#include "support/diagnostics/NasPackets.h"
#include "support/diagnostics/OtaPackets.h"
#include "support/diagnostics/SpeakingModem.h"

namespace qel::diagnostics::test {

inline constexpr std::uint16_t kOverTheAir = 0xB0C0;
inline constexpr std::uint16_t kStateEvent = 1606;
inline constexpr std::uint16_t kOutOfServiceEvent = 1607;
inline constexpr std::uint16_t kLinkFailureEvent = 1608;

using ToldMetrics = std::vector<std::uint32_t>;

class AirModem : public SpeakingModem {
 public:
  ToldMetrics air(AirChannel channel, const Bytes& message, const AirCell& cell = {}) {
    return send(kOverTheAir, overTheAir(channel, message, cell));
  }
  ToldMetrics nas(std::uint16_t code, const Bytes& message) {
    return send(code, plainNas(message));
  }
  ToldMetrics state(std::uint8_t code) { return sendEvent(kStateEvent, Bytes{code}); }

  // The metric without its time; null when there is nothing to say.
  nlohmann::json saying(std::uint32_t metric) const {
    const std::string text = said(metric);
    return text.empty() ? nlohmann::json() : nlohmann::json::parse(text);
  }
};

}  // namespace qel::diagnostics::test
