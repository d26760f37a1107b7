// How it is with the modem, as other programs learn it from the service.

#include <gtest/gtest.h>
#include <sdbus-c++/sdbus-c++.h>

#include <chrono>
#include <csignal>
#include <functional>
#include <mutex>
#include <thread>

#include "bus/ServiceProcess.h"
#include "sources/modem_manager/FakeModemManager.h"
#include "tesk/bus/BusConnector.h"
#include "tesk/bus/ServiceStatus.h"

namespace qel::testing {
namespace {

const std::string kModemInterface = "org.freedesktop.ModemManager1.Modem";
const std::string kModem = "/org/freedesktop/ModemManager1/Modem/0";

class ConditionOnTheBus : public ::testing::Test {
 protected:
  bool becomes(const std::function<bool()>& condition) {
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (!condition()) {
      if (std::chrono::steady_clock::now() > end) return false;
      while (connection->processPendingRequest()) {
      }
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    return true;
  }
  tesk::bus::ConditionStatus condition() const {
    std::string why;
    const auto status = tesk::bus::readServiceStatus({bus.address()}, why);
    return status ? status->condition : tesk::bus::ConditionStatus();
  }
  bool becomesState(const std::string& state) {
    return becomes([&] { return condition().state == state; });
  }

  PrivateBus bus;
  std::unique_ptr<sdbus::IConnection> connection =
      sdbus::createSessionBusConnectionWithAddress(bus.address());
  ServiceProcess service{bus, "modem-manager,bus=" + bus.address()};
  Client client{bus, "reader"};
};

// Once the service said that its source runs, whatever was wrong with the modem.
TEST_F(ConditionOnTheBus, TellsWhatIsWrongWithTheModem) {
  ASSERT_TRUE(client.waitForReachable(true));
  EXPECT_EQ(condition().state, "");
  client.transport().eventsOn();
  ASSERT_TRUE(becomesState("no-modem-manager"));
  FakeModemManager manager(bus.address());
  ASSERT_TRUE(becomesState("absent"));
  manager.add(kModem, {{kModemInterface,
                        {{"State", std::int32_t{2}},
                         {"UnlockRequired", std::uint32_t{2}},
                         {"EquipmentIdentifier", std::string("350000000000011")},
                         {"Model", std::string("X 100")},
                         {"Drivers", std::vector<std::string>{"qmi_wwan"}}}}});
  ASSERT_TRUE(becomesState("locked"));
  const auto locked = condition();
  EXPECT_EQ(locked.text, "Modem locked: SIM PIN needed");
  EXPECT_EQ(locked.reason, "SIM PIN needed");
  EXPECT_EQ(locked.model, "X 100");
  EXPECT_EQ(locked.driver, "qmi_wwan");
}

TEST_F(ConditionOnTheBus, SignalsEachChange) {
  std::string signalled;
  const auto match = connection->addMatch(
      "type='signal',interface='org.freedesktop.DBus.Properties',member='PropertiesChanged',"
      "path='/tesk/BasebandManager1'",
      [&](sdbus::Message& signal) {
        std::string interface;
        std::map<std::string, sdbus::Variant> properties;
        signal >> interface >> properties;
        const auto found = properties.find("Condition");
        if (found == properties.end()) return;
        const auto entries = found->second.get<std::map<std::string, sdbus::Variant>>();
        const auto state = entries.find("state");
        signalled = state == entries.end() ? "nothing" : state->second.get<std::string>();
      });
  ASSERT_TRUE(client.waitForReachable(true));
  client.transport().eventsOn();
  ASSERT_TRUE(becomes([&] { return signalled == "no-modem-manager"; }));
  {
    FakeModemManager manager(bus.address());
    ASSERT_TRUE(becomes([&] { return signalled == "absent"; }));
  }
  ASSERT_TRUE(becomes([&] { return signalled == "no-modem-manager"; }));
}

TEST_F(ConditionOnTheBus, IsFollowedByTheClientLibrary) {
  std::mutex mutex;
  std::string line = "nothing yet";
  const auto connector =
      tesk::bus::makeBusConnector({bus.address()}, {}, {}, [&](const std::string& told) {
        const std::lock_guard lock(mutex);
        line = told;
      });
  const auto transport = connector->connect("viewer", [](std::string_view, tesk::Message) {});
  const auto becomesLine = [&](const std::string& wanted) {
    return becomes([&] {
      const std::lock_guard lock(mutex);
      return line == wanted;
    });
  };
  transport->eventsOn();
  ASSERT_TRUE(becomesLine("ModemManager not running"));
  const FakeModemManager manager(bus.address());
  ASSERT_TRUE(becomesLine("No modem"));
  service.signal(SIGKILL);
  service.waitForEnd();
  ASSERT_TRUE(becomesLine(""));
  service.start();
  EXPECT_TRUE(becomesLine("No modem"));
}

TEST_F(ConditionOnTheBus, IsFollowedWithItsWordForPrograms) {
  std::mutex mutex;
  std::string state;
  const auto connector =
      tesk::bus::makeBusConnector({bus.address()}, {}, {}, [&](const tesk::bus::Condition& told) {
        const std::lock_guard lock(mutex);
        state = told.state;
      });
  const auto transport = connector->connect("viewer", [](std::string_view, tesk::Message) {});
  transport->eventsOn();
  EXPECT_TRUE(becomes([&] {
    const std::lock_guard lock(mutex);
    return state == "no-modem-manager";
  }));
}

}  // namespace
}  // namespace qel::testing
