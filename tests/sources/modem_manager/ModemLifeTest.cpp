// Modems, ModemManager and buses come and go, and calls fail in all the ways they can.
#include <gmock/gmock.h>

#include <algorithm>
#include <cmath>
#include <limits>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "sources/Metrics.h"
#include "sources/modem_manager/ModemWorld.h"
#include "support/RecordingSink.h"

namespace qel::testing {
namespace {

using namespace sources;
using ::testing::HasSubstr;

TEST(ModemManagerSource, FollowsAModemThatIsUnpluggedAndComesBackFiftyTimes) {
  ModemWorld world;
  world.start();
  for (int i = 0; i < 50; ++i) {
    const std::int32_t dbm = -60 - i;
    world.manager->add(pathOf(i), modemWithRsrp(dbm));
    ASSERT_TRUE(world.waitForRsrp(dbm)) << i;
    world.manager->remove(pathOf(i));
    ASSERT_TRUE(becomesTrue([&] { return !world.has(metric::kLteRsrpRsrqSinr); })) << i;
  }
}

TEST(ModemManagerSource, GoesOnAfterAnotherStartOfModemManager) {
  ModemWorld world;
  world.manager->add(kModemPath, modemWithRsrp(-80));
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-80));
  world.manager.reset();
  ASSERT_TRUE(becomesTrue([&] { return !world.has(metric::kLteRsrpRsrqSinr); }));
  world.manager = std::make_unique<FakeModemManager>(world.bus.address());
  world.manager->add(pathOf(7), modemWithRsrp(-70));
  EXPECT_TRUE(world.waitForRsrp(-70));
}

TEST(ModemManagerSource, GoesOnAfterTheLossOfTheBus) {
  CapturedSystemLog log;
  ModemWorld world;
  world.manager->add(kModemPath, modemWithRsrp(-80));
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-80));
  world.bus.stop();
  ASSERT_TRUE(becomesTrue([&] { return !world.has(metric::kLteRsrpRsrqSinr); }));
  world.manager.reset();
  world.bus.start();
  world.manager = std::make_unique<FakeModemManager>(world.bus.address());
  world.manager->add(kModemPath, modemWithRsrp(-71));
  EXPECT_TRUE(world.waitForRsrp(-71));
  world.source.reset();
  // One line a reason: on a busy machine it finds the bus in other states on its way down and up.
  const auto said = log.lines();
  EXPECT_THAT(said, ::testing::SizeIs(::testing::AllOf(::testing::Ge(1U), ::testing::Le(3U))));
  EXPECT_THAT(said, ::testing::Each(HasSubstr("no message bus")));
  EXPECT_EQ(std::ranges::adjacent_find(said), said.end());
}

TEST(ModemManagerSource, TakesTheFirstModemAndStaysWithIt) {
  ModemWorld world;
  world.manager->add(pathOf(10), modemWithRsrp(-90));
  world.manager->add(pathOf(9), modemWithRsrp(-80, "350000000000029"));
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-80));
  world.manager->add(pathOf(2), modemWithRsrp(-60, "350000000000037"));
  const int before = world.log->count(metric::kLteRsrpRsrqSinr);
  ASSERT_TRUE(world.log->waitForCount(metric::kLteRsrpRsrqSinr, before + 3));
  EXPECT_TRUE(world.waitForRsrp(-80));
  world.manager->remove(pathOf(9));
  EXPECT_TRUE(world.waitForRsrp(-60));
}

TEST(ModemManagerSource, FindsTheWantedModemByItsImeiWhereverItIs) {
  ModemWorld world({"350000000000029", ""});
  world.manager->add(pathOf(0), modemWithRsrp(-90));
  world.manager->add(pathOf(1), modemWithRsrp(-80, "350000000000029"));
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-80));
  world.manager->remove(pathOf(1));
  ASSERT_TRUE(becomesTrue([&] { return !world.has(metric::kLteRsrpRsrqSinr); }));
  world.manager->add(pathOf(5), modemWithRsrp(-75, "350000000000029"));
  EXPECT_TRUE(world.waitForRsrp(-75));
}

TEST(ModemManagerSource, FindsTheWantedModemByItsPath) {
  ModemWorld world({"", pathOf(1)});
  world.manager->add(pathOf(0), modemWithRsrp(-90));
  world.manager->add(pathOf(1), modemWithRsrp(-80));
  world.start();
  EXPECT_TRUE(world.waitForRsrp(-80));
}

TEST(ModemManagerSource, RepeatsWhatHoldsAndAnswersQueriesWithIt) {
  ModemWorld world;
  world.manager->add(kModemPath, modemWithRsrp(-80));
  EXPECT_EQ(world.source->query(metric::kLteRsrpRsrqSinr).message, "the source is not running");
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kLteRsrpRsrqSinr, 4));
  const SourceAnswer answer = world.source->query(metric::kLteRsrpRsrqSinr);
  EXPECT_TRUE(answer.known);
  EXPECT_GT(answer.timeMs, 0U);
  const SourceAnswer none = world.source->query(metric::kLteCdrxConfig);
  EXPECT_FALSE(none.known);
  EXPECT_EQ(none.message, "metric 19992 has no value that the modem gives");
}

// A listener that came while the modem had nothing new to say waited for the next report.
TEST(ModemManagerSource, TellsANewListenerEverythingAtOnce) {
  ModemWorld world({}, {std::chrono::hours(1), std::chrono::milliseconds(500)});
  world.manager->add(kModemPath, modemWithRsrp(-80));
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-80));
  for (int i = 0; i < 3; ++i) {
    const int before = world.log->count(metric::kLteRsrpRsrqSinr);
    world.listeners->changed();
    EXPECT_TRUE(world.log->waitForCount(metric::kLteRsrpRsrqSinr, before + 1));
  }
}

TEST(CellInformation, ThatIsNotAllowedIsNamedInOneLineAndNotAskedForAgain) {
  for (const char* error : {"org.freedesktop.DBus.Error.AccessDenied",
                            "org.freedesktop.ModemManager1.Error.Core.Unauthorized"}) {
    CapturedSystemLog log;
    ModemWorld world;
    world.manager->answer("GetCellInfo", {FakeAnswer::Kind::error, error});
    world.manager->add(kModemPath, modemWithRsrp(-80));
    world.start();
    ASSERT_TRUE(world.log->waitForCount(metric::kLteRsrpRsrqSinr, 5));
    EXPECT_EQ(world.manager->calls("GetCellInfo"), 1);
    // The same modem under another path has nothing new to say.
    world.manager->remove(kModemPath);
    world.manager->add(pathOf(1), modemWithRsrp(-81));
    ASSERT_TRUE(world.waitForRsrp(-81));
    ASSERT_TRUE(becomesTrue([&] { return world.manager->calls("GetCellInfo") == 2; }));
    world.source.reset();
    ASSERT_THAT(log.lines(), ::testing::SizeIs(1)) << error;
    EXPECT_THAT(log.lines()[0], HasSubstr("not allowed to call GetCellInfo"));
    EXPECT_THAT(log.lines()[0], HasSubstr("org.freedesktop.ModemManager1.Device.Control"));
  }
}

TEST(CellInformation, ThatNeverComesHoldsNothingUp) {
  ModemWorld world;
  world.manager->answer("GetCellInfo", {FakeAnswer::Kind::never, ""});
  world.manager->answer("Setup", {FakeAnswer::Kind::never, ""});
  world.manager->add(kModemPath, modemWithRsrp(-80));
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-80));
  world.manager->set(kModemPath, kSignal, "Lte", FakeDictionary{{"rsrp", level(-83)}});
  EXPECT_TRUE(world.waitForRsrp(-83));
  // After the call's time is over it is tried again, and then there is an answer.
  world.manager->setCells({{{"cell-type", number(5)},
                            {"serving", flag(true)},
                            {"physical-ci", text("7")},
                            {"earfcn", number(100)}}});
  world.manager->answer("GetCellInfo", {});
  EXPECT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return cell.phyCellId() == 7; }));
}

TEST(Nonsense, OfEveryTypeIsNoValue) {
  ModemWorld world;
  world.manager->answer("GetCellInfo", {FakeAnswer::Kind::nonsense, ""});
  auto modem = modemWithRsrp(-80);
  modem.at(kModem).at("Sim") = std::string("no path");
  modem.at(kModem).at("Bearers") = std::uint32_t{17};
  modem.at(kModem).at("EquipmentIdentifier") = false;
  modem.at(kModem3gpp).at("RegistrationState") = std::string("home");
  modem.at(kModem3gpp).at("OperatorCode") = 26201.0;
  modem.at(kSignal).at("Rate") = std::string("often");
  modem.at(kLocation).at("Enabled") = true;
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-80));
  ASSERT_TRUE(becomesTrue([&] { return world.manager->calls("GetCellInfo") > 3; }));
  for (const std::uint32_t metric :
       {metric::kLteScellInfo, metric::kLteNeighbours, metric::kEmmContext, metric::kBearers,
        metric::kSimFiles, metric::kMmCommonInfo}) {
    EXPECT_FALSE(world.has(metric)) << metric;
  }
}

TEST(Nonsense, InSignalsChangesNothing) {
  ModemWorld world;
  world.manager->add(kModemPath, modemWithRsrp(-80));
  world.start();
  const double nan = std::nan("");
  const double most = std::numeric_limits<double>::max();
  for (const double nonsense : {-most, most, nan, 0.0, -157.0, -30.0}) {
    world.manager->set(kModemPath, kSignal, "Lte", FakeDictionary{{"rsrp", level(-80)}});
    ASSERT_TRUE(becomesTrue([&] { return world.has(metric::kLteRsrpRsrqSinr); }));
    world.manager->set(kModemPath, kSignal, "Lte", FakeDictionary{{"rsrp", level(nonsense)}});
    EXPECT_TRUE(becomesTrue([&] { return !world.has(metric::kLteRsrpRsrqSinr); })) << nonsense;
  }
}

TEST(Nonsense, InCellsIsLeftOut) {
  ModemWorld world;
  world.manager->setCells({
      {{"cell-type", number(5)},
       {"serving", flag(true)},
       {"operator-id", text("2620")},
       {"tac", text("FFFE")},
       {"ci", text("FFFFFFFF")},
       {"physical-ci", text("1F8")},
       {"earfcn", number(100)},
       {"rsrp", text("strong")}},
      {{"cell-type", number(5)}, {"physical-ci", text("12G")}, {"earfcn", number(0xFFFFFFFF)}},
      {{"cell-type", number(5)}, {"physical-ci", text("")}, {"rsrp", level(-90)}},
      {{"cell-type", text("lte")}, {"earfcn", number(100)}},
      {{"cell-type", number(6)}, {"nrarfcn", number(627264)}},
      {{"cell-type", number(99)}},
      {{"cell-type", number(2)}, {"arfcn", number(1024)}, {"rx-level", number(99)}},
      {{"cell-type", number(2)}, {"arfcn", number(1023)}, {"rx-level", number(64)}},
      {},
  });
  auto modem = modemOn(kOnLte);
  modem.at(kModem3gpp).at("OperatorCode") = std::string("");
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return cell.hasDlFreq(); }));
  const auto cell = world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo);
  EXPECT_EQ(cell->dlFreq(), 100U);
  EXPECT_FALSE(cell->hasPhyCellId());
  EXPECT_FALSE(cell->hasCellId());
  EXPECT_FALSE(cell->hasTrackingAreaCode());
  EXPECT_FALSE(cell->hasSelPlmnMcc());
  const auto own = world.log->newest<KCellularLteNbrEutraCellMeas>(metric::kLteNeighbours);
  EXPECT_TRUE(own->measNbrEutras().empty());
  ASSERT_TRUE(world.log->waitForCount(metric::kLteInterRat, 1));
  const auto others = world.log->newest<KCellularLteNbrInterRatCellMeas>(metric::kLteInterRat);
  ASSERT_EQ(others->measNbrGerans().size(), 1U);
  EXPECT_EQ(others->measNbrGerans()[0]->arfcn(), 1023U);
  EXPECT_FALSE(others->measNbrGerans()[0]->hasRxlev());
}

TEST(ModemManagerSource, MayBeStoppedAndStartedAgain) {
  ModemWorld world;
  world.manager->add(kModemPath, modemWithRsrp(-80));
  for (int i = 0; i < 5; ++i) {
    world.start();
    const int before = world.log->count(metric::kLteRsrpRsrqSinr);
    ASSERT_TRUE(world.log->waitForCount(metric::kLteRsrpRsrqSinr, before + 1));
    world.source->stop();
    EXPECT_FALSE(world.has(metric::kLteRsrpRsrqSinr));
  }
}

}  // namespace
}  // namespace qel::testing
