// Something that is done to the service for a while, by a client on a thread of its own.
#pragma once

#include <functional>
#include <string>
#include <thread>

#include "harness/Proxy.h"

namespace qel::trials {

// Calls the deed again and again until the end of this object, on a bus connection of its own and
// registered with the service. When the connection is lost or a call is refused, it goes on.
class Attack {
 public:
  using Deed = std::function<void(sdbus::IConnection& connection, Proxy& proxy)>;

  Attack(std::string busAddress, Deed deed);
  Attack(Attack&&) = default;

 private:
  std::jthread _thread;
};

}  // namespace qel::trials
