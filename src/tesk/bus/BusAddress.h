// Which bus to use.
#pragma once

#include <sdbus-c++/IConnection.h>
#include <memory>
#include <string>

namespace tesk::bus {

// "system", "session" or a bus address such as "unix:path=/run/x".
struct BusAddress {
  std::string name = "system";
};

// The service's names there.
inline constexpr const char* kServiceName = "tesk.BasebandManager1";
inline constexpr const char* kObjectPath = "/tesk/BasebandManager1";

// A new connection. Throws sdbus::Error when there is no such bus.
std::unique_ptr<sdbus::IConnection> connectTo(const BusAddress& address);

}  // namespace tesk::bus
