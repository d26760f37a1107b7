// What ModemManager's interface lets others do differently makes no difference.
#include <gmock/gmock.h>

#include <filesystem>

#include "messages/lte_neighbours.h"
#include "messages/nas.h"
#include "messages/sim.h"
#include "messages/wcdma.h"
#include "sources/modem_manager/ModemWorld.h"

namespace qel::testing {
namespace {

using namespace sources;

const std::string kListedSim = "/org/freedesktop/ModemManager1/SIM/17";
const std::string kListedBearer = "/org/freedesktop/ModemManager1/Bearer/23";

FakeInterfaces simWith(const char* imsi) {
  return {{kSim, {{"Imsi", std::string(imsi)}, {"SimIdentifier", std::string()}}}};
}

FakeInterfaces bearerTo(const char* apn) {
  return {{kBearer, {{"Connected", true}, {"Properties", FakeDictionary{{"apn", text(apn)}}}}}};
}

bool waitForImsi(const ModemWorld& world, const Bytes& imsi) {
  return world.log->waitFor<KCellularMmCommonInfo>(metric::kMmCommonInfo,
                                                   [&](const auto& m) { return m.imsi() == imsi; });
}

bool waitForApns(const ModemWorld& world, const std::vector<std::string>& apns) {
  return world.log->waitFor<KCellularActivatedBearerContexts>(metric::kBearers, [&](const auto& m) {
    std::vector<std::string> found;
    for (const auto& bearer : m.bearerContexts()) found.push_back(bearer->apn().value_or(""));
    return found == apns;
  });
}

const Bytes kFirstImsi = {0x08, 0x39, 0x01, 0x00, 0x14, 0x32, 0x54, 0x76, 0x98};  // 310004123456789
const Bytes kOtherImsi = {0x08, 0x39, 0x01, 0x00, 0x94, 0x99, 0x99, 0x99, 0x99};  // 310004999999999

TEST(Changes, ThatAreAnnouncedWithoutTheirValuesAreRead) {
  ModemWorld world;
  auto modem = modemWithRsrp(-80);
  modem.at(kModem).at("Sim") = sdbus::ObjectPath(kSimPath);
  world.manager->add(kSimPath, simWith("310004123456789"));
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-80));
  ASSERT_TRUE(waitForImsi(world, kFirstImsi));
  for (const std::int32_t dbm : {-81, -82, -83}) {
    world.manager->setQuietly(kModemPath, kSignal, "Lte", FakeDictionary{{"rsrp", level(dbm)}});
    EXPECT_TRUE(world.waitForRsrp(dbm));
  }
  world.manager->setQuietly(kSimPath, kSim, "Imsi", std::string("310004999999999"));
  EXPECT_TRUE(waitForImsi(world, kOtherImsi));
}

TEST(Modem, ThatAppearsInterfaceByInterfaceIsWhole) {
  ModemWorld world;
  world.start();
  world.manager->addInPieces(kModemPath, modemWithRsrp(-80));
  EXPECT_TRUE(world.waitForRsrp(-80));
  EXPECT_TRUE(world.log->waitForCount(metric::kEmmContext, 1));
}

TEST(Modem, UnderThePathOfAnotherIsAnother) {
  ModemWorld world;
  world.manager->answer("GetCellInfo", {FakeAnswer::Kind::error,
                                        "org.freedesktop.ModemManager1.Error.Core.Unsupported"});
  world.manager->add(kModemPath, modemWithRsrp(-80));
  world.start();
  ASSERT_TRUE(becomesTrue([&] { return world.manager->calls("GetCellInfo") == 1; }));
  world.manager->answer("GetCellInfo", {});
  world.manager->setCells(
      {{{"cell-type", number(5)}, {"serving", flag(true)}, {"earfcn", number(100)}}});
  world.manager->remove(kModemPath);
  world.manager->add(kModemPath, modemWithRsrp(-81));
  EXPECT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return cell.dlFreq() == 100; }));
}

TEST(Parts, MayBeListedAndChangeTheirPaths) {
  ModemWorld world;
  auto modem = modemOn(kOnLte);
  modem.at(kModem).at("Sim") = sdbus::ObjectPath(kListedSim);
  modem.at(kModem).at("Bearers") = std::vector<sdbus::ObjectPath>{sdbus::ObjectPath(kListedBearer)};
  world.manager->add(kListedSim, simWith("310004123456789"));
  world.manager->add(kListedBearer, bearerTo("one.example"));
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(waitForImsi(world, kFirstImsi));
  ASSERT_TRUE(waitForApns(world, {"one.example"}));
  world.manager->add(kSimPath, simWith("310004999999999"));
  world.manager->set(kModemPath, kModem, "Sim", sdbus::ObjectPath(kSimPath));
  EXPECT_TRUE(waitForImsi(world, kOtherImsi));
  world.manager->set(kListedBearer, kBearer, "Connected", false);
  EXPECT_TRUE(waitForApns(world, {}));
  world.manager->set(kModemPath, kModem, "Sim", sdbus::ObjectPath("/"));
  EXPECT_TRUE(becomesTrue([&] { return !world.has(metric::kMmCommonInfo); }));
}

TEST(Parts, ThatCannotBeReadHideNoOthers) {
  ModemWorld world;
  auto modem = modemOn(kOnLte);
  modem.at(kModem).at("Bearers") =
      std::vector<sdbus::ObjectPath>{sdbus::ObjectPath("/not/there"), sdbus::ObjectPath("/b/1")};
  world.manager->add("/b/1", bearerTo("two.example"));
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(waitForApns(world, {"two.example"}));
  // They are asked for again, and may be there by then.
  world.manager->add("/not/there", bearerTo("one.example"));
  EXPECT_TRUE(waitForApns(world, {"one.example", "two.example"}));
}

TEST(Numbers, MayHaveOtherTypesAndWritings) {
  ModemWorld world;
  auto modem = modemOn(kOnLte);
  modem.at(kModem).at("State") = std::uint32_t{11};
  modem.at(kModem).at("AccessTechnologies") = std::int32_t{1 << 14};
  modem.at(kModem3gpp).at("RegistrationState") = std::int32_t{5};
  modem.at(kModem3gpp).at("OperatorCode") = std::string("001001");
  modem.at(kSignal).at("Rate") = std::uint64_t{0};
  modem.at(kSignal).at("Lte") = FakeDictionary{{"rsrp", sdbus::Variant(std::int32_t{-87})}};
  world.manager->setCells({{{"cell-type", sdbus::Variant(std::int32_t{5})},
                            {"serving", flag(true)},
                            {"tac", text("0x03e9")},
                            {"ci", text("00d30156")},
                            {"physical-ci", text("1a0")},
                            {"earfcn", sdbus::Variant(std::uint16_t{6300})}}});
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-87));
  ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& m) { return m.hasDlFreq(); }));
  const auto cell = world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo);
  EXPECT_EQ(cell->dlFreq(), 6300U);
  EXPECT_EQ(cell->trackingAreaCode(), 1001U);
  EXPECT_EQ(cell->cellId(), 0xD30156U);
  EXPECT_EQ(cell->phyCellId(), 416U);
  EXPECT_EQ(cell->selPlmnMcc(), 1U);
  EXPECT_EQ(cell->selPlmnMnc(), 1U);
  EXPECT_EQ(cell->numMncDigits(), 3U);
  ASSERT_TRUE(world.log->waitForCount(metric::kEmmContext, 1));
  EXPECT_TRUE(becomesTrue([&] { return world.manager->ratesAskedFor().size() == 1; }));
}

TEST(Technology, IsLteBesideTheNextAndNoneWhereAnyIsNamed) {
  ModemWorld world;
  const std::uint32_t kBoth = kOnLte | 1U << 15;
  world.manager->setCells({{{"cell-type", number(6)},
                            {"serving", flag(true)},
                            {"physical-ci", text("1")},
                            {"nrarfcn", number(632000)},
                            {"rsrp", level(-70)}},
                           {{"cell-type", number(5)},
                            {"serving", flag(true)},
                            {"physical-ci", text("2")},
                            {"earfcn", number(100)},
                            {"rsrp", level(-90)}}});
  world.manager->add(kModemPath, modemOn(kBoth));
  world.start();
  ASSERT_TRUE(world.waitForRsrp(-90));
  ASSERT_TRUE(world.log->waitForCount(metric::kLteNeighbours, 1));
  const auto own = world.log->newest<KCellularLteNbrEutraCellMeas>(metric::kLteNeighbours);
  EXPECT_TRUE(own->measNbrEutras().empty());
  world.manager->setCells({});
  world.manager->set(kModemPath, kModem, "AccessTechnologies", std::uint32_t{0xFFFFFFFF});
  EXPECT_TRUE(becomesTrue([&] { return !world.has(metric::kLteScellInfo); }));
}

TEST(Modem, ThatIsNotOnTellsItsCardAlone) {
  for (const std::int32_t state : {-1, 1, 2, 3, 4, 5}) {
    ModemWorld world;
    auto modem = modemWithRsrp(-80);
    modem.at(kModem).at("State") = state;
    modem.at(kModem).at("Sim") = sdbus::ObjectPath(kSimPath);
    world.manager->add(kSimPath, simWith("310004123456789"));
    world.manager->add(kModemPath, modem);
    world.start();
    ASSERT_TRUE(waitForImsi(world, kFirstImsi));
    EXPECT_FALSE(world.has(metric::kLteRsrpRsrqSinr)) << state;
    EXPECT_FALSE(world.has(metric::kEmmContext)) << state;
    EXPECT_EQ(world.manager->calls("GetCellInfo"), 0) << state;
  }
}

TEST(CellInformation, HoldsWhileAModemIsBusyForAWhile) {
  ModemWorld world;
  world.manager->setCells(
      {{{"cell-type", number(5)}, {"serving", flag(true)}, {"earfcn", number(100)}}});
  world.manager->add(kModemPath, modemOn(kOnLte));
  world.start();
  const auto hasChannel = [](const auto& cell) { return cell.hasDlFreq(); };
  ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(metric::kLteScellInfo, hasChannel));
  world.manager->answer("GetCellInfo", {FakeAnswer::Kind::error,
                                        "org.freedesktop.ModemManager1.Error.Core.InProgress"});
  EXPECT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return !cell.hasDlFreq(); }));
  EXPECT_GE(world.manager->calls("GetCellInfo"), 4);
  world.manager->answer("GetCellInfo", {});
  EXPECT_TRUE(world.log->waitFor<KCellularLteScellInfo>(metric::kLteScellInfo, hasChannel));
}

std::size_t openDescriptors() {
  const std::filesystem::directory_iterator all("/proc/self/fd");
  return static_cast<std::size_t>(std::distance(begin(all), end(all)));
}

// How many signals the programs on the bus have asked for.
std::size_t matchesOn(const PrivateBus& bus) {
  const auto connection = sdbus::createSessionBusConnectionWithAddress(bus.address());
  const auto daemon =
      sdbus::createProxy(*connection, "org.freedesktop.DBus", "/org/freedesktop/DBus");
  std::map<std::string, std::vector<std::string>> rules;
  daemon->callMethod("GetAllMatchRules")
      .onInterface("org.freedesktop.DBus.Debug.Stats")
      .storeResultsTo(rules);
  std::size_t count = 0;
  for (const auto& [program, own] : rules) count += own.size();
  return count;
}

TEST(ModemsThatComeAndGo, LeaveNothingBehind) {
  ModemWorld world;
  const auto plugAndUnplug = [&](int i) {
    auto modem = modemWithRsrp(-60 - i);
    modem.at(kModem).at("Sim") = sdbus::ObjectPath("/sim/" + std::to_string(i));
    world.manager->add("/sim/" + std::to_string(i), simWith("310004123456789"));
    world.manager->add(pathOf(i), modem);
    ASSERT_TRUE(world.waitForRsrp(-60 - i)) << i;
    ASSERT_TRUE(becomesTrue([&] { return world.has(metric::kMmCommonInfo); })) << i;
    world.manager->remove(pathOf(i));
    world.manager->remove("/sim/" + std::to_string(i));
    ASSERT_TRUE(becomesTrue([&] { return !world.has(metric::kLteRsrpRsrqSinr); })) << i;
  };
  world.start();
  ASSERT_NO_FATAL_FAILURE(plugAndUnplug(0));
  const std::size_t descriptors = openDescriptors();
  const std::size_t matches = matchesOn(world.bus);
  EXPECT_EQ(matches, 4U);
  for (int i = 1; i <= 50; ++i) ASSERT_NO_FATAL_FAILURE(plugAndUnplug(i));
  EXPECT_EQ(openDescriptors(), descriptors);
  EXPECT_EQ(matchesOn(world.bus), matches);
}

TEST(ModemManagerRestarts, LeaveNothingBehind) {
  ModemWorld world;
  world.start();
  std::size_t descriptors = 0;
  for (int i = 0; i < 10; ++i) {
    world.manager->add(kModemPath, modemWithRsrp(-60 - i));
    ASSERT_TRUE(world.waitForRsrp(-60 - i)) << i;
    if (i == 0) descriptors = openDescriptors();
    world.manager.reset();
    ASSERT_TRUE(becomesTrue([&] { return !world.has(metric::kLteRsrpRsrqSinr); })) << i;
    world.manager = std::make_unique<FakeModemManager>(world.bus.address());
  }
  world.manager->add(kModemPath, modemWithRsrp(-90));
  ASSERT_TRUE(world.waitForRsrp(-90));
  EXPECT_EQ(openDescriptors(), descriptors);
}

}  // namespace
}  // namespace qel::testing
