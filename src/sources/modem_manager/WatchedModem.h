// The modem that is watched: what is asked of it beside its properties, and what is set.
#pragma once

#include <chrono>
#include <cstdint>
#include <string>

#include "sources/modem_manager/BusCalls.h"
#include "sources/modem_manager/ModemReading.h"
#include "sources/modem_manager/PolledMethod.h"
#include "sources/modem_manager/PushedPlace.h"
#include "sources/modem_manager/SaidOnce.h"
#include "sources/modem_manager/SharedSetting.h"
#include "sources/modem_manager/SignalThresholds.h"

namespace qel::sources {

// One thread; never waits. Outlives the calls that it makes, or they are forgotten.
class WatchedModem {
 public:
  using Clock = std::chrono::steady_clock;

  // Cells and place are asked for once in each period at least. The signal is measured as often
  // unless the modem reports it by itself.
  WatchedModem(const std::string& modem, std::chrono::milliseconds period);
  WatchedModem(const WatchedModem&) = delete;
  WatchedModem& operator=(const WatchedModem&) = delete;

  const std::string& path() const { return _path; }
  const ModemAnswers& answers() const { return _answers; }

  // What was answered counts no more, and is asked for with the next step.
  void readAnew();
  // Calls what is due; `modem` is what is known of it.
  void step(BusCalls& calls, SaidOnce& said, const BusInterfaces& modem, Clock::time_point now);
  Clock::time_point due(const BusInterfaces& modem) const;

  // Leaves the settings as they were found, once none is being changed any more.
  void restore(BusCalls& calls, const BusInterfaces& modem);
  bool changesSettings() const {
    return _signalThresholds.isUnderWay() || _signalRate.isUnderWay() || _placeSources.isUnderWay();
  }

 private:
  bool mustBeMeasured(const BusInterfaces& modem, Clock::time_point now) const;

  const std::string _path;
  const std::chrono::milliseconds _period;
  ModemAnswers _answers;
  PushedPlace _pushedPlace;
  std::string _askedPlace;
  PolledMethod _cells;
  PolledMethod _place;
  SharedSetting<SignalThresholds> _signalThresholds;
  SharedSetting<std::uint32_t> _signalRate;
  SharedSetting<std::uint32_t, bool> _placeSources;
  std::uint32_t _accessTechnologies = 0;
  Clock::time_point _technologySince;
};

}  // namespace qel::sources
