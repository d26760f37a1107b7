// The way to the baseband manager service over D-Bus.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

#include "tesk/Transport.h"
#include "tesk/bus/BusAddress.h"
#include "tesk/bus/ConditionWatch.h"

namespace tesk::bus {

// Told whether the service can be reached, at first and at every change, also of the reason, on a
// thread of the connection's own. `why` is one line when it cannot: see Reasons.h.
using ReachabilityObserver = std::function<void(bool reachable, const std::string& why)>;

// How a thread spends the time until a command of its is answered. One for each command.
class AnswerWait {
 public:
  virtual ~AnswerWait() = default;
  // On that thread. Returns after wake(), or earlier when the thread waits no longer: the command
  // then answers kServiceUnreachable, and is not sent if it has not been.
  virtual void wait() = 0;
  // Any thread, once, perhaps before wait().
  virtual void wake() = 0;
};
using AnswerWaitMaker = std::function<std::shared_ptr<AnswerWait>()>;

// Its connections are there at once and find the service by themselves: when it appears, again when
// it or the bus comes back or it refused before, and then they register and switch delivery on as
// before. While it is away commands answer kServiceUnreachable; while it only takes its time they
// wait as `makeWait` has it, or without doing anything else. With a `rest` events may be late by
// that much, so that they come together: see EventRest.h.
std::shared_ptr<Connector> makeBusConnector(BusAddress address, ReachabilityObserver observer = {},
                                            AnswerWaitMaker makeWait = {},
                                            ConditionObserver conditionObserver = {},
                                            std::chrono::milliseconds rest = {});

}  // namespace tesk::bus
