// What the modem says on the bus appears as metrics with the right numbers.
#include <gmock/gmock.h>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/sim.h"
#include "messages/wcdma.h"
#include "radio/Bands.h"
#include "sources/Metrics.h"
#include "sources/modem_manager/ModemWorld.h"

namespace qel::testing {
namespace {

using namespace sources;

std::vector<FakeDictionary> cellsAround(std::uint32_t servingType) {
  std::vector<FakeDictionary> cells = {
      {{"cell-type", number(5)},
       {"operator-id", text("26201")},
       {"tac", text("A1B2")},
       {"ci", text("1C2D3FF")},
       {"physical-ci", text("1F7")},
       {"earfcn", number(1300)},
       {"rsrp", level(-95)},
       {"rsrq", level(-10.5)}},
      {{"cell-type", number(5)},
       {"physical-ci", text("2A")},
       {"earfcn", number(6300)},
       {"rsrp", level(-101)},
       {"rsrq", level(-12)}},
      {{"cell-type", number(3)},
       {"operator-id", text("26201")},
       {"lac", text("2F")},
       {"ci", text("ABCDE")},
       {"uarfcn", number(10737)},
       {"psc", number(511)},
       {"rscp", level(-80)},
       {"ecio", level(-7.5)}},
      {{"cell-type", number(2)},
       {"operator-id", text("310410")},
       {"lac", text("3039")},
       {"ci", text("FF01")},
       {"arfcn", number(62)},
       {"base-station-id", text("3F")},
       {"rx-level", number(30)}},
  };
  bool serving = true;
  for (FakeDictionary& cell : cells) {
    const bool isServing = serving && cell.at("cell-type").get<std::uint32_t>() == servingType;
    if (isServing) serving = false;
    cell["serving"] = flag(isServing);
  }
  return cells;
}

TEST(ModemOnLte, TellsItsServingCell) {
  ModemWorld world;
  world.manager->setCells(cellsAround(5));
  world.manager->add(kModemPath, modemOn(kOnLte));
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return cell.hasDlFreq(); }));
  const auto cell = world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo);
  EXPECT_EQ(cell->phyCellId(), 503U);
  EXPECT_EQ(cell->dlFreq(), 1300U);
  EXPECT_EQ(cell->freqBandInd(), 3U);
  EXPECT_EQ(cell->cellId(), 0x1C2D3FFU);
  EXPECT_EQ(cell->trackingAreaCode(), 0xA1B2U);
  EXPECT_EQ(cell->selPlmnMcc(), 262U);
  EXPECT_EQ(cell->selPlmnMnc(), 1U);
  EXPECT_EQ(cell->numMncDigits(), 2U);
  EXPECT_GT(cell->timestamp(), 0U);
  EXPECT_FALSE(cell->hasUlFreq());
  EXPECT_FALSE(cell->hasDlBw());
}

TEST(ModemOnLte, TellsItsSignal) {
  ModemWorld world;
  auto modem = modemOn(kOnLte);
  modem.at(kSignal).at("Lte") = FakeDictionary{
      {"rssi", level(-63.4)}, {"rsrp", level(-91.6)}, {"rsrq", level(-9.5)}, {"snr", level(12.2)}};
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kLteRsrpRsrqSinr, 1));
  const auto quality = world.log->newest<KCellularLteRsrpRsrqSinr>(metric::kLteRsrpRsrqSinr);
  ASSERT_EQ(quality->instValues().size(), 1U);
  EXPECT_EQ(quality->instValues()[0]->rsrp0(), -92);
  EXPECT_EQ(quality->instValues()[0]->rsrq0(), -10);
  EXPECT_EQ(quality->instValues()[0]->sinr0(), 24);  // half dB
  EXPECT_FALSE(quality->instValues()[0]->hasRsrp1());
  ASSERT_TRUE(world.log->waitForCount(metric::kLteServingMeasurement, 1));
  const auto measured =
      world.log->newest<KCellularLteServingCellMeasurement>(metric::kLteServingMeasurement);
  ASSERT_EQ(measured->rxInfos().size(), 1U);
  EXPECT_EQ(measured->rxInfos()[0]->rssi(), -63);
  EXPECT_EQ(measured->rxInfos()[0]->rsrpRange(), 48U);  // -92 dBm
  EXPECT_EQ(measured->rxInfos()[0]->rsrqRange(), 20U);  // -9.5 dB
  EXPECT_EQ(measured->rxInfos()[0]->snr(), 12);
  EXPECT_FALSE(measured->hasIsConnectedMode());
}

TEST(ModemOnLte, TellsItsNeighboursOfEachTechnology) {
  ModemWorld world;
  world.manager->setCells(cellsAround(5));
  world.manager->add(kModemPath, modemOn(kOnLte));
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kLteNeighbours, 1));
  ASSERT_TRUE(world.log->waitForCount(metric::kLteInterRat, 1));
  const auto own = world.log->newest<KCellularLteNbrEutraCellMeas>(metric::kLteNeighbours);
  ASSERT_EQ(own->measNbrEutras().size(), 1U);
  EXPECT_EQ(own->measNbrEutras()[0]->nbrEarfcn(), 6300U);
  EXPECT_EQ(own->measNbrEutras()[0]->nbrPhysCellId(), 42U);
  EXPECT_EQ(own->measNbrEutras()[0]->freqBandInd(), 20U);
  EXPECT_EQ(own->measNbrEutras()[0]->nbrRsrp(), 39);
  EXPECT_EQ(own->measNbrEutras()[0]->nbrRsrq(), 15);
  const auto others = world.log->newest<KCellularLteNbrInterRatCellMeas>(metric::kLteInterRat);
  ASSERT_EQ(others->measNbrUtras().size(), 1U);
  EXPECT_EQ(others->measNbrUtras()[0]->uarfcn(), 10737U);
  EXPECT_EQ(others->measNbrUtras()[0]->psc(), 511U);
  EXPECT_EQ(others->measNbrUtras()[0]->rscp(), 36);
  EXPECT_EQ(others->measNbrUtras()[0]->ecno(), 34U);
  ASSERT_EQ(others->measNbrGerans().size(), 1U);
  EXPECT_EQ(others->measNbrGerans()[0]->arfcn(), 62U);
  EXPECT_EQ(others->measNbrGerans()[0]->bsic(), 63U);
  EXPECT_EQ(others->measNbrGerans()[0]->rxlev(), 30U);
}

TEST(ModemOnLte, FollowsCellsThatComeAndGo) {
  ModemWorld world;
  world.manager->setCells(cellsAround(5));
  world.manager->add(kModemPath, modemOn(kOnLte));
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularLteNbrEutraCellMeas>(
      metric::kLteNeighbours, [](const auto& m) { return m.measNbrEutras().size() == 1; }));
  auto cells = cellsAround(5);
  cells.erase(cells.begin() + 1);
  world.manager->setCells(cells);
  EXPECT_TRUE(world.log->waitFor<KCellularLteNbrEutraCellMeas>(
      metric::kLteNeighbours, [](const auto& m) { return m.measNbrEutras().empty(); }));
}

TEST(ModemOnUmts, TellsItsCellsAndSignal) {
  ModemWorld world;
  world.manager->setCells(cellsAround(3));
  auto modem = modemOn(kOnHspa);
  modem.at(kSignal).at("Umts") =
      FakeDictionary{{"rssi", level(-71)}, {"rscp", level(-79)}, {"ecio", level(-8)}};
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularWcdmaCellInfo>(
      metric::kUmtsCellInfo, [](const auto& cell) { return cell.hasDlUarfcn(); }));
  const auto cell = world.log->newest<KCellularWcdmaCellInfo>(metric::kUmtsCellInfo);
  EXPECT_EQ(cell->mcc(), 262U);
  EXPECT_EQ(cell->mnc(), 1U);
  EXPECT_EQ(cell->lac(), 0x2FU);
  EXPECT_EQ(cell->cellId(), 0xABCDEU);
  EXPECT_EQ(cell->dlUarfcn(), 10737U);
  EXPECT_EQ(cell->psc(), 511U);
  EXPECT_EQ(cell->wcdmaBand(), kUmtsI);
  EXPECT_EQ(cell->hspa(), 3);
  ASSERT_TRUE(world.log->waitForCount(metric::kUmtsServingMeasurement, 1));
  const auto measured =
      world.log->newest<KCellularWcdmaScellMeasurement>(metric::kUmtsServingMeasurement);
  ASSERT_EQ(measured->rxInfos().size(), 1U);
  EXPECT_EQ(measured->rxInfos()[0]->rssi(), -71);
  EXPECT_EQ(measured->rxInfos()[0]->rsrpRange(), 37U);  // RSCP -79 dBm
  EXPECT_EQ(measured->rxInfos()[0]->rsrqRange(), 33U);  // Ec/No -8 dB
  ASSERT_TRUE(world.log->waitForCount(metric::kUmtsNeighbours, 1));
  const auto around = world.log->newest<KCellularWcdmaNbrCellMeas>(metric::kUmtsNeighbours);
  EXPECT_TRUE(around->measUtraResults().empty());
  ASSERT_EQ(around->measGsmResults().size(), 1U);
  EXPECT_EQ(around->measGsmResults()[0]->rxlev(), 30U);
  ASSERT_EQ(around->measLteResults().size(), 2U);
  EXPECT_EQ(around->measLteResults()[0]->earfcn(), 1300U);
  EXPECT_EQ(around->measLteResults()[0]->eutraBand(), 3U);
  EXPECT_EQ(around->measLteResults()[0]->rsrp(), 45);
  EXPECT_EQ(around->measLteResults()[0]->rsrq(), 18);
}

TEST(ModemOnGsm, TellsItsCellsAndSignal) {
  ModemWorld world;
  world.manager->setCells(cellsAround(2));
  auto modem = modemOn(kOnGsm);
  modem.at(kModem3gpp).at("OperatorCode") = std::string("310410");
  modem.at(kSignal).at("Gsm") = FakeDictionary{{"rssi", level(-77)}};
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularGsmScellInfo>(
      metric::kGsmScellInfo, [](const auto& cell) { return cell.hasArfcn(); }));
  const auto cell = world.log->newest<KCellularGsmScellInfo>(metric::kGsmScellInfo);
  EXPECT_EQ(cell->mcc(), 310U);
  EXPECT_EQ(cell->mnc(), 410U);
  EXPECT_EQ(cell->numMncDigits(), 3U);
  EXPECT_EQ(cell->lac(), 0x3039U);
  EXPECT_EQ(cell->cellId(), 0xFF01U);
  EXPECT_EQ(cell->arfcn(), 62U);
  EXPECT_EQ(cell->bsic(), 63U);
  EXPECT_EQ(cell->gsmBand(), kGsm900P);
  EXPECT_FALSE(cell->hasState());
  ASSERT_TRUE(world.log->waitFor<KCellularGsmIdleScellMeasurement>(
      metric::kGsmIdleMeasurement, [](const auto& m) { return m.hasScellArfcn(); }));
  const auto measured =
      world.log->newest<KCellularGsmIdleScellMeasurement>(metric::kGsmIdleMeasurement);
  EXPECT_EQ(measured->idleRxlevDBm(), -77);
  ASSERT_TRUE(world.log->waitForCount(metric::kGsmNeighbours, 1));
  const auto around = world.log->newest<KCellularGsmGrrEventMeasCr>(metric::kGsmNeighbours);
  EXPECT_TRUE(around->gsmNcellMeas().empty());
  ASSERT_EQ(around->umtsNcellMeas().size(), 1U);
  EXPECT_EQ(around->umtsNcellMeas()[0]->cpichRscp(), 36U);
  EXPECT_EQ(around->umtsNcellMeas()[0]->cpichEcn0(), 34U);
  ASSERT_EQ(around->lteNcellMeas().size(), 2U);
  EXPECT_EQ(around->lteNcellMeas()[1]->physicalCellId(), 42U);
  EXPECT_EQ(around->lteNcellMeas()[1]->rsrp(), 39U);
}

TEST(ModemWithoutCellInformation, TellsWhatItsLocationKnows) {
  ModemWorld world;
  world.manager->answer("GetCellInfo", {FakeAnswer::Kind::error,
                                        "org.freedesktop.ModemManager1.Error.Core.Unsupported"});
  world.manager->setPlace("262,01,FFFE,01C2D3FF,00A1B2");
  auto modem = modemOn(kOnLte);
  modem.at(kLocation).at("Enabled") = std::uint32_t{1};
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return cell.hasCellId(); }));
  const auto cell = world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo);
  EXPECT_EQ(cell->cellId(), 0x1C2D3FFU);
  EXPECT_EQ(cell->trackingAreaCode(), 0xA1B2U);
  EXPECT_EQ(cell->selPlmnMcc(), 262U);
  EXPECT_FALSE(cell->hasDlFreq());
  EXPECT_FALSE(cell->hasFreqBandInd());
  EXPECT_FALSE(world.has(metric::kLteNeighbours));
  EXPECT_EQ(world.manager->calls("GetCellInfo"), 1);
}

TEST(ModemRegistration, IsToldInTheDomainOfItsTechnology) {
  ModemWorld world;
  world.manager->add(kModemPath, modemOn(kOnLte));
  world.start();
  const auto isStatus = [](std::int32_t status) {
    return [status](const auto& m) { return m.hasRegStatus() && m.regStatus() == status; };
  };
  const auto emm = metric::kEmmContext;
  EXPECT_TRUE(world.log->waitFor<KCellularEmmContext>(emm, isStatus(0)));
  EXPECT_FALSE(world.has(metric::kMmContext));
  EXPECT_FALSE(world.has(metric::kGmmContext));
  const std::pair<std::uint32_t, std::int32_t> states[] = {{0, 4},  {2, 11}, {3, 1}, {5, 0},
                                                           {6, 10}, {7, 10}, {8, 8}, {9, 0}};
  for (const auto& [state, status] : states) {
    world.manager->set(kModemPath, kModem3gpp, "RegistrationState", state);
    EXPECT_TRUE(world.log->waitFor<KCellularEmmContext>(emm, isStatus(status))) << state;
  }
  world.manager->set(kModemPath, kModem3gpp, "RegistrationState", std::uint32_t{4});
  EXPECT_TRUE(becomesTrue([&] { return !world.has(emm); }));
  world.manager->set(kModemPath, kModem3gpp, "RegistrationState", std::uint32_t{5});
  world.manager->set(kModemPath, kModem, "AccessTechnologies", kOnUmts);
  EXPECT_TRUE(world.log->waitFor<KCellularMmContext>(metric::kMmContext, isStatus(0)));
  EXPECT_TRUE(world.log->waitFor<KCellularGmmContext>(metric::kGmmContext, isStatus(0)));
  EXPECT_TRUE(becomesTrue([&] { return !world.has(emm); }));
  world.manager->set(kModemPath, kModem3gpp, "PacketServiceState", std::uint32_t{2});
  EXPECT_TRUE(world.log->waitFor<KCellularGmmContext>(metric::kGmmContext, isStatus(6)));
}

TEST(ModemBearers, AreToldWithTheirAddresses) {
  ModemWorld world;
  auto modem = modemOn(kOnLte);
  modem.at(kModem).at("Bearers") =
      std::vector<sdbus::ObjectPath>{sdbus::ObjectPath(kBearerPath), sdbus::ObjectPath("/b/1")};
  world.manager->add(kBearerPath,
                     {{kBearer,
                       {{"Connected", true},
                        {"ProfileId", std::int32_t{3}},
                        {"Properties", FakeDictionary{{"apn", text("internet.test")}}},
                        {"Ip4Config", FakeDictionary{{"address", text("192.0.2.17")},
                                                     {"dns1", text("192.0.2.53")}}},
                        {"Ip6Config", FakeDictionary{{"address", text("2001:db8::1:2:3:4")},
                                                     {"dns1", text("2001:db8::53")}}}}}});
  world.manager->add("/b/1", {{kBearer, {{"Connected", false}}}});
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularActivatedBearerContexts>(
      metric::kBearers, [](const auto& m) { return m.bearerContextCount() == 1; }));
  const auto bearers = world.log->newest<KCellularActivatedBearerContexts>(metric::kBearers);
  ASSERT_EQ(bearers->bearerContexts().size(), 1U);
  const BearerContext& bearer = *bearers->bearerContexts()[0];
  EXPECT_EQ(bearer.apn(), "internet.test");
  EXPECT_EQ(bearer.cid(), 3U);
  EXPECT_EQ(bearer.pdpType(), 5);
  EXPECT_EQ(bearer.pdpAddr(), (Bytes{0, 1, 0, 2, 0, 3, 0, 4, 192, 0, 2, 17}));
  EXPECT_EQ(bearer.primaryDnsType(), 0);
  EXPECT_EQ(bearer.primaryDnsAddr(), (Bytes{192, 0, 2, 53}));
  EXPECT_EQ(bearer.secondaryDnsType(), 1);
  EXPECT_EQ(bearer.secondaryDnsAddr()->size(), 16U);
  EXPECT_FALSE(bearer.hasNsapi());
  world.manager->set(kBearerPath, kBearer, "Connected", false);
  EXPECT_TRUE(world.log->waitFor<KCellularActivatedBearerContexts>(
      metric::kBearers, [](const auto& m) { return m.bearerContexts().empty(); }));
}

TEST(ModemSim, IsToldAsFilesOfTheCard) {
  ModemWorld world;
  auto modem = modemOn(kOnLte);
  modem.at(kModem).at("Sim") = sdbus::ObjectPath(kSimPath);
  world.manager->add(kSimPath, {{kSim,
                                 {{"Imsi", std::string("262011234567890")},
                                  {"SimIdentifier", std::string("8949012345678901234F")}}}});
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(becomesTrue([&] { return world.has(metric::kSimFiles); }));
  const SourceAnswer answer = world.source->query(metric::kSimFiles);
  const auto files =
      KCellularSimCardFiles::initWithData(*answer.entries.find(tesk::kKeyPayload)->asBytes());
  ASSERT_EQ(files->efLists().size(), 2U);
  EXPECT_EQ(files->efLists()[0]->efId(), 0x2FE2U);
  EXPECT_EQ(files->efLists()[0]->content(),
            (Bytes{0x98, 0x94, 0x10, 0x32, 0x54, 0x76, 0x98, 0x10, 0x32, 0xF4}));
  EXPECT_EQ(files->efLists()[1]->efId(), 0x6F07U);
  EXPECT_EQ(files->efLists()[1]->content(),
            (Bytes{0x08, 0x29, 0x26, 0x10, 0x21, 0x43, 0x65, 0x87, 0x09}));
  EXPECT_TRUE(world.has(metric::kMmCommonInfo));
}

}  // namespace
}  // namespace qel::testing
