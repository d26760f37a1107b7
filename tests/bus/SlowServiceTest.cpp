// Clients of a service that has no room for them, or that takes its time.

#include <gtest/gtest.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <future>
#include <sstream>
#include <thread>

#include "bus/MoodyService.h"
#include "bus/ServiceProcess.h"
#include "tesk/Constants.h"
#include "tesk/bus/EventPacket.h"

namespace qel::testing {
namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;
using Mood = MoodyService::Mood;

// Calls until the condition holds, for a minute at most.
bool eventually(const std::function<bool()>& condition) {
  const auto end = std::chrono::steady_clock::now() + 1min;
  while (!condition()) {
    if (std::chrono::steady_clock::now() > end) return false;
    std::this_thread::sleep_for(5ms);
  }
  return true;
}

class SlowService : public ::testing::Test {
 protected:
  PrivateBus bus;
};

// One refusal was the end of it: the client never asked again.
TEST_F(SlowService, aClientThatWasRefusedIsTakenOnceThereIsRoom) {
  MoodyService service(bus, Mood::refuses, Mood::answers);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(eventually([&] { return service.registrations() >= 3; }));
  EXPECT_EQ(client.why(), "baseband manager service has too many clients");
  const auto refused = client.clear(2);
  EXPECT_EQ(refused.code, tesk::kServiceUnreachable);
  EXPECT_EQ(refused.message, "baseband manager service has too many clients");
  service.setMoods(Mood::answers, Mood::answers);
  EXPECT_TRUE(client.waitForReachable(true));
  EXPECT_EQ(client.clear(2).code, 0);
}

// A service that hung while the client registered was never asked again.
TEST_F(SlowService, aClientFindsAServiceThatHungAtFirst) {
  MoodyService service(bus, Mood::saysNothing, Mood::answers);
  Client client(bus, "qelwatch");
  const auto result = client.clear(2);
  EXPECT_EQ(result.code, tesk::kServiceUnreachable);
  EXPECT_EQ(result.message, "baseband manager service does not answer");
  EXPECT_TRUE(eventually([&] { return client.why() == result.message; }));
  service.setMoods(Mood::answers, Mood::answers);
  EXPECT_TRUE(client.waitForReachable(true));
  EXPECT_EQ(client.clear(2).code, 0);
  EXPECT_EQ(service.commands().size(), 1U) << "the first was never sent";
}

// A command answered "not reachable" when time was up, and took effect later.
TEST_F(SlowService, aCommandTakesAsLongAsTheServiceDoes) {
  MoodyService service(bus, Mood::answers, Mood::saysNothing);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(client.waitForReachable(true));
  auto result = std::async(std::launch::async, [&client] { return client.clear(2); });
  EXPECT_TRUE(
      eventually([&client] { return client.why() == "baseband manager service does not answer"; }));
  service.setMoods(Mood::answers, Mood::refuses);
  EXPECT_EQ(result.get().code, 7);
  EXPECT_TRUE(client.waitForReachable(true));
}

TEST_F(SlowService, aCommandEndsWithTheServiceThatHasIt) {
  auto service = std::make_unique<MoodyService>(bus, Mood::answers, Mood::saysNothing);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(client.waitForReachable(true));
  auto result = std::async(std::launch::async, [&client] { return client.clear(2); });
  ASSERT_TRUE(eventually([&service] { return !service->commands().empty(); }));
  service.reset();
  EXPECT_EQ(result.get().code, tesk::kServiceUnreachable);
}

// A service that was too busy was taken for one that is not there.
TEST_F(SlowService, aCommandThatABusyServiceRefusedIsSentAgain) {
  MoodyService service(bus, Mood::answers, Mood::isBusy);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(client.waitForReachable(true));
  auto result = std::async(std::launch::async, [&client] { return client.clear(2); });
  ASSERT_TRUE(eventually([&service] { return service.refusals() >= 2; }));
  EXPECT_EQ(client.why(), "baseband manager service is busy");
  service.setMoods(Mood::answers, Mood::answers);
  EXPECT_EQ(result.get().code, 0);
  EXPECT_TRUE(client.waitForReachable(true));
  EXPECT_EQ(service.commands().size(), 1U);
  EXPECT_EQ(service.registrations(), 1);
}

// The refusal ended the registration, and with it what other commands were about to come to.
TEST_F(SlowService, eventsThatABusyServiceDidNotTurnOnAreAskedForAgain) {
  MoodyService service(bus, Mood::answers, Mood::isBusy);
  Client client(bus, "qelwatch");
  ASSERT_TRUE(client.waitForReachable(true));
  client.transport().eventsOn();
  ASSERT_TRUE(eventually([&service] { return service.refusals() >= 2; }));
  service.setMoods(Mood::answers, Mood::answers);
  EXPECT_TRUE(eventually([&service] { return service.delivers(); }));
  EXPECT_TRUE(client.waitForReachable(true));
  EXPECT_EQ(service.registrations(), 1);
}

TEST_F(SlowService, aServiceTooBusyToRegisterAClientIsCalledBusy) {
  MoodyService service(bus, Mood::isBusy, Mood::answers);
  Client client(bus, "qelwatch");
  EXPECT_TRUE(eventually([&] { return client.why() == "baseband manager service is busy"; }));
  service.setMoods(Mood::answers, Mood::answers);
  EXPECT_TRUE(client.waitForReachable(true));
}

// Waits until it is told to wait no longer.
class EndedWait final : public tesk::bus::AnswerWait {
 public:
  void wait() override {}
  void wake() override {}
};

TEST_F(SlowService, aCommandThatNobodyWaitsForAnyMoreIsNotSent) {
  MoodyService service(bus, Mood::saysNothing, Mood::answers);
  std::atomic<bool> reachable = false;
  const auto transport =
      tesk::bus::makeBusConnector(
          {bus.address()}, [&reachable](bool now, const std::string&) { reachable = now; },
          [] { return std::make_shared<EndedWait>(); })
          ->connect("qelwatch", [](std::string_view, const tesk::Message&) {});
  tesk::Message reply;
  EXPECT_EQ(transport->performCommand("kCommandGivenUp", {}, reply).code,
            tesk::kServiceUnreachable);
  ASSERT_TRUE(eventually([&service] { return service.registrations() > 0; }));
  service.setMoods(Mood::answers, Mood::answers);
  ASSERT_TRUE(eventually([&reachable] { return reachable.load(); }));
  Client after(bus, "after");
  ASSERT_TRUE(after.waitForReachable(true));
  EXPECT_EQ(after.clear(2).code, 0);
  EXPECT_EQ(service.commands(),
            std::vector<std::string>{std::string(tesk::kCommandClearConfiguration)});
}

// The connection's end waited for the service.
TEST_F(SlowService, aConnectionEndsThoughTheServiceSaysNothing) {
  MoodyService service(bus, Mood::saysNothing, Mood::saysNothing);
  for (int i = 0; i < 100; ++i) {
    Client client(bus, "qelwatch");
    client.transport().eventsOn();
  }
  SUCCEED();
}

class ViewerOfASlowService : public SlowService {
 protected:
  ViewerOfASlowService() {
    fs::create_directories(home);
    fs::permissions(home, fs::perms::owner_all);
    ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ::setenv("XDG_CONFIG_HOME", home.c_str(), 1);
    ::setenv("XDG_RUNTIME_DIR", home.c_str(), 1);
    ::setenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent", 1);
  }
  ~ViewerOfASlowService() override { fs::remove_all(home); }

  Launch viewer() const {
    return {.words = {QEL_QELWATCH, "--verbose", "--picture", picture, "--bus", bus.address()},
            .out = home + "/out",
            .err = home + "/err"};
  }

  std::string said() const {
    std::ostringstream text;
    text << std::ifstream(home + "/out").rdbuf() << std::ifstream(home + "/err").rdbuf();
    return text.str();
  }

  // Each command of the start once, in order, answered by the service; then SIGTERM ends the
  // viewer.
  void expectOneWholeStart(ChildProcess& process, const MoodyService& service) const {
    EXPECT_TRUE(eventually([this] { return said().find("querySpecific") != std::string::npos; }));
    process.signal(SIGTERM);
    EXPECT_EQ(process.waitForEnd(), 0);
    EXPECT_EQ(service.commands(),
              (std::vector<std::string>{"kCommandClearConfiguration", "kCommandAddConfiguration",
                                        "kCommandQueryMetric"}));
    EXPECT_EQ(said().find("error=-"), std::string::npos) << said();
  }

  const std::string home =
      (fs::temp_directory_path() / ("qelslow" + std::to_string(::getpid()))).string();
  const std::string picture = home + "/picture.png";
};

// The window came when the main thread had waited in vain for every command of the start.
TEST_F(ViewerOfASlowService, showsItsWindowBeforeAnyAnswer) {
  for (const Mood atRegistration : {Mood::saysNothing, Mood::answers}) {
    MoodyService service(bus, atRegistration, Mood::saysNothing);
    ChildProcess process(viewer());
    EXPECT_TRUE(eventually([this] { return fs::exists(picture); }));
    EXPECT_EQ(said().find("error="), std::string::npos) << said();
    process.signal(SIGTERM);
    EXPECT_EQ(process.waitForEnd(), 0) << "the user may leave, too";
    fs::remove(picture);
    fs::remove(home + "/err");
  }
}

TEST_F(ViewerOfASlowService, makesItsStartWithTheServicesOwnAnswers) {
  MoodyService service(bus, Mood::answers, Mood::saysNothing);
  ChildProcess process(viewer());
  ASSERT_TRUE(eventually([this] { return fs::exists(picture); }));
  ASSERT_TRUE(eventually([&service] { return !service.commands().empty(); }));
  service.setMoods(Mood::answers, Mood::answers);
  expectOneWholeStart(process, service);
}

// The start waited for the return of a service that had never gone.
TEST_F(ViewerOfASlowService, makesItsStartOnceTheServiceIsNoLongerTooBusy) {
  MoodyService service(bus, Mood::answers, Mood::isBusy);
  ChildProcess process(viewer());
  ASSERT_TRUE(eventually([&service] { return service.refusals() >= 2; }));
  service.setMoods(Mood::answers, Mood::answers);
  expectOneWholeStart(process, service);
}

// Bytes at random that happened to be a packet, of a metric event without a metric, ended it.
TEST_F(ViewerOfASlowService, passesOverEventsThatNameNoMetric) {
  MoodyService service(bus, Mood::answers, Mood::answers);
  ChildProcess process(viewer());
  ASSERT_TRUE(eventually([&service] { return service.commands().size() == 3; }));
  const auto send = [&service](const Dictionary& entries) {
    service.send(*tesk::bus::encodeEvent(tesk::kEventMetric, tesk::Message(entries)));
  };
  send({});
  send({{"kKeyMetricID", "1"}});
  send({{"kKeyMetricID", 1}});
  EXPECT_TRUE(eventually(
      [this] { return said().find("I dont care for this Metric") != std::string::npos; }));
  process.signal(SIGTERM);
  EXPECT_EQ(process.waitForEnd(), 0) << said();
}

}  // namespace
}  // namespace qel::testing
