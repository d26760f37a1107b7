// What the source says of a modem that cannot give any values. It once said nothing: a modem that
// was locked, failed or not there looked like one with nothing to report.
#include <gmock/gmock.h>

#include <atomic>
#include <condition_variable>
#include <mutex>

#include "sources/modem_manager/ModemCondition.h"
#include "sources/modem_manager/ModemWorld.h"

namespace qel::testing {
namespace {

using namespace sources;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

// Keeps what a source says of its condition.
class ConditionLog final : public EventReceiver {
 public:
  Taken take(const SourceEvent&) override { return Taken::yes; }
  void conditionChanged(const SourceCondition& condition) override {
    const std::lock_guard lock(_mutex);
    _told.push_back(condition);
    _changed.notify_all();
  }

  // Until the newest is in these words, for half a minute at most.
  bool waitFor(const std::string& words) {
    std::unique_lock lock(_mutex);
    return _changed.wait_for(lock, std::chrono::seconds(30),
                             [&] { return !_told.empty() && inWords(_told.back()) == words; });
  }
  std::vector<std::string> words() {
    const std::lock_guard lock(_mutex);
    std::vector<std::string> words;
    for (const auto& condition : _told) words.push_back(inWords(condition));
    return words;
  }
  SourceCondition newest() {
    const std::lock_guard lock(_mutex);
    return _told.back();
  }

 private:
  std::mutex _mutex;
  std::condition_variable _changed;
  std::vector<SourceCondition> _told;
};

FakeInterfaces modemInState(std::int32_t state) {
  auto modem = modemOn(kOnLte);
  auto& own = modem.at(kModem);
  own.at("State") = state;
  own.emplace("StateFailedReason", std::uint32_t{0});
  own.emplace("UnlockRequired", std::uint32_t{1});
  own.emplace("Model", std::string("X 100"));
  own.emplace("Drivers", std::vector<std::string>{"qmi_wwan", "option1"});
  return modem;
}

class ModemCondition : public ::testing::Test {
 protected:
  void start() { world.source->start(log, std::make_shared<ListenerSignal>()); }
  void setState(std::int32_t state) { world.manager->set(kModemPath, kModem, "State", state); }

  std::shared_ptr<ConditionLog> log = std::make_shared<ConditionLog>();
  ModemWorld world;
};

TEST_F(ModemCondition, IsToldFromNoModemToTheEndOfModemManager) {
  start();
  ASSERT_TRUE(log->waitFor("No modem"));
  world.manager->add(kModemPath, modemInState(3));
  ASSERT_TRUE(log->waitFor("Modem switched off"));
  EXPECT_EQ(log->newest().state, "disabled");
  EXPECT_EQ(log->newest().model, "X 100");
  EXPECT_EQ(log->newest().driver, "qmi_wwan, option1");
  world.manager->set(kModemPath, kModem, "UnlockRequired", std::uint32_t{2});
  setState(2);
  ASSERT_TRUE(log->waitFor("Modem locked: SIM PIN needed"));
  setState(7);
  ASSERT_TRUE(log->waitFor("Searching for a network"));
  setState(8);
  ASSERT_TRUE(log->waitFor("Registered with a network"));
  setState(11);
  ASSERT_TRUE(log->waitFor("Connected"));
  world.manager->set(kModemPath, kModem, "StateFailedReason", std::uint32_t{2});
  setState(-1);
  ASSERT_TRUE(log->waitFor("Modem failed: SIM missing"));
  world.manager->remove(kModemPath);
  ASSERT_TRUE(log->waitFor("No modem"));
  world.manager.reset();
  ASSERT_TRUE(log->waitFor("ModemManager not running"));
  EXPECT_EQ(log->newest().state, "no-modem-manager");
  world.manager = std::make_unique<FakeModemManager>(world.bus.address());
  ASSERT_TRUE(log->waitFor("No modem"));
}

TEST_F(ModemCondition, SaysAtFirstThatModemManagerDoesNotRun) {
  world.manager.reset();
  start();
  EXPECT_TRUE(log->waitFor("ModemManager not running"));
}

TEST_F(ModemCondition, IsToldAgainAfterAStart) {
  world.manager->add(kModemPath, modemInState(8));
  start();
  ASSERT_TRUE(log->waitFor("Registered with a network"));
  const auto second = std::make_shared<ConditionLog>();
  world.source->start(second, std::make_shared<ListenerSignal>());
  EXPECT_TRUE(second->waitFor("Registered with a network"));
}

TEST_F(ModemCondition, IsToldOnceForEachChange) {
  world.manager->add(kModemPath, modemInState(8));
  start();
  ASSERT_TRUE(log->waitFor("Registered with a network"));
  for (int i = 0; i < 5; ++i) {
    world.manager->set(kModemPath, kSignal, "Lte", FakeDictionary{{"rsrp", level(-80 - i)}});
  }
  setState(11);
  ASSERT_TRUE(log->waitFor("Connected"));
  EXPECT_THAT(log->words(), ElementsAre("Registered with a network", "Connected"));
}

TEST_F(ModemCondition, NamesTheLossOfTheBus) {
  start();
  ASSERT_TRUE(log->waitFor("No modem"));
  world.manager.reset();
  world.bus.stop();
  EXPECT_TRUE(log->waitFor("No message bus"));
}

TEST(ModemConditionOfACertainModem, SaysThatItIsNotThere) {
  ModemWorld world({"350000000000029", ""});
  world.manager->add(kModemPath, modemInState(8));
  const auto log = std::make_shared<ConditionLog>();
  world.source->start(log, std::make_shared<ListenerSignal>());
  EXPECT_TRUE(log->waitFor("No modem: the chosen one is not there"));
}

std::string wordsOf(std::int32_t state, const char* key, std::uint32_t value) {
  return inWords(conditionOf({{kModem, {{"State", sdbus::Variant(state)}, {key, number(value)}}}}));
}

TEST(ModemConditionInWords, NamesEveryLockAndFailure) {
  EXPECT_EQ(wordsOf(2, "UnlockRequired", 2), "Modem locked: SIM PIN needed");
  EXPECT_EQ(wordsOf(2, "UnlockRequired", 4), "Modem locked: SIM PUK needed");
  EXPECT_EQ(wordsOf(2, "UnlockRequired", 8), "Modem locked: network PIN needed");
  EXPECT_EQ(wordsOf(2, "UnlockRequired", 99), "Modem locked");
  EXPECT_EQ(wordsOf(-1, "StateFailedReason", 3), "Modem failed: SIM faulty");
  EXPECT_EQ(wordsOf(-1, "StateFailedReason", 0), "Modem failed");
  // A reason of another state is no reason.
  EXPECT_EQ(wordsOf(8, "StateFailedReason", 2), "Registered with a network");
  EXPECT_EQ(wordsOf(8, "UnlockRequired", 2), "Registered with a network");
  EXPECT_EQ(wordsOf(0, "UnlockRequired", 2), "Modem starting");
  EXPECT_EQ(wordsOf(77, "UnlockRequired", 2), "Modem starting");
}

TEST(ModemConditionInWords, NamesARegistrationThatWasDenied) {
  const auto words = [](std::int32_t state, std::uint32_t registration) {
    return inWords(conditionOf({{kModem, {{"State", sdbus::Variant(state)}}},
                                {kModem3gpp, {{"RegistrationState", number(registration)}}}}));
  };
  EXPECT_EQ(words(6, 3), "No network: registration denied");
  EXPECT_EQ(words(7, 8), "Searching for a network: emergency calls only");
  EXPECT_EQ(words(6, 0), "No network");
}

TEST(ModemConditionInWords, TakesNoNonsenseFromTheModem) {
  const auto condition = conditionOf(
      {{kModem,
        {{"State", text("fine")},
         {"Model", text("a\x1B[31m\n\xC2\x9B\xE2\x80\xAE model")},
         {"Drivers", sdbus::Variant(std::vector<std::string>(1000, std::string(1000, 'd')))},
         {"EquipmentIdentifier", text("350000000000011")}}}});
  EXPECT_EQ(condition.state, "starting");
  EXPECT_EQ(condition.model, "a[31m model");
  EXPECT_EQ(condition.driver, std::string(64, 'd'));
}

FakeInterfaces modemOnDevice(const char* device, double dbm, const std::string& imei) {
  FakeInterfaces modem = modemWithRsrp(dbm, imei);
  modem.at(kModem).insert_or_assign("Device", FakeProperty(std::string(device)));
  return modem;
}

constexpr const char* kFirstDevice = "/sys/devices/usb1/1-2";
constexpr const char* kSecondDevice = "/sys/devices/usb1/1-3";
constexpr const char* kFirstImei = "350000000000011";

struct TwoModems : ModemWorld {
  explicit TwoModems(const ModemWish& wish) : ModemWorld(wish) {
    manager->add(pathOf(0), modemOnDevice(kFirstDevice, -80, kFirstImei));
    manager->add(pathOf(1), modemOnDevice(kSecondDevice, -70, "350000000000029"));
  }
};

TEST(ModemOfAPort, IsTheOneOnThePortsDevice) {
  TwoModems world({"", "", [] { return std::string(kSecondDevice); }});
  world.start();
  EXPECT_TRUE(world.waitForRsrp(-70));
}

TEST(ModemOfAPort, IsANamedOneOnThePortsDeviceAlone) {
  for (ModemWish wish : {ModemWish{kFirstImei, "", {}}, ModemWish{"", pathOf(0), {}}}) {
    std::atomic<bool> isOther = true;
    wish.device = [&] { return std::string(isOther ? kSecondDevice : kFirstDevice); };
    TwoModems world(wish);
    const auto log = std::make_shared<ConditionLog>();
    world.source->start(log, world.listeners);
    ASSERT_TRUE(log->waitFor("No modem: the chosen one is not there"));
    isOther = false;
    world.start();
    EXPECT_TRUE(world.waitForRsrp(-80));
  }
}

}  // namespace
}  // namespace qel::testing
