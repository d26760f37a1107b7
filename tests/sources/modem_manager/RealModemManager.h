// The ModemManager that is installed, on a bus of the test's own and with a simulated modem.
#pragma once

#include <sdbus-c++/sdbus-c++.h>
#include <sys/types.h>

#include <memory>
#include <string>

#include "sources/modem_manager/AtSimulator.h"
#include "support/PrivateBus.h"

namespace qel::testing {

// A process that ends with this object, and at the latest with the test's process.
class RealModemManager {
 public:
  static constexpr const char* kProgram = "/usr/sbin/ModemManager";
  static bool isInstalled();

  explicit RealModemManager(const PrivateBus& bus);
  ~RealModemManager();
  RealModemManager(const RealModemManager&) = delete;
  RealModemManager& operator=(const RealModemManager&) = delete;

  void start();
  // As a crash would.
  void kill();

  // As a user would. Each throws sdbus::Error when it is refused, and waits a minute at most.
  // Gives it the modem and waits until there is a path for it.
  std::string plugIn(const AtSimulator& modem);
  void enable(const std::string& modem, bool on = true);
  void connect(const std::string& modem, const std::string& apn);
  void disconnect(const std::string& modem);
  void setUpLocation(const std::string& modem, std::uint32_t sources, bool signals);

  template <class Type>
  Type property(const std::string& path, const char* interface, const char* name) {
    sdbus::Variant value;
    proxy(path)
        ->callMethod("Get")
        .onInterface("org.freedesktop.DBus.Properties")
        .withArguments(std::string(interface), std::string(name))
        .storeResultsTo(value);
    return value.get<Type>();
  }

 private:
  std::unique_ptr<sdbus::IProxy> proxy(const std::string& path);

  const std::string _address;
  std::unique_ptr<sdbus::IConnection> _connection;
  pid_t _pid = 0;
};

}  // namespace qel::testing
