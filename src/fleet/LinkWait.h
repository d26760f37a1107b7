// The sleep of a thread that serves a connection to a broker.
#pragma once

#include <chrono>
#include <optional>

#include "base/WakeUp.h"
#include "fleet/BrokerLink.h"

namespace qel::fleet {

// Until the moment, for ever without one; earlier when the wake-up rings, which it then no longer
// does, or when there is something to do for the link, if there is one. What poll says of the link.
short waitForLink(const BrokerLink* link, const WakeUp& wakeUp,
                  std::optional<std::chrono::steady_clock::time_point> until);

}  // namespace qel::fleet
