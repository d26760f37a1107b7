// What clients of the service may send, and what it costs others.

#include <gtest/gtest.h>
#include <poll.h>
#include <sdbus-c++/sdbus-c++.h>

#include <chrono>
#include <csignal>

#include "bus/ErrorOf.h"
#include "bus/ServiceProcess.h"
#include "service/CommandCodes.h"
#include "service/Limits.h"
#include "tesk/Constants.h"
#include "tesk/bus/BasebandManager1Proxy.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;
using service::CommandCode;
using Clock = std::chrono::steady_clock;
using Request = std::map<std::string, sdbus::Variant>;

constexpr const char* kInterface = tesk::BasebandManager1_proxy::INTERFACE_NAME;
constexpr const char* kLimitsExceeded = "org.freedesktop.DBus.Error.LimitsExceeded";

struct OwnConnection {
  std::unique_ptr<sdbus::IConnection> connection;
};

// What it hears arrives while it calls or pumps.
class Caller final
    : private OwnConnection,
      public sdbus::ProxyInterfaces<tesk::BasebandManager1_proxy, sdbus::Properties_proxy> {
 public:
  explicit Caller(const PrivateBus& bus)
      : OwnConnection{sdbus::createSessionBusConnectionWithAddress(bus.address())},
        ProxyInterfaces(*connection, tesk::bus::kServiceName, tesk::bus::kObjectPath) {
    registerProxy();
  }
  ~Caller() { unregisterProxy(); }

  sdbus::IProxy& proxy() { return getProxy(); }

  // Takes what has come, until the condition holds; ten seconds at most.
  bool pumpUntil(const std::function<bool()>& condition) const {
    const auto end = Clock::now() + 10s;
    while (!condition()) {
      if (Clock::now() > end) return false;
      if (connection->processPendingRequest()) continue;
      const auto data = connection->getEventLoopPollData();
      pollfd waited{data.fd, data.events, 0};
      ::poll(&waited, 1, 5);
    }
    return true;
  }

  int signals = 0;

 private:
  void onPropertiesChanged(const std::string&, const std::map<std::string, sdbus::Variant>&,
                           const std::vector<std::string>&) override {
    ++signals;
  }
};

class ServiceLimits : public ::testing::Test {
 protected:
  void SetUp() override { ASSERT_TRUE(Client(bus, "first").waitForReachable(true)); }

  static void expectCode(const std::tuple<std::int32_t, std::string, Request>& answer,
                         CommandCode code) {
    EXPECT_EQ(std::get<0>(answer), static_cast<std::int32_t>(code)) << std::get<1>(answer);
    EXPECT_EQ(std::get<1>(answer).find('\n'), std::string::npos);
    EXPECT_LT(std::get<1>(answer).size(), 200U);
  }
  static Request add(std::vector<std::uint8_t> payload) {
    return {{"kKeyAppID", sdbus::Variant(std::int64_t{2})},
            {"kKeyPayload", sdbus::Variant(std::move(payload))},
            {"kKeyPayloadType", sdbus::Variant(std::int64_t{0})}};
  }

  PrivateBus bus;
  ServiceProcess service{bus, "simulated,speed=20"};
};

// Names of megabytes made a signal that was larger than the bus takes: it threw the service out.
TEST_F(ServiceLimits, ALongClientNameIsRefused) {
  Caller caller(bus);
  const std::string invalid = "tesk.BasebandManager1.Error.InvalidName";
  for (int i = 0; i < 5; ++i) {
    EXPECT_EQ(errorOf([&] { caller.Register(std::string(8'000'000, 'n')); }), invalid);
  }
  const auto events = caller.Register(std::string(64, 'n'));
  EXPECT_EQ(caller.Clients().size(), 1U);
}

// Unpacked, an entry takes a hundred times what it takes on the bus.
TEST_F(ServiceLimits, ARequestOfManyEntriesIsRefusedUnread) {
  Caller caller(bus);
  const auto events = caller.Register("caller");
  Request request;
  for (int i = 0; i < 20'000; ++i) request["key" + std::to_string(i)] = sdbus::Variant(true);
  expectCode(caller.PerformCommand("kCommandQueryMetric", request), CommandCode::requestTooLarge);
  expectCode(caller.PerformCommand(std::string(1'000'000, 'c'), {}), CommandCode::requestTooLarge);
  expectCode(caller.PerformCommand("c", {{std::string(1'000'000, 'k'), sdbus::Variant(true)}}),
             CommandCode::requestTooLarge);
  expectCode(
      caller.PerformCommand("c", {{"kKeyAppID", sdbus::Variant(std::string(1'000'000, 't'))}}),
      CommandCode::requestTooLarge);
}

TEST_F(ServiceLimits, ALargeConfigurationIsRefusedWithItsSizeAndTheLimit) {
  Caller caller(bus);
  const auto events = caller.Register("caller");
  const auto answer = caller.PerformCommand("kCommandAddConfiguration",
                                            add(std::vector<std::uint8_t>(2'000'000, 0x12)));
  expectCode(answer, CommandCode::configurationTooLarge);
  EXPECT_EQ(std::get<1>(answer), "kKeyPayload has 2000000 bytes, at most 4096 are taken");
}

// Each entry was looked at alone: waiting calls of a few clients could hold tens of megabytes.
TEST_F(ServiceLimits, ARequestOfManyPayloadsIsRefused) {
  Caller caller(bus);
  const auto events = caller.Register("caller");
  Request request = add(std::vector<std::uint8_t>(4'000, 0x12));
  request.emplace("other", sdbus::Variant(std::vector<std::uint8_t>(4'000, 0x12)));
  expectCode(caller.PerformCommand("kCommandAddConfiguration", request),
             CommandCode::configurationTooLarge);
}

TEST_F(ServiceLimits, AValueOfATypeThatNoCommandTakesIsRefused) {
  Caller caller(bus);
  const auto events = caller.Register("caller");
  const Request nested = {{"kKeyAppID", sdbus::Variant(Request{{"a", sdbus::Variant(true)}})}};
  const auto answer = caller.PerformCommand("kCommandClearConfiguration", nested);
  expectCode(answer, CommandCode::wrongType);
  EXPECT_EQ(std::get<1>(answer), "kKeyAppID is of a type that no command takes");
}

TEST_F(ServiceLimits, EveryKindOfNumberIsTaken) {
  Caller caller(bus);
  const auto events = caller.Register("caller");
  const std::vector<sdbus::Variant> numbers = {
      sdbus::Variant(std::int64_t{1}), sdbus::Variant(std::uint64_t{1}),
      sdbus::Variant(std::int32_t{1}), sdbus::Variant(std::uint32_t{1}),
      sdbus::Variant(std::int16_t{1}), sdbus::Variant(std::uint16_t{1}),
      sdbus::Variant(std::uint8_t{1})};
  for (const auto& number : numbers) {
    const auto answer =
        caller.PerformCommand("kCommandClearConfiguration",
                              {{"kKeyAppID", number}, {"other", sdbus::Variant(std::string("t"))}});
    EXPECT_EQ(std::get<0>(answer), 0) << std::get<1>(answer);
  }
}

// A caller that did not wait for answers was served to its last call before anybody else, and each
// of its calls took memory.
TEST_F(ServiceLimits, ACallerThatFloodsIsRefusedAndOthersAreServed) {
  constexpr int kCalls = 5000;
  Caller flooder(bus);
  const auto events = flooder.Register("flooder");
  int answered = 0;
  int refused = 0;
  for (int i = 0; i < kCalls; ++i) {
    flooder.proxy()
        .callMethodAsync("SetDelivery")
        .onInterface(kInterface)
        .withArguments(i % 2 == 0)
        .uponReplyInvoke([&](const sdbus::Error* error) {
          ++(error ? refused : answered);
          EXPECT_TRUE(!error || error->getName() == kLimitsExceeded);
        });
  }
  Client other(bus, "other");
  EXPECT_EQ(other.install(2, {20330}).code, 0);
  EXPECT_TRUE(flooder.pumpUntil([&] { return answered + refused == kCalls; }));
  EXPECT_GT(answered, 0);
  EXPECT_GT(refused, 0);
  EXPECT_EQ(errorOf([&] { flooder.SetDelivery(true); }), "no error") << "one call at a time";
}

TEST_F(ServiceLimits, ACallerThatFloodsWithReadingsIsRefused) {
  constexpr int kCalls = 5000;
  Caller flooder(bus);
  int answered = 0;
  int refused = 0;
  for (int i = 0; i < kCalls; ++i) {
    flooder.proxy()
        .callMethodAsync("GetAll")
        .onInterface("org.freedesktop.DBus.Properties")
        .withArguments(kInterface)
        .uponReplyInvoke(
            [&](const sdbus::Error* error, const Request&) { ++(error ? refused : answered); });
  }
  EXPECT_TRUE(flooder.pumpUntil([&] { return answered + refused == kCalls; }));
  EXPECT_GT(answered, 0);
  EXPECT_GT(refused, 0);
  EXPECT_EQ(errorOf([&] { flooder.Source(); }), "no error") << "one call at a time";
}

TEST_F(ServiceLimits, SignalsThatPropertiesChangedAFewTimesASecond) {
  constexpr int kChanges = 400;
  Caller listener(bus);
  Caller caller(bus);
  const auto events = caller.Register("caller");
  const auto start = Clock::now();
  for (int i = 0; i < kChanges; ++i) caller.SetDelivery(i % 2 == 0);
  caller.SetDelivery(true);
  const auto isTold = [&, before = 0]() mutable {
    return std::exchange(before, listener.signals) != listener.signals;
  };
  EXPECT_TRUE(listener.pumpUntil(isTold));
  const auto quiet = Clock::now() + 1s;
  listener.pumpUntil([&] { return Clock::now() > quiet; });
  const auto most = (Clock::now() - start) / 250ms + 2;
  EXPECT_LE(listener.signals, most);
  EXPECT_LT(listener.signals, kChanges);
}

TEST_F(ServiceLimits, SwitchingOnWhatIsOnChangesNothing) {
  Caller caller(bus);
  const auto events = caller.Register("caller");
  caller.SetDelivery(true);
  Caller listener(bus);
  const auto settled = Clock::now() + 500ms;
  listener.pumpUntil([&] { return Clock::now() > settled; });
  listener.signals = 0;
  for (int i = 0; i < 100; ++i) caller.SetDelivery(true);
  const auto quiet = Clock::now() + 500ms;
  listener.pumpUntil([&] { return Clock::now() > quiet; });
  EXPECT_LE(listener.signals, 1) << "that of the counters";
}

TEST_F(ServiceLimits, ACallerThatRegistersOverAndOverIsRefusedForAWhile) {
  Caller caller(bus);
  int refused = 0;
  for (int i = 0; i < 20; ++i) {
    if (errorOf([&] { caller.Register("caller"); }) == kLimitsExceeded) ++refused;
  }
  EXPECT_GT(refused, 0);
  Caller another(bus);
  EXPECT_EQ(errorOf([&] { another.Register("another"); }), "no error");
}

TEST_F(ServiceLimits, ObeysAStopSignalWhileACallerFloods) {
  Caller flooder(bus);
  const auto events = flooder.Register("flooder");
  for (int i = 0; i < 20'000; ++i) {
    flooder.proxy()
        .callMethod("SetDelivery")
        .onInterface(kInterface)
        .withArguments(i % 2 == 0)
        .dontExpectReply();
  }
  service.signal(SIGTERM);
  EXPECT_EQ(service.waitForEnd(), 0);
}

}  // namespace
}  // namespace qel::testing
