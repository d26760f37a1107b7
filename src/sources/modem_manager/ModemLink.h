// One bus connection to ModemManager and the one modem of it that is watched.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "base/TimeAsleep.h"
#include "bus/BusAddress.h"
#include "sources/SourceCondition.h"
#include "sources/modem_manager/BusCalls.h"
#include "sources/modem_manager/ModemPicture.h"
#include "sources/modem_manager/ObjectTree.h"
#include "sources/modem_manager/SaidOnce.h"
#include "sources/modem_manager/WatchedModem.h"

namespace qel::sources {

// Which modem, by one of the first two; with neither the first that there is. Where `device` gives
// a device of /sys, one that ModemManager says to be another device is not meant.
struct ModemWish {
  std::string imei = {};
  std::string path = {};
  std::function<std::string()> device = {};
};

struct ModemTiming {
  std::chrono::milliseconds period{5000};        // from report to report, and of polled methods
  std::chrono::milliseconds callTimeout{10000};  // of one call
  std::chrono::milliseconds (*asleep)() = timeAsleep;
};

// Belongs to one thread and lives as long as the connection: when that is lost, calls throw
// sdbus::Error and the link is of no more use. No call waits for an answer but finish().
class ModemLink {
 public:
  using Clock = std::chrono::steady_clock;

  ModemLink(const bus::BusAddress& address, ModemWish wish, const ModemTiming& timing,
            SaidOnce& said);

  // Waits for the bus, for `wakeDescriptor` or until then, and takes what came.
  void waitAndProcess(int wakeDescriptor, Clock::time_point until);

  // What is known may be of long ago: it counts no more, and all is asked for again.
  void readAnew();

  // The modem as it is known now; nothing while there is none.
  std::optional<ModemPicture> picture() const;
  // How it is with the modem; nothing while ModemManager has not answered yet.
  std::optional<SourceCondition> condition() const;

  // Leaves the modem as it was found. Waits some two seconds for that at most.
  void finish();

 private:
  void process();
  void choose();
  void leave();
  bool isWished(const std::string& path, const BusInterfaces& interfaces) const;
  bool mayBeDevice(const BusProperties& modem) const;
  void attend(Clock::time_point now);
  const BusInterfaces& watchedInterfaces() const;
  Clock::time_point due() const;

  const ModemWish _wish;
  const ModemTiming _timing;
  SaidOnce& _said;
  const std::unique_ptr<sdbus::IConnection> _connection;
  // Before the calls, whose answers go there: nothing is answered while it goes.
  std::unique_ptr<WatchedModem> _watched;
  BusCalls _calls;
  ObjectTree _tree;
  Clock::time_point _askAgainAt;
};

}  // namespace qel::sources
