// Where the service is found.
#pragma once

#include "bus/BusAddress.h"

namespace tesk::bus {

using qel::bus::BusAddress;
using qel::bus::connectTo;

// The service's names there.
inline constexpr const char* kServiceName = "tesk.BasebandManager1";
inline constexpr const char* kObjectPath = "/tesk/BasebandManager1";

}  // namespace tesk::bus
