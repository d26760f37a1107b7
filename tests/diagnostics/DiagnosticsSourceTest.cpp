#include "sources/diagnostics/DiagnosticsSource.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>

#include "base/Clock.h"
#include "sources/Metrics.h"
#include "support/RecordingSink.h"
#include "support/diagnostics/FakeRouter.h"
#include "support/diagnostics/Packets.h"
#include "support/diagnostics/PlayedSearch.h"
#include "support/diagnostics/PseudoModem.h"
#include "support/diagnostics/ServingCell.h"
#include "support/diagnostics/SourceLog.h"

namespace qel::diagnostics {
namespace {

using namespace std::chrono_literals;
using test::comesTrue;
using test::FakeRouter;
using test::kServingCell;
using test::ModemBrain;
using test::PseudoModem;
using test::servingCell;
using ::testing::Contains;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

constexpr const char* kUsb = "/sys/devices/usb1/1-2";

class DiagnosticsSourceTest : public ::testing::Test {
 protected:
  DiagnosticsSourceTest() {
    timing.firstPause = 10ms;
    timing.longestPause = 50ms;
    timing.session.answer = 200ms;
    timing.session.drain = 5ms;
  }
  ~DiagnosticsSourceTest() override { source.reset(); }

  DiagnosticsSource& begin(const std::string& wish = "", bool isMissed = true) {
    DiagnosticsWorld world;
    world.search = [ports = ports] { return std::make_unique<test::PlayedSearch>(ports); };
    world.asleep = [asleepMs = asleepMs] { return std::chrono::milliseconds{*asleepMs}; };
    source =
        std::make_unique<DiagnosticsSource>(DiagnosticsChoice{wish, 1, isMissed}, world, timing);
    source->start(log, listeners);
    return *source;
  }
  void beginWith(const PseudoModem& modem) {
    ports->set({{modem.path(), kUsb}});
    begin();
    ASSERT_TRUE(log->waitForState("searching"));
  }
  // Sent until it is taken: the modem may still be being told what to send.
  bool tell(PseudoModem& modem, unsigned pci) {
    return comesTrue(
        [&] { return modem.sendLog(kServingCell, servingCell(pci), systemClock().nowMs()); });
  }
  std::string fact(const std::string& name) const {
    for (const auto& [key, value] : source->facts().rows) {
      if (key == name) return value;
    }
    return "";
  }

  std::shared_ptr<test::PlayedPorts> ports = std::make_shared<test::PlayedPorts>();
  std::shared_ptr<test::SourceLog> log = std::make_shared<test::SourceLog>();
  std::shared_ptr<sources::ListenerSignal> listeners = std::make_shared<sources::ListenerSignal>();
  // The thread of a source that ended within its own event outlives the test: it shares this.
  std::shared_ptr<std::atomic<std::int64_t>> asleepMs =
      std::make_shared<std::atomic<std::int64_t>>(0);
  DiagnosticsTiming timing;
  qel::testing::CapturedSystemLog system;
  std::unique_ptr<DiagnosticsSource> source;
};

TEST_F(DiagnosticsSourceTest, TellsWhatTheModemTells) {
  PseudoModem modem;
  beginWith(modem);
  ASSERT_TRUE(tell(modem, 301));
  ASSERT_TRUE(log->waitForMetric(metric::kLteScellInfo));
  EXPECT_TRUE(log->waitForState("running"));
  EXPECT_TRUE(source->query(metric::kLteScellInfo).known);
  EXPECT_FALSE(source->query(metric::kGsmScellInfo).known);
  EXPECT_EQ(source->modem(), kUsb);
  EXPECT_THAT(modem.with([](ModemBrain& brain) { return brain.forbidden(); }), IsEmpty());
}

TEST_F(DiagnosticsSourceTest, SaysWhatItKnowsOfPortAndModem) {
  PseudoModem modem;
  beginWith(modem);
  ASSERT_TRUE(tell(modem, 301));
  ASSERT_TRUE(log->waitForState("running"));
  EXPECT_EQ(fact("port"), modem.path());
  EXPECT_EQ(fact("model"), "Pseudo modem");
  EXPECT_EQ(fact("build"), "MPSS.PSEUDO.1.0-00042");
  EXPECT_EQ(fact("bad frames"), "0");
  EXPECT_EQ(fact("log B0C2 version 3"), "1 understood");
  modem.sendLog(kServingCell, Bytes{9, 9}, systemClock().nowMs());
  EXPECT_TRUE(comesTrue([&] { return !fact("log B0C2 version 9").empty(); }));
}

TEST_F(DiagnosticsSourceTest, GivesLogsTheTimeOfTheHost) {
  PseudoModem modem;
  beginWith(modem);
  const std::uint64_t before = systemClock().nowMs();
  modem.sendLog(kServingCell, servingCell(5), 315'964'807'000);  // in 1980
  ASSERT_TRUE(log->waitForMetric(metric::kLteScellInfo));
  EXPECT_GE(log->events().at(0).timeMs, before);
  EXPECT_LE(log->events().at(0).timeMs, systemClock().nowMs());
}

TEST_F(DiagnosticsSourceTest, FollowsAModemThatComesBackUnderAnotherName) {
  auto modem = std::make_unique<PseudoModem>();
  ports->set({{modem->path(), kUsb}});
  begin(modem->path());  // named by the user
  ASSERT_TRUE(log->waitForState("searching"));
  ASSERT_TRUE(tell(*modem, 1));
  ASSERT_TRUE(log->waitForState("running"));

  PseudoModem back;  // while the old one is there: so it has another name
  ports->set({});
  modem->unplug();
  ASSERT_TRUE(log->waitForState("no-port"));
  EXPECT_FALSE(source->query(metric::kLteScellInfo).known);
  EXPECT_EQ(source->modem(), "");
  ports->set({{back.path(), kUsb}});
  ASSERT_TRUE(log->waitForState("searching"));
  ASSERT_TRUE(tell(back, 2));
  EXPECT_TRUE(log->waitForMetric(metric::kLteScellInfo, 2));
  EXPECT_THAT(system.lines(), Contains(HasSubstr("has gone")));
}

TEST_F(DiagnosticsSourceTest, WaitsForAPort) {
  begin();
  ASSERT_TRUE(log->waitForState("no-port"));
  PseudoModem modem;
  ports->set({{modem.path(), kUsb}});
  EXPECT_TRUE(log->waitForState("searching"));
}

TEST_F(DiagnosticsSourceTest, SaysInTheLogThatThereIsNoPortWhenOneIsMissed) {
  begin();
  EXPECT_TRUE(comesTrue([&] { return !system.lines().empty(); }));
  EXPECT_THAT(system.lines().at(0), HasSubstr("no diagnostics port found"));
}

TEST_F(DiagnosticsSourceTest, SaysNoWordOfAPortThatIsOnlyWelcome) {
  begin("", false);
  ASSERT_TRUE(log->waitForState("no-port"));
  ports->set({{"/dev/a-port-that-only-udev-sees", kUsb}});  // what is wrong with one is said
  ASSERT_TRUE(comesTrue([&] { return !system.lines().empty(); }));
  EXPECT_THAT(system.lines().at(0), HasSubstr("a-port-that-only-udev-sees"));
}

TEST_F(DiagnosticsSourceTest, SaysThatADeviceIsHiddenFromTheService) {
  ports->set({{"/dev/a-port-that-only-udev-sees", kUsb}});
  begin();
  EXPECT_TRUE(log->waitForState("no-rights"));
  EXPECT_TRUE(comesTrue([&] { return !system.lines().empty(); }));
  EXPECT_THAT(system.lines().at(0), HasSubstr("DIAGNOSTICS PORT in basebandd(8)"));
}

TEST_F(DiagnosticsSourceTest, SaysThatAModemIsSilentAndGoesOnTrying) {
  ModemBrain brain;
  brain.manner = ModemBrain::Manner::silent;
  PseudoModem modem(brain);
  ports->set({{modem.path(), kUsb}});
  begin();
  ASSERT_TRUE(log->waitForState("silent"));
  modem.with([](ModemBrain& memory) {
    memory.manner = ModemBrain::Manner::honest;
    return 0;
  });
  EXPECT_TRUE(log->waitForState("searching"));
}

TEST_F(DiagnosticsSourceTest, SaysThatAModemRefuses) {
  ModemBrain brain;
  brain.manner = ModemBrain::Manner::refusing;
  PseudoModem modem(brain);
  ports->set({{modem.path(), kUsb}});
  begin();
  EXPECT_TRUE(log->waitForState("refused"));
}

TEST_F(DiagnosticsSourceTest, BelievesALiarNothing) {
  ModemBrain brain;
  brain.manner = ModemBrain::Manner::lying;
  PseudoModem modem(brain);
  ports->set({{modem.path(), kUsb}});
  begin();
  EXPECT_TRUE(log->waitForState("silent"));
  EXPECT_THAT(log->events(), IsEmpty());
}

TEST_F(DiagnosticsSourceTest, TellsTheModemAgainAfterAReset) {
  timing.session.quietCheck = 50ms;
  PseudoModem modem;
  beginWith(modem);
  modem.with([](ModemBrain& brain) {
    brain.forget();
    return 0;
  });
  EXPECT_TRUE(tell(modem, 3));
  EXPECT_TRUE(log->waitForMetric(metric::kLteScellInfo));
}

TEST_F(DiagnosticsSourceTest, LooksAtTheMasksAfterTheMachineSlept) {
  PseudoModem modem;
  beginWith(modem);
  modem.with([](ModemBrain& brain) {
    brain.forget();
    return 0;
  });
  *asleepMs = 60'000;
  modem.send(Bytes{0x79, 0, 0});  // anything
  EXPECT_TRUE(tell(modem, 3));
}

TEST_F(DiagnosticsSourceTest, SwitchesLogsOffWhileNobodyListens) {
  PseudoModem modem;
  beginWith(modem);
  const auto sends = [&] {
    return modem.with([](ModemBrain& brain) { return brain.sends(kServingCell); });
  };
  log->listen(false);
  ASSERT_TRUE(tell(modem, 3));
  ASSERT_TRUE(log->waitForState("resting"));
  EXPECT_TRUE(comesTrue([&] { return !sends(); }));
  EXPECT_FALSE(source->query(metric::kLteScellInfo).known);
  log->listen(true);
  listeners->changed();
  ASSERT_TRUE(log->waitForState("searching"));
  EXPECT_TRUE(comesTrue(sends));
}

TEST_F(DiagnosticsSourceTest, TellsANewListenerEverything) {
  timing.period = 1h;
  PseudoModem modem;
  beginWith(modem);
  ASSERT_TRUE(tell(modem, 3));
  ASSERT_TRUE(log->waitForMetric(metric::kLteScellInfo));
  listeners->changed();
  EXPECT_TRUE(log->waitForMetric(metric::kLteScellInfo, 2));
}

TEST_F(DiagnosticsSourceTest, LeavesTheModemWithAllOff) {
  PseudoModem modem;
  beginWith(modem);
  ASSERT_TRUE(modem.with([](ModemBrain& brain) { return brain.sendsAnyLog(); }));
  source.reset();
  EXPECT_TRUE(comesTrue([&] {
    return modem.with(
        [](ModemBrain& brain) { return !brain.sendsAnyLog() && !brain.sendsEvents(); });
  }));
}

TEST_F(DiagnosticsSourceTest, StopsInTheMiddleOfAFlood) {
  PseudoModem modem;
  beginWith(modem);
  const Bytes noise(4096, 0x55);
  modem.stream(100'000, [noise] { return noise; });
  ASSERT_TRUE(comesTrue([&] { return fact("bytes a second").size() >= 5; }));
  source.reset();  // returns
  SUCCEED();
}

TEST_F(DiagnosticsSourceTest, MayBeDestroyedWithinAnEvent) {
  struct Destroyer final : sources::EventReceiver {
    Taken take(const sources::SourceEvent&) override {
      mine->reset();
      done = true;
      return Taken::yes;
    }
    std::unique_ptr<DiagnosticsSource>* mine = nullptr;
    std::atomic<bool> done = false;
  };
  PseudoModem modem;
  ports->set({{modem.path(), kUsb}});
  begin();
  const auto destroyer = std::make_shared<Destroyer>();
  destroyer->mine = &source;
  source->start(destroyer, listeners);
  ASSERT_TRUE(tell(modem, 3));
  EXPECT_TRUE(comesTrue([&] { return destroyer->done.load(); }));
  EXPECT_TRUE(comesTrue([&] {  // its thread goes on until the modem is left
    return modem.with([](ModemBrain& brain) { return !brain.sendsAnyLog(); });
  }));
}

TEST_F(DiagnosticsSourceTest, ListensToARouter) {
  FakeRouter router;
  ports->set({{router.address(), ""}});
  begin();
  ASSERT_TRUE(log->waitForState("searching"));
  router.send(test::logPacket(kServingCell, servingCell(301), systemClock().nowMs()));
  EXPECT_TRUE(log->waitForMetric(metric::kLteScellInfo));
}

TEST_F(DiagnosticsSourceTest, TakesTheMasksBackFromAnotherClientOfTheRouter) {
  timing.session.sharedCheck = 50ms;
  FakeRouter router;
  ports->set({{router.address(), ""}});
  begin();
  ASSERT_TRUE(log->waitForState("searching"));
  router.with([](ModemBrain& brain) {
    brain.setMask(11, Bytes(65));
    return 0;
  });
  EXPECT_TRUE(comesTrue(
      [&] { return router.with([](ModemBrain& brain) { return brain.sends(kServingCell); }); }));
  EXPECT_TRUE(comesTrue([&] { return fact("masks of others") == "1"; }));
}

}  // namespace
}  // namespace qel::diagnostics
