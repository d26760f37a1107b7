// The service's interface as its clients call it, without what our own client library adds.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include "tesk/bus/BasebandManager1Proxy.h"
#include "tesk/bus/BusAddress.h"

namespace qel::trials {

// One thread's. Every call may throw sdbus::Error.
class Proxy final : public sdbus::ProxyInterfaces<tesk::BasebandManager1_proxy> {
 public:
  explicit Proxy(sdbus::IConnection& connection)
      : ProxyInterfaces(connection, tesk::bus::kServiceName, tesk::bus::kObjectPath) {
    registerProxy();
  }
  ~Proxy() { unregisterProxy(); }

  sdbus::IProxy& raw() { return getProxy(); }
};

}  // namespace qel::trials
