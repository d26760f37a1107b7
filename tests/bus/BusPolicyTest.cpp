// The shipped bus policy, on a bus like the system's, tried as different users. Needs root, who
// alone can become somebody else.

#include <gtest/gtest.h>
#include <unistd.h>

#include <chrono>
#include <thread>

#include "bus/PolicyTrial.h"
#include "bus/ServiceProcess.h"
#include "recording/TemporaryFile.h"
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

  int callAs(const char* user, const char* group) const {
    return as(user, group, *bus,
              {"call", tesk::bus::kServiceName, tesk::bus::kObjectPath, tesk::bus::kServiceName,
               "Register", "somebody"});
  }

  int readPropertyAs(const char* user, const char* group) const {
    return as(user, group, *bus,
              {"property", tesk::bus::kServiceName, tesk::bus::kObjectPath, tesk::bus::kServiceName,
               "Source"});
  }

  int ownAs(const char* user, const char* group) const {
    return as(user, group, *bus, {"own", tesk::bus::kServiceName});
  }

  // Listens for any signal of the service while clients come and go.
  int hearAs(const char* user, const char* group) const {
    const TemporaryFile said(".txt");
    Launch launch = launchAs(
        user, group, *bus, {"listen", "type='signal',interface='org.freedesktop.DBus.Properties'"});
    launch.out = said.path();
    ChildProcess listener(launch);
    while (said.content().empty() && !listener.ended()) {
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    for (int i = 0; i < 20; ++i) Client(*bus, "visitor").waitForReachable(true);
    return listener.waitForEnd();
  }

  std::unique_ptr<PrivateBus> bus;
  std::unique_ptr<ServiceProcess> service;
};

TEST_F(BusPolicy, refusesEveryCallOfAUserOutsideTheGroup) {
  EXPECT_EQ(callAs("nobody", kOtherGroup), denied);
  EXPECT_EQ(readPropertyAs("nobody", kOtherGroup), denied);
}

TEST_F(BusPolicy, letsTheGroupIn) {
  EXPECT_EQ(callAs("nobody", kClientGroup), allowed);
  EXPECT_EQ(readPropertyAs("nobody", kClientGroup), allowed);
}

TEST_F(BusPolicy, givesTheNameToTheServiceUserOnly) {
  service.reset();
  EXPECT_NE(ownAs("nobody", kClientGroup), allowed);
  EXPECT_EQ(ownAs(kServiceUser, kOtherGroup), allowed);
}

TEST_F(BusPolicy, hidesSignalsFromUsersOutsideTheGroup) {
  EXPECT_EQ(hearAs("nobody", kClientGroup), allowed);
  EXPECT_EQ(hearAs("nobody", kOtherGroup), denied);
}

}  // namespace
}  // namespace qel::testing
