// The way to the baseband manager service over D-Bus.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "tesk/Transport.h"
#include "tesk/bus/BusAddress.h"

namespace tesk::bus {

// Told whether the service can be reached, at first and at every change, on a thread of the
// connection's own. `why` is one line when it cannot.
using ReachabilityObserver = std::function<void(bool reachable, const std::string& why)>;

// Its connections are there at once and find the service by themselves: when it appears, again when
// it or the bus comes back, and then they register and switch delivery on as before. While it is
// away commands answer kServiceUnreachable.
std::shared_ptr<Connector> makeBusConnector(BusAddress address, ReachabilityObserver observer = {});

}  // namespace tesk::bus
