// Settings of the modem that other programs share are changed with care and put back.
#include <gmock/gmock.h>

#include "messages/nas.h"
#include "sources/modem_manager/ModemWorld.h"
#include "support/RecordingSink.h"

namespace qel::testing {
namespace {

using namespace sources;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Pair;

TEST(SignalRate, IsSetAndPutBackToWhatItWas) {
  for (const std::uint32_t found : {0U, 30U}) {
    ModemWorld world;
    world.manager->add(kModemPath, modemOn(kOnLte, "350000000000011", found));
    world.start();
    ASSERT_TRUE(becomesTrue([&] { return world.manager->ratesAskedFor().size() == 1; }));
    world.source.reset();
    EXPECT_THAT(world.manager->ratesAskedFor(), ElementsAre(1U, found));
  }
}

TEST(SignalRate, OfAnotherClientIsNeverLowered) {
  ModemWorld world;
  world.manager->add(kModemPath, modemOn(kOnLte, "350000000000011", 1));
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kEmmContext, 4));
  world.source.reset();
  EXPECT_THAT(world.manager->ratesAskedFor(), IsEmpty());
}

TEST(SignalRate, ThatAnotherClientHasSetSinceIsLeftAlone) {
  ModemWorld world;
  world.manager->add(kModemPath, modemOn(kOnLte, "350000000000011", 30));
  world.start();
  ASSERT_TRUE(becomesTrue([&] { return world.manager->ratesAskedFor().size() == 1; }));
  ASSERT_TRUE(world.log->waitForCount(metric::kEmmContext, 3));
  world.manager->set(kModemPath, kSignal, "Rate", std::uint32_t{2});
  const int before = world.log->count(metric::kEmmContext);
  ASSERT_TRUE(world.log->waitForCount(metric::kEmmContext, before + 3));
  world.source.reset();
  EXPECT_THAT(world.manager->ratesAskedFor(), ElementsAre(1U));
}

TEST(SignalRate, ThatMayNotBeSetIsNamedInOneLine) {
  CapturedSystemLog log;
  ModemWorld world;
  world.manager->answer(
      "Setup", {FakeAnswer::Kind::error, "org.freedesktop.ModemManager1.Error.Core.Unauthorized"});
  world.manager->add(kModemPath, modemOn(kOnLte));
  world.start();
  ASSERT_TRUE(becomesTrue([&] { return log.lines().size() == 1; }));
  EXPECT_THAT(log.lines()[0], HasSubstr("Device.Control"));
}

constexpr std::uint32_t kPlaceOfCell = 1;
constexpr std::uint32_t kGps = 4;

// A modem that can tell where its cell is, with those sources switched on.
FakeInterfaces modemWithPlaces(std::uint32_t sources, bool signals = false) {
  auto modem = modemOn(kOnLte);
  modem.at(kLocation).at("Capabilities") = kPlaceOfCell | kGps;
  modem.at(kLocation).at("Enabled") = sources;
  modem.at(kLocation).at("SignalsLocation") = signals;
  return modem;
}

std::map<std::uint32_t, sdbus::Variant> placed(const char* place) {
  return {{kPlaceOfCell, text(place)}};
}

bool waitForCell(const ModemWorld& world, std::uint32_t cellId) {
  return world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [cellId](const auto& cell) { return cell.cellId() == cellId; });
}

const FakeAnswer kUnsupported = {FakeAnswer::Kind::error,
                                 "org.freedesktop.ModemManager1.Error.Core.Unsupported"};

TEST(PlaceOfCell, IsSwitchedOnBesideWhatIsOnAndOffAgain) {
  ModemWorld world;
  world.manager->answer("GetCellInfo", kUnsupported);
  world.manager->setPlace("001,01,0,D30156,3E9");
  world.manager->add(kModemPath, modemWithPlaces(kGps));
  world.start();
  ASSERT_TRUE(waitForCell(world, 0xD30156));
  world.source.reset();
  EXPECT_THAT(world.manager->placesAskedFor(),
              ElementsAre(Pair(kGps | kPlaceOfCell, false), Pair(kGps, false)));
}

TEST(PlaceOfCell, IsReadWhereItIsPushed) {
  ModemWorld world;
  world.manager->answer("GetCellInfo", kUnsupported);
  world.manager->add(kModemPath, modemWithPlaces(kPlaceOfCell, true));
  world.start();
  world.manager->set(kModemPath, kLocation, "Location", placed("001,01,0,D30156,3E9"));
  EXPECT_TRUE(waitForCell(world, 0xD30156));
  world.manager->set(kModemPath, kLocation, "Location", placed("001,01,0,D30157,3E9"));
  EXPECT_TRUE(waitForCell(world, 0xD30157));
  world.source.reset();
  EXPECT_THAT(world.manager->placesAskedFor(), IsEmpty());
  EXPECT_EQ(world.manager->calls("GetLocation"), 0);
}

TEST(PlaceOfCell, IsPushedForAnotherProgramAsBefore) {
  ModemWorld world;
  world.manager->answer("GetCellInfo", kUnsupported);
  world.manager->add(kModemPath, modemWithPlaces(kGps, true));
  world.start();
  ASSERT_TRUE(becomesTrue([&] { return world.manager->placesAskedFor().size() == 1; }));
  EXPECT_THAT(world.manager->placesAskedFor(), ElementsAre(Pair(kGps | kPlaceOfCell, true)));
}

TEST(PlaceOfCell, IsLeftOffWhereTheListOfCellsTellsIt) {
  ModemWorld world;
  world.manager->setCells({{{"cell-type", number(5)},
                            {"serving", flag(true)},
                            {"tac", text("3E9")},
                            {"ci", text("D30156")}}});
  world.manager->add(kModemPath, modemWithPlaces(0));
  world.start();
  ASSERT_TRUE(waitForCell(world, 0xD30156));
  ASSERT_TRUE(becomesTrue([&] { return world.manager->calls("GetCellInfo") > 3; }));
  world.source.reset();
  EXPECT_THAT(world.manager->placesAskedFor(), IsEmpty());
}

TEST(PlaceOfCell, ThatAnotherProgramHasSwitchedSinceIsLeftAlone) {
  for (const std::uint32_t since : {0U, kGps, kGps | kPlaceOfCell}) {
    ModemWorld world;
    world.manager->answer("GetCellInfo", kUnsupported);
    world.manager->add(kModemPath, modemWithPlaces(0));
    world.start();
    ASSERT_TRUE(becomesTrue([&] { return world.manager->placesAskedFor().size() == 1; }));
    ASSERT_TRUE(becomesTrue([&] { return world.manager->calls("GetLocation") > 1; }));
    world.manager->set(kModemPath, kLocation, "Enabled", since);
    const int before = world.log->count(metric::kEmmContext);
    ASSERT_TRUE(world.log->waitForCount(metric::kEmmContext, before + 3));
    world.source.reset();
    EXPECT_THAT(world.manager->placesAskedFor(), ElementsAre(Pair(kPlaceOfCell, false))) << since;
  }
}

// The end of another service that had switched it on as well switched it off for this one too.
TEST(PlaceOfCell, IsSwitchedOnAgainWhenItWasPutBackOnceAndNotASecondTime) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->answer("GetCellInfo", kUnsupported);
  world.manager->setPlace("001,01,0,D30156,3E9");
  world.manager->add(kModemPath, modemWithPlaces(kGps));
  world.start();
  ASSERT_TRUE(waitForCell(world, 0xD30156));
  world.manager->set(kModemPath, kLocation, "Enabled", kGps);
  ASSERT_TRUE(becomesTrue([&] { return world.manager->placesAskedFor().size() == 2; }));
  EXPECT_THAT(world.manager->placesAskedFor()[1], Pair(kGps | kPlaceOfCell, false));
  world.manager->setPlace("001,01,0,D30157,3E9");
  EXPECT_TRUE(waitForCell(world, 0xD30157));
  world.manager->set(kModemPath, kLocation, "Enabled", kGps);
  const int before = world.log->count(metric::kEmmContext);
  ASSERT_TRUE(world.log->waitForCount(metric::kEmmContext, before + 60));
  EXPECT_THAT(world.manager->placesAskedFor(), ::testing::SizeIs(2));
}

TEST(PlaceOfCell, ThatMayNotBeSwitchedIsNamedInOneLine) {
  CapturedSystemLog log;
  ModemWorld world;
  world.manager->answer("GetCellInfo", {FakeAnswer::Kind::nonsense, ""});
  world.manager->answer(
      "Location.Setup",
      {FakeAnswer::Kind::error, "org.freedesktop.ModemManager1.Error.Core.Unauthorized"});
  world.manager->add(kModemPath, modemWithPlaces(0));
  world.start();
  ASSERT_TRUE(becomesTrue([&] { return !log.lines().empty(); }));
  const int before = world.log->count(metric::kEmmContext);
  ASSERT_TRUE(world.log->waitForCount(metric::kEmmContext, before + 3));
  world.source.reset();
  ASSERT_THAT(log.lines(), ::testing::SizeIs(1));
  EXPECT_THAT(log.lines()[0], HasSubstr("3gpp-lac-ci"));
  EXPECT_THAT(log.lines()[0], HasSubstr("Device.Control"));
  EXPECT_EQ(world.manager->calls("Location.Setup"), 1);
}

}  // namespace
}  // namespace qel::testing
