// How often the modem measures its signal: a rate that all clients of ModemManager share.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "service/sources/modem_manager/BusCalls.h"
#include "service/sources/modem_manager/BusValues.h"
#include "service/sources/modem_manager/SaidOnce.h"

namespace qel::service {

// Of one modem. Makes it measure at least every `wantedS` seconds, never less often than another
// client asked for. One thread; never waits.
class SignalRate {
 public:
  using Clock = std::chrono::steady_clock;

  SignalRate(std::string modem, std::uint32_t wantedS)
      : _modem(std::move(modem)), _wantedS(wantedS) {}

  void step(BusCalls& calls, SaidOnce& said, const std::string& identity,
            const BusInterfaces& interfaces, Clock::time_point now);
  // Asks for what was found, if the rate is still the one that was asked for here.
  void restore(BusCalls& calls, const BusInterfaces& interfaces);
  bool isUnderWay() const { return _underWay; }

 private:
  const std::string _modem;
  const std::uint32_t _wantedS;
  std::optional<std::uint32_t> _foundS;  // before it was changed here
  bool _seen = false;                    // the rate asked for has been announced
  bool _underWay = false;
  bool _off = false;
  Clock::time_point _notBefore;
};

}  // namespace qel::service
