// Which message bus to use.
#pragma once

#include <sdbus-c++/IConnection.h>
#include <memory>
#include <string>

namespace qel::bus {

// "system", "session" or a bus address such as "unix:path=/run/x".
struct BusAddress {
  std::string name = "system";
};

// A new connection. Throws sdbus::Error when there is no such bus.
std::unique_ptr<sdbus::IConnection> connectTo(const BusAddress& address);

}  // namespace qel::bus
