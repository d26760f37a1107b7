// What a client sees of a service that comes, goes and comes back.

#include <gtest/gtest.h>

#include <csignal>
#include <filesystem>

#include "bus/ServiceProcess.h"
#include "messages/catalogue/KBBMetricUtility.h"

namespace qel::testing {
namespace {

namespace fs = std::filesystem;

constexpr const char* kFastDrive = "simulated,speed=20";
const std::vector<std::uint32_t> kSignal = {20330, 19972};

class BusConnection : public ::testing::Test {
 protected:
  BusConnection() { fs::create_directory(state); }
  ~BusConnection() override { fs::remove_all(state); }

  const std::string state = (fs::temp_directory_path() / ("qelbus" + std::to_string(::getpid())));
  PrivateBus bus;
};

TEST_F(BusConnection, carriesCommandsAndEvents) {
  const ServiceProcess service(bus, kFastDrive);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(client.waitForReachable(true));
  client.transport().eventsOn();
  EXPECT_EQ(client.install(2, kSignal).code, 0);
  EXPECT_TRUE(client.waitForMetrics(20));
  for (const std::int64_t metric : client.metrics()) {
    EXPECT_TRUE(metric == 20330 + kMetricEventBase || metric == 19972 + kMetricEventBase);
  }
}

TEST_F(BusConnection, sendsNothingWhileDeliveryIsOff) {
  const ServiceProcess service(bus, kFastDrive);
  Client other(bus, "other");
  Client client(bus, "client");
  ASSERT_TRUE(other.waitForReachable(true));
  ASSERT_TRUE(client.waitForReachable(true));
  EXPECT_EQ(client.install(2, kSignal).code, 0);
  EXPECT_EQ(other.install(3, kSignal).code, 0);
  other.transport().eventsOn();
  EXPECT_TRUE(other.waitForMetrics(20));
  EXPECT_TRUE(client.metrics().empty());
  client.transport().eventsOn();
  EXPECT_TRUE(client.waitForMetrics(5));
}

TEST_F(BusConnection, carriesARefusalWithItsCodeAndMessage) {
  const ServiceProcess service(bus, kFastDrive);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(client.waitForReachable(true));
  const auto result = client.query(2, 12345);
  EXPECT_NE(result.code, 0);
  EXPECT_NE(result.code, tesk::kServiceUnreachable);
  EXPECT_NE(result.message.find("kKeyTriggerID"), std::string::npos) << result.message;
}

TEST_F(BusConnection, answersCommandsItselfWhileThereIsNoService) {
  Client client(bus, "qelwatch");
  client.transport().eventsOn();
  const auto result = client.install(2, kSignal);
  EXPECT_EQ(result.code, tesk::kServiceUnreachable);
  EXPECT_EQ(result.message, "baseband manager service not reachable");
  EXPECT_TRUE(client.waitForReachable(false));
}

TEST_F(BusConnection, findsAServiceThatStartsLater) {
  Client client(bus, "qelwatch");
  client.transport().eventsOn();
  EXPECT_NE(client.install(2, kSignal).code, 0);
  const ServiceProcess service(bus, kFastDrive);
  EXPECT_TRUE(client.waitForReachable(true));
  EXPECT_EQ(client.install(2, kSignal).code, 0);
  EXPECT_TRUE(client.waitForMetrics(1));
}

TEST_F(BusConnection, goesOnAfterTheServiceWasKilledAndRestarted) {
  ServiceProcess service(bus, kFastDrive, state);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(client.waitForReachable(true));
  client.transport().eventsOn();
  ASSERT_EQ(client.install(2, kSignal).code, 0);
  ASSERT_TRUE(client.waitForMetrics(1));
  service.signal(SIGKILL);
  EXPECT_EQ(service.waitForEnd(), -SIGKILL);
  EXPECT_TRUE(client.waitForReachable(false));
  client.forgetMetrics();
  service.start();
  EXPECT_TRUE(client.waitForReachable(true));
  EXPECT_TRUE(client.waitForMetrics(5));
}

TEST_F(BusConnection, goesOnAfterTheBusWasRestarted) {
  const ServiceProcess service(bus, kFastDrive);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(client.waitForReachable(true));
  client.transport().eventsOn();
  ASSERT_EQ(client.install(2, kSignal).code, 0);
  ASSERT_TRUE(client.waitForMetrics(1));
  bus.stop();
  EXPECT_TRUE(client.waitForReachable(false));
  EXPECT_NE(client.install(2, kSignal).code, 0);
  client.forgetMetrics();
  bus.start();
  EXPECT_TRUE(client.waitForReachable(true));
  EXPECT_TRUE(client.waitForMetrics(5));
}

TEST_F(BusConnection, waitsForABusThatIsNotThereYet) {
  bus.stop();
  Client client(bus, "qelwatch");
  EXPECT_NE(client.install(2, kSignal).code, 0);
  bus.start();
  const ServiceProcess service(bus, kFastDrive);
  EXPECT_TRUE(client.waitForReachable(true));
}

TEST_F(BusConnection, keepsConfigurationsOverManyRestarts) {
  constexpr int kRestarts = 20;
  ServiceProcess service(bus, kFastDrive, state);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(client.waitForReachable(true));
  client.transport().eventsOn();
  ASSERT_EQ(client.install(2, kSignal).code, 0);
  for (int i = 0; i < kRestarts; ++i) {
    service.signal(SIGKILL);
    service.waitForEnd();
    ASSERT_TRUE(client.waitForReachable(false));
    client.forgetMetrics();
    service.start();
    ASSERT_TRUE(client.waitForMetrics(1)) << "restart " << i;
  }
}

}  // namespace
}  // namespace qel::testing
