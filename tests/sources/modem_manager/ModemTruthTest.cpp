// What a modem says wrongly, of before, or not at all is not told.
#include <gmock/gmock.h>
#include <unistd.h>

#include <fstream>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/wcdma.h"
#include "sources/modem_manager/CellList.h"
#include "sources/modem_manager/ModemWorld.h"
#include "support/Sanitized.h"

namespace qel::testing {
namespace {

using namespace sources;

constexpr std::uint32_t kPlaceOfCell = 1;

std::map<std::uint32_t, sdbus::Variant> placed(const char* place) {
  return {{kPlaceOfCell, text(place)}};
}

FakeInterfaces modemIn(std::uint32_t technologies, const char* network) {
  auto modem = modemOn(technologies);
  modem.at(kModem3gpp).at("OperatorCode") = std::string(network);
  return modem;
}

// So that many reports have come since: what is shown by then stays.
void letTimePass(const ModemWorld& world, std::uint32_t metric, int reports) {
  const int before = world.log->count(metric);
  ASSERT_TRUE(world.log->waitForCount(metric, before + reports));
}

FakeDictionary gsmCell(std::uint32_t channel, const char* network, bool serving) {
  return {{"cell-type", number(2)},
          {"serving", flag(serving)},
          {"operator-id", text(network)},
          {"arfcn", number(channel)}};
}

// The list of cells turns the digits of a network with three digits round.
TEST(Network, IsTheRegisteredOneWhateverTheListOfCellsSays) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->setCells({{{"cell-type", number(5)},
                            {"serving", flag(true)},
                            {"operator-id", text("310041")},
                            {"earfcn", number(100)}}});
  world.manager->add(kModemPath, modemIn(kOnLte, "310410"));
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return cell.hasDlFreq(); }));
  const auto cell = world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo);
  EXPECT_EQ(cell->selPlmnMcc(), 310U);
  EXPECT_EQ(cell->selPlmnMnc(), 410U);
  EXPECT_EQ(cell->numMncDigits(), 3U);
}

TEST(Network, OfNeighboursIsNotBelievedWhereThatOfTheServingCellIsWrong) {
  for (const char* listed : {"310041", "310410"}) {
    ModemWorld world({}, ModemWorld::kPatient);
    world.manager->setCells({gsmCell(62, listed, true), gsmCell(63, listed, false)});
    world.manager->add(kModemPath, modemIn(kOnGsm, "310410"));
    world.start();
    ASSERT_TRUE(world.log->waitForCount(metric::kGsmNeighbours, 1)) << listed;
    const auto around = world.log->newest<KCellularGsmGrrEventMeasCr>(metric::kGsmNeighbours);
    ASSERT_EQ(around->gsmNcellMeas().size(), 1U) << listed;
    EXPECT_EQ(around->gsmNcellMeas()[0]->hasMnc(), std::string(listed) == "310410") << listed;
  }
}

TEST(Network, IsThatOfTheListOfCellsWhileThereIsNoRegisteredOne) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->setCells({gsmCell(62, "310410", true)});
  world.manager->add(kModemPath, modemIn(kOnGsm, ""));
  world.start();
  EXPECT_TRUE(world.log->waitFor<KCellularGsmScellInfo>(
      metric::kGsmScellInfo, [](const auto& cell) { return cell.mnc() == 410; }));
}

// An empty list was told as "no neighbours", by modems that list no cells of UMTS at all.
TEST(Neighbours, OfUmtsAreUnknownWhereTheListIsEmpty) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->add(kModemPath, modemOn(kOnUmts));
  world.start();
  ASSERT_TRUE(becomesTrue([&] { return world.manager->calls("GetCellInfo") > 2; }));
  letTimePass(world, metric::kMmContext, 2);
  EXPECT_FALSE(world.has(metric::kUmtsNeighbours));
  world.manager->setCells({{{"cell-type", number(3)}, {"serving", flag(true)}}});
  EXPECT_TRUE(becomesTrue([&] { return world.has(metric::kUmtsNeighbours); }));
}

// The place of the cell of before was shown as that of the new technology's cell.
TEST(PushedPlace, StaysBehindWhenTheTechnologyChanges) {
  ModemWorld world({}, ModemWorld::kPatient);
  auto modem = modemOn(kOnUmts);
  modem.at(kLocation).at("Enabled") = kPlaceOfCell;
  modem.at(kLocation).at("SignalsLocation") = true;
  modem.at(kLocation).at("Location") = placed("262,01,2F,ABCDE,0");
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularWcdmaCellInfo>(
      metric::kUmtsCellInfo, [](const auto& cell) { return cell.cellId() == 0xABCDE; }));
  letTimePass(world, metric::kUmtsCellInfo, 15);
  world.manager->set(kModemPath, kModem, "AccessTechnologies", kOnLte);
  ASSERT_TRUE(world.log->waitForCount(metric::kLteScellInfo, 3));
  EXPECT_FALSE(world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo)->hasCellId());
  world.manager->set(kModemPath, kLocation, "Location", placed("262,01,0,D30156,3E9"));
  EXPECT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return cell.cellId() == 0xD30156; }));
}

TEST(PushedPlace, MayComeJustBeforeTheNewsOfItsTechnology) {
  ModemWorld world({}, ModemWorld::kPatient);
  auto modem = modemOn(kOnUmts);
  modem.at(kLocation).at("Enabled") = kPlaceOfCell;
  modem.at(kLocation).at("SignalsLocation") = true;
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kUmtsCellInfo, 1));
  world.manager->set(kModemPath, kLocation, "Location", placed("262,01,0,D30156,3E9"));
  world.manager->set(kModemPath, kModem, "AccessTechnologies", kOnLte);
  EXPECT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return cell.cellId() == 0xD30156; }));
}

FakeInterfaces modemWithBearers(std::vector<sdbus::ObjectPath> paths) {
  auto modem = modemOn(kOnLte);
  modem.at(kModem).at("Bearers") = std::move(paths);
  return modem;
}

// A connection that could not be read was told as none.
TEST(Bearers, ThatRefuseToBeReadAreNotNone) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->add(kModemPath, modemWithBearers({sdbus::ObjectPath("/b/refuses")}));
  world.start();
  letTimePass(world, metric::kEmmContext, 4);
  EXPECT_FALSE(world.has(metric::kBearers));
}

TEST(Bearers, AreNotCountedWhereOneRefusesToBeRead) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->add(kBearerPath, {{kBearer, {{"Connected", true}}}});
  world.manager->add(kModemPath, modemWithBearers({sdbus::ObjectPath("/b/refuses"),
                                                   sdbus::ObjectPath(kBearerPath)}));
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kBearers, 1));
  const auto bearers = world.log->newest<KCellularActivatedBearerContexts>(metric::kBearers);
  EXPECT_EQ(bearers->bearerContexts().size(), 1U);
  EXPECT_FALSE(bearers->hasBearerContextCount());
}

TEST(Bearers, BeyondThirtyTwoAreNeitherReadNorCounted) {
  ModemWorld world({}, ModemWorld::kPatient);
  std::vector<sdbus::ObjectPath> paths;
  for (int i = 0; i < 40; ++i) {
    paths.emplace_back("/b/" + std::to_string(i));
    world.manager->add(paths.back(), {{kBearer, {{"Connected", true}}}});
  }
  world.manager->add(kModemPath, modemWithBearers(paths));
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kBearers, 1));
  const auto bearers = world.log->newest<KCellularActivatedBearerContexts>(metric::kBearers);
  EXPECT_EQ(bearers->bearerContexts().size(), 32U);
  EXPECT_FALSE(bearers->hasBearerContextCount());
}

// The addresses that stand for none were told as addresses.
TEST(Bearers, HaveNoAddressThatIsAllZeros) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->add(kBearerPath,
                     {{kBearer,
                       {{"Connected", true},
                        {"Ip4Config", FakeDictionary{{"address", text("0.0.0.0")},
                                                     {"dns1", text("0.0.0.0")},
                                                     {"dns2", text("192.0.2.53")}}},
                        {"Ip6Config", FakeDictionary{{"address", text("::")},
                                                     {"dns1", text("0:0:0:0:0:0:0:0")}}}}}});
  world.manager->add(kModemPath, modemWithBearers({sdbus::ObjectPath(kBearerPath)}));
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kBearers, 1));
  const auto bearers = world.log->newest<KCellularActivatedBearerContexts>(metric::kBearers);
  ASSERT_EQ(bearers->bearerContexts().size(), 1U);
  const BearerContext& bearer = *bearers->bearerContexts()[0];
  EXPECT_FALSE(bearer.hasPdpAddr());
  EXPECT_FALSE(bearer.hasPdpType());
  EXPECT_EQ(bearer.primaryDnsAddr(), (Bytes{192, 0, 2, 53}));
  EXPECT_FALSE(bearer.hasSecondaryDnsAddr());
}

// "Any technology" was taken for every one, HSPA too.
TEST(PacketAccess, IsUnknownWhereAnyTechnologyIsNamed) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->setCells(
      {{{"cell-type", number(3)}, {"serving", flag(true)}, {"uarfcn", number(10737)}}});
  world.manager->add(kModemPath, modemOn(0xFFFFFFFF));
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kUmtsCellInfo, 1));
  EXPECT_FALSE(world.log->newest<KCellularWcdmaCellInfo>(metric::kUmtsCellInfo)->hasHspa());
}

// -125 dBm is how a modem says that it hears nothing.
TEST(GsmLevel, ThatStandsForNoneIsNotTold) {
  ModemWorld world({}, ModemWorld::kPatient);
  auto modem = modemOn(kOnGsm);
  modem.at(kSignal).at("Gsm") = FakeDictionary{{"rssi", level(-125)}};
  world.manager->add(kModemPath, modem);
  world.start();
  letTimePass(world, metric::kMmContext, 3);
  EXPECT_FALSE(world.has(metric::kGsmIdleMeasurement));
  world.manager->set(kModemPath, kSignal, "Gsm", FakeDictionary{{"rssi", level(-109)}});
  EXPECT_TRUE(becomesTrue([&] { return world.has(metric::kGsmIdleMeasurement); }));
}

std::vector<FakeDictionary> crowd(std::uint32_t cells) {
  std::vector<FakeDictionary> list;
  for (std::uint32_t i = 0; i < cells; ++i) {
    list.push_back({{"cell-type", number(5)},
                    {"serving", flag(false)},
                    {"physical-ci", text("2A")},
                    {"earfcn", number(6150 + i % 300)},
                    {"rsrp", level(-101)},
                    {"rsrq", level(-12)}});
  }
  return list;
}

// Beyond the 256 cells that are taken the serving one was lost.
TEST(CellList, KeepsTheServingCellWhereverItStands) {
  ModemWorld world({}, ModemWorld::kPatient);
  auto cells = crowd(300);
  cells.push_back({{"cell-type", number(5)}, {"serving", flag(true)}, {"earfcn", number(100)}});
  world.manager->setCells(cells);
  world.manager->add(kModemPath, modemOn(kOnLte));
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return cell.dlFreq() == 100; }));
  ASSERT_TRUE(world.log->waitForCount(metric::kLteNeighbours, 1));
  const auto own = world.log->newest<KCellularLteNbrEutraCellMeas>(metric::kLteNeighbours);
  EXPECT_EQ(own->measNbrEutras().size(), 255U);
}

std::ptrdiff_t residentMb() {
  constexpr std::ptrdiff_t kBytesPerMb = 1 << 20;
  std::ptrdiff_t size = 0;
  std::ptrdiff_t resident = 0;
  std::ifstream("/proc/self/statm") >> size >> resident;
  return resident * ::sysconf(_SC_PAGESIZE) / kBytesPerMb;
}

// The whole answer was unpacked at once, and what that took was kept for good.
TEST(CellList, OfTwentyThousandCellsIsNotKeptInMemory) {
  if (testing::kIsSanitized) GTEST_SKIP() << "a sanitizer keeps memory that is given back";
  const PrivateBus bus;
  const auto connection = sdbus::createSessionBusConnectionWithAddress(bus.address());
  const auto object = sdbus::createProxy(*connection, "org.example.Nobody", "/");
  sdbus::MethodCall reply = object->createMethodCall("org.example.Nobody", "Cells");
  reply.openContainer("a{sv}");
  const FakeDictionary cell = crowd(1).front();
  for (int i = 0; i < 20000; ++i) reply << cell;
  reply.closeContainer();
  reply.seal();
  const std::ptrdiff_t before = residentMb();
  EXPECT_EQ(cellsIn(reply).size(), 256U);
  EXPECT_LT(residentMb() - before, 16);
  RecordProperty("residentMb", static_cast<int>(residentMb() - before));
}

}  // namespace
}  // namespace qel::testing
