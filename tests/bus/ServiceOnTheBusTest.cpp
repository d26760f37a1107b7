// What the service does for several clients, good and bad.

#include <gtest/gtest.h>
#include <sdbus-c++/sdbus-c++.h>

#include <chrono>
#include <csignal>
#include <fstream>
#include <set>
#include <thread>

#include "bus/ErrorOf.h"
#include "bus/ServiceProcess.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "tesk/bus/BasebandManager1Proxy.h"

namespace qel::testing {
namespace {

constexpr const char* kFastDrive = "simulated,speed=20";

class RawClient final : public sdbus::ProxyInterfaces<tesk::BasebandManager1_proxy> {
 public:
  explicit RawClient(sdbus::IConnection& connection)
      : ProxyInterfaces(connection, tesk::bus::kServiceName, tesk::bus::kObjectPath) {
    registerProxy();
  }
  ~RawClient() { unregisterProxy(); }
};

class ServiceOnTheBus : public ::testing::Test {
 protected:
  // Waits until the service has taken its name and is by itself.
  void SetUp() override {
    ASSERT_TRUE(Client(bus, "first").waitForReachable(true));
    RawClient raw(*connection);
    ASSERT_TRUE(eventually([&] { return raw.Clients().empty(); }));
  }

  // Calls until the condition holds, for ten seconds at most.
  static bool eventually(const std::function<bool()>& condition) {
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    while (!condition()) {
      if (std::chrono::steady_clock::now() > end) return false;
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    return true;
  }

  PrivateBus bus;
  ServiceProcess service{bus, kFastDrive};
  std::unique_ptr<sdbus::IConnection> connection =
      sdbus::createSessionBusConnectionWithAddress(bus.address());
};

TEST_F(ServiceOnTheBus, wantsClientsToRegisterFirst) {
  RawClient raw(*connection);
  const std::string error = "tesk.BasebandManager1.Error.NotRegistered";
  EXPECT_EQ(errorOf([&] { raw.SetDelivery(true); }), error);
  EXPECT_EQ(errorOf([&] { raw.PerformCommand("kCommandQueryMetric", {}); }), error);
  EXPECT_EQ(errorOf([&] { raw.Register(""); }), "tesk.BasebandManager1.Error.InvalidName");
}

TEST_F(ServiceOnTheBus, givesEachClientItsOwnMetrics) {
  Client signal(bus, "signal");
  Client states(bus, "states");
  ASSERT_EQ(signal.install(2, {20330}).code, 0);
  ASSERT_EQ(states.install(3, {19972, 54018}).code, 0);
  signal.transport().eventsOn();
  states.transport().eventsOn();
  ASSERT_TRUE(signal.waitForMetrics(20));
  ASSERT_TRUE(states.waitForMetrics(20));
  for (const auto metric : signal.metrics()) EXPECT_EQ(metric, 20330 + kMetricEventBase);
  for (const auto metric : states.metrics()) EXPECT_NE(metric, 20330 + kMetricEventBase);
}

TEST_F(ServiceOnTheBus, forgetsAClientThatVanishes) {
  RawClient raw(*connection);
  {
    const Client client(bus, "passing");
    ASSERT_TRUE(eventually([&] { return !raw.Clients().empty(); }));
  }
  EXPECT_TRUE(eventually([&] { return raw.Clients().empty(); }));
}

TEST_F(ServiceOnTheBus, forgetsAClientThatClosesItsStream) {
  RawClient raw(*connection);
  auto stream = raw.Register("closing");
  EXPECT_EQ(raw.Clients().size(), 1U);
  stream.reset();
  EXPECT_TRUE(eventually([&] { return raw.Clients().empty(); }));
}

TEST_F(ServiceOnTheBus, takesASecondRegistrationInPlaceOfTheFirst) {
  RawClient raw(*connection);
  const auto first = raw.Register("one");
  const auto second = raw.Register("two");
  ASSERT_EQ(raw.Clients().size(), 1U);
  EXPECT_EQ(std::get<0>(raw.Clients()[0]), "two");
}

TEST_F(ServiceOnTheBus, showsItsStateAsProperties) {
  RawClient raw(*connection);
  EXPECT_NE(raw.Source().find("simulated"), std::string::npos);
  EXPECT_FALSE(raw.SourceRunning());
  Client client(bus, "qelwatch");
  ASSERT_EQ(client.install(2, {20330, 19972}).code, 0);
  client.transport().eventsOn();
  ASSERT_TRUE(client.waitForMetrics(5));
  EXPECT_TRUE(raw.SourceRunning());
  EXPECT_EQ(raw.Configurations(), (std::map<std::int64_t, std::uint32_t>{{2, 2}}));
  EXPECT_GE(raw.EventsReceived(), 5U);
  // An event is with the client a moment before it is counted.
  EXPECT_TRUE(eventually([&] {
    // Nobody may ask all the time.
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
    return raw.EventsDelivered() >= 5U;
  }));
  EXPECT_EQ(raw.EventsDropped(), 0U);
  EXPECT_EQ(raw.EventsUndecodable(), 0U);
}

TEST_F(ServiceOnTheBus, goesOnForOthersWhenAClientDoesNotRead) {
  RawClient raw(*connection);
  const auto unread = raw.Register("frozen");
  std::vector<std::uint32_t> all;
  for (const auto& metric : KBBMetricUtility::catalogue()) all.push_back(metric.identifier);
  Client reader(bus, "reader");
  ASSERT_EQ(reader.install(2, all).code, 0);
  // The frozen client belongs to the same application and so wants the same.
  const auto code = std::get<0>(raw.PerformCommand(
      "kCommandQueryMetric", {{"kKeyAppID", sdbus::Variant(std::int64_t{2})},
                              {"kKeyPayloadType", sdbus::Variant(std::int64_t{0})},
                              {"kKeyTriggerRef", sdbus::Variant(std::int64_t{1})},
                              {"kKeyTriggerType", sdbus::Variant(std::int64_t{0})},
                              {"kKeyTriggerID", sdbus::Variant(std::int64_t{8323091})},
                              {"kKeyProfileID", sdbus::Variant(std::int64_t{0})},
                              {"kKeyMetricID", sdbus::Variant(std::int64_t{0})}}));
  EXPECT_NE(code, 0);  // events are off yet: nothing can be delivered
  raw.SetDelivery(true);
  reader.transport().eventsOn();
  EXPECT_TRUE(reader.waitForMetrics(300));
  EXPECT_EQ(raw.EventsUndecodable(), 0U);
}

TEST_F(ServiceOnTheBus, leavesTheBusOnSigterm) {
  service.signal(SIGTERM);
  EXPECT_EQ(service.waitForEnd(), 0);
}

TEST_F(ServiceOnTheBus, isThereOnlyOnce) {
  ServiceProcess second(bus, kFastDrive);
  EXPECT_EQ(second.waitForEnd(), 69);
}

}  // namespace
}  // namespace qel::testing
