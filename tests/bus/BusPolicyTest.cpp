// The shipped bus policy, on a bus like the system's, tried as different users. Needs root, who
// alone can become somebody else.

#include <gtest/gtest.h>
#include <sdbus-c++/sdbus-c++.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <thread>

#include "bus/PolicyTrial.h"
#include "bus/ServiceProcess.h"
#include "tesk/bus/BasebandManager1Proxy.h"

namespace qel::testing {
namespace {

// As the system bus: who may connect may do so, and all else is denied unless allowed.
std::string systemLikePolicy() {
  return "<policy context=\"default\"><allow user=\"*\"/><deny own=\"*\"/>"
         "<deny send_type=\"method_call\"/><allow send_type=\"signal\"/>"
         "<allow send_requested_reply=\"true\" send_type=\"method_return\"/>"
         "<allow send_requested_reply=\"true\" send_type=\"error\"/>"
         "<allow receive_type=\"method_call\"/><allow receive_type=\"method_return\"/>"
         "<allow receive_type=\"error\"/><allow receive_type=\"signal\"/>"
         "<allow send_destination=\"org.freedesktop.DBus\"/></policy>" +
         shippedPolicy(QEL_BUS_POLICY);
}

class BusPolicy : public ::testing::Test {
 protected:
  void SetUp() override {
    if (::geteuid() != 0) GTEST_SKIP() << "needs root";
    bus = std::make_unique<PrivateBus>(systemLikePolicy());
    service = std::make_unique<ServiceProcess>(*bus, "simulated");
    ASSERT_TRUE(Client(*bus, "root").waitForReachable(true));
  }

  int callAs(const char* user, const char* group) {
    return as(user, group, [this] {
      return judge([this] {
        const auto connection = sdbus::createSessionBusConnectionWithAddress(bus->address());
        const auto proxy =
            sdbus::createProxy(*connection, tesk::bus::kServiceName, tesk::bus::kObjectPath);
        sdbus::UnixFd events;
        proxy->callMethod("Register")
            .onInterface(tesk::bus::kServiceName)
            .withArguments("somebody")
            .storeResultsTo(events);
      });
    });
  }

  int readPropertyAs(const char* user, const char* group) {
    return as(user, group, [this] {
      return judge([this] {
        const auto connection = sdbus::createSessionBusConnectionWithAddress(bus->address());
        const auto proxy =
            sdbus::createProxy(*connection, tesk::bus::kServiceName, tesk::bus::kObjectPath);
        const std::string source =
            proxy->getProperty("Source").onInterface(tesk::bus::kServiceName);
        if (source.empty()) throw sdbus::Error("empty");
      });
    });
  }

  std::unique_ptr<PrivateBus> bus;
  std::unique_ptr<ServiceProcess> service;
};

TEST_F(BusPolicy, refusesEveryCallOfAUserOutsideTheGroup) {
  EXPECT_EQ(callAs("nobody", nullptr), denied);
  EXPECT_EQ(readPropertyAs("nobody", nullptr), denied);
}

TEST_F(BusPolicy, letsTheGroupIn) {
  EXPECT_EQ(callAs("nobody", kClientGroup), allowed);
  EXPECT_EQ(readPropertyAs("nobody", kClientGroup), allowed);
}

TEST_F(BusPolicy, givesTheNameToTheServiceUserOnly) {
  const auto ownAs = [this](const char* user, const char* group) {
    return as(user, group, [this] {
      return judge([this] {
        const auto connection = sdbus::createSessionBusConnectionWithAddress(bus->address());
        connection->requestName(tesk::bus::kServiceName);
      });
    });
  };
  service.reset();
  EXPECT_NE(ownAs("nobody", kClientGroup), allowed);
  EXPECT_EQ(ownAs(kServiceUser, nullptr), allowed);
}

TEST_F(BusPolicy, hidesSignalsFromUsersOutsideTheGroup) {
  // A stranger who listens for any signal of the service sees none while clients come and go.
  const auto heardAs = [this](const char* user, const char* group) {
    std::array<int, 2> ready{};
    EXPECT_EQ(::pipe(ready.data()), 0);
    std::thread disturbance([&] {
      char go = 0;
      if (::read(ready[0], &go, 1) == 1) {
        for (int i = 0; i < 20; ++i) Client(*bus, "visitor").waitForReachable(true);
      }
    });
    const int heard = as(user, group, [this, &ready] {
      const auto connection = sdbus::createSessionBusConnectionWithAddress(bus->address());
      bool signal = false;
      const auto match =
          connection->addMatch("type='signal',interface='org.freedesktop.DBus.Properties'",
                               [&signal](sdbus::Message&) { signal = true; });
      if (::write(ready[1], "x", 1) != 1) return int{other};
      const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(2);
      while (!signal && std::chrono::steady_clock::now() < end) {
        while (connection->processPendingRequest()) {
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
      }
      return signal ? 10 : 11;
    });
    ::close(ready[1]);
    disturbance.join();
    ::close(ready[0]);
    return heard;
  };
  EXPECT_EQ(heardAs("nobody", kClientGroup), 10);
  EXPECT_EQ(heardAs("nobody", nullptr), 11);
}

}  // namespace
}  // namespace qel::testing
