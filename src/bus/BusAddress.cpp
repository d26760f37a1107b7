#include "bus/BusAddress.h"

namespace qel::bus {

std::unique_ptr<sdbus::IConnection> connectTo(const BusAddress& address) {
  if (address.name == "system") return sdbus::createSystemBusConnection();
  if (address.name == "session") return sdbus::createSessionBusConnection();
  return sdbus::createSessionBusConnectionWithAddress(address.name);
}

}  // namespace qel::bus
