// Which message bus to use.
#pragma once

#include <sdbus-c++/IConnection.h>
#include <memory>
#include <string>
#include <string_view>

namespace qel::bus {

// "system", "session" or a bus address such as "unix:path=/run/x".
struct BusAddress {
  std::string name = "system";
};

// Whether the text is one of these, though there need be no such bus. For whoever takes it from a
// command line; empty, or one line why it is none.
std::string faultOfBusName(std::string_view name);

// A new connection. Throws sdbus::Error when there is no such bus.
std::unique_ptr<sdbus::IConnection> connectTo(const BusAddress& address);

}  // namespace qel::bus
