// With the ModemManager that is installed and a simulated modem behind it.
#include <gmock/gmock.h>

#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/sim.h"
#include "messages/wcdma.h"
#include "sources/Metrics.h"
#include "sources/modem_manager/ModemWorld.h"
#include "sources/modem_manager/RealModemManager.h"

namespace qel::testing {
namespace {

using namespace sources;

constexpr std::uint32_t kPlaceOfCell = 1;

class RealModem : public ::testing::Test {
 protected:
  void SetUp() override {
    if (!RealModemManager::isInstalled()) {
      GTEST_SKIP() << "no " << RealModemManager::kProgram << ": install Debian's modemmanager";
    }
    manager = std::make_unique<RealModemManager>(bus);
    path = manager->plugIn(modem);
    startSource();
  }

  void startSource() {
    log = std::make_shared<MetricLog>();
    source = std::make_unique<ModemManagerSource>(
        ModemWish{}, bus::BusAddress{bus.address()},
        ModemTiming{std::chrono::milliseconds(200), std::chrono::milliseconds(2000)});
    source->start(log, std::make_shared<ListenerSignal>());
  }

  bool has(std::uint32_t metric) { return source->query(metric).known; }

  bool waitForCell(std::uint32_t area, std::uint32_t cellId) {
    return log->waitFor<KCellularLteScellInfo>(metric::kLteScellInfo, [=](const auto& cell) {
      return cell.trackingAreaCode() == area && cell.cellId() == cellId;
    });
  }
  bool waitForRsrp(std::int32_t dbm) {
    return log->waitFor<KCellularLteRsrpRsrqSinr>(metric::kLteRsrpRsrqSinr, [dbm](const auto& m) {
      return m.instValues()[0]->rsrp0() == dbm;
    });
  }
  bool waitForEmm(std::int32_t status) {
    return log->waitFor<KCellularEmmContext>(
        metric::kEmmContext, [status](const auto& m) { return m.regStatus() == status; });
  }

  std::uint32_t sourcesOfPlaces() {
    return manager->property<std::uint32_t>(path, kLocation.c_str(), "Enabled");
  }
  std::uint32_t signalRate() {
    return manager->property<std::uint32_t>(path, kSignal.c_str(), "Rate");
  }

  PrivateBus bus;
  AtSimulator modem;
  std::unique_ptr<RealModemManager> manager;
  std::string path;
  std::shared_ptr<MetricLog> log;
  std::unique_ptr<ModemManagerSource> source;
};

TEST_F(RealModem, TellsWhereItIsRegistered) {
  manager->enable(path);
  ASSERT_TRUE(waitForEmm(0));
  ASSERT_TRUE(waitForCell(0x1A2B, 0x1C2D3FF));
  const auto cell = log->newest<KCellularLteScellInfo>(metric::kLteScellInfo);
  EXPECT_EQ(cell->selPlmnMcc(), 1U);
  EXPECT_EQ(cell->selPlmnMnc(), 1U);
  EXPECT_EQ(cell->numMncDigits(), 2U);
  EXPECT_FALSE(cell->hasDlFreq());
  EXPECT_FALSE(has(metric::kLteNeighbours));
  EXPECT_FALSE(has(metric::kMmContext));
}

TEST_F(RealModem, TellsItsSignalAndFollowsIt) {
  manager->enable(path);
  ASSERT_TRUE(waitForRsrp(-91));
  const auto quality = log->newest<KCellularLteRsrpRsrqSinr>(metric::kLteRsrpRsrqSinr);
  EXPECT_EQ(quality->instValues()[0]->rsrq0(), -10);
  EXPECT_FALSE(quality->instValues()[0]->hasSinr0());
  ASSERT_TRUE(log->waitForCount(metric::kLteServingMeasurement, 1));
  const auto measured =
      log->newest<KCellularLteServingCellMeasurement>(metric::kLteServingMeasurement);
  EXPECT_EQ(measured->rxInfos()[0]->rsrpRange(), 49U);
  EXPECT_EQ(measured->rxInfos()[0]->rsrqRange(), 19U);
  EXPECT_FALSE(measured->rxInfos()[0]->hasRssi());
  modem.change([](AtModem& m) { m.rsrp = 30; });
  EXPECT_TRUE(waitForRsrp(-111));
}

TEST_F(RealModem, TellsItsCardAlsoWhenItIsOff) {
  ASSERT_TRUE(log->waitForCount(metric::kSimFiles, 1));
  ASSERT_TRUE(log->waitForCount(metric::kMmCommonInfo, 1));
  const auto files = log->newest<KCellularSimCardFiles>(metric::kSimFiles);
  ASSERT_EQ(files->efLists().size(), 5U);
  EXPECT_EQ(files->efLists()[0]->content(),
            (Bytes{0x98, 0x00, 0x01, 0x21, 0x43, 0x65, 0x87, 0x09, 0x21, 0xF3}));
  EXPECT_EQ(files->efLists()[1]->content(),
            (Bytes{0x08, 0x09, 0x10, 0x10, 0x21, 0x43, 0x65, 0x87, 0x09}));
  const Bytes filler(8, 0xFF);
  Bytes name = {0xFF, 'T', 'e', 's', 't', ' ', 'N', 'e', 't'};
  name.insert(name.end(), filler.begin(), filler.end());
  EXPECT_EQ(files->efLists()[2]->content(), name);
  EXPECT_EQ(files->efLists()[3]->content(), (Bytes{0xFF, 0xFF, 0xFF, 2}));
  EXPECT_EQ(files->efLists()[4]->content(), (Bytes{0x11, 0xF2, 0xFF, 0x19, 0xF1, 0xFF}));
  const auto common = log->newest<KCellularMmCommonInfo>(metric::kMmCommonInfo);
  EXPECT_EQ(common->imsi(), (Bytes{0x08, 0x09, 0x10, 0x10, 0x21, 0x43, 0x65, 0x87, 0x09}));
  EXPECT_FALSE(has(metric::kLteScellInfo));
}

TEST_F(RealModem, TellsItsConnections) {
  manager->enable(path);
  manager->connect(path, "internet.test");
  ASSERT_TRUE(log->waitFor<KCellularActivatedBearerContexts>(
      metric::kBearers, [](const auto& m) { return m.bearerContextCount() == 1; }));
  const auto bearers = log->newest<KCellularActivatedBearerContexts>(metric::kBearers);
  ASSERT_EQ(bearers->bearerContexts().size(), 1U);
  EXPECT_EQ(bearers->bearerContexts()[0]->apn(), "internet.test");
  EXPECT_EQ(bearers->bearerContexts()[0]->cid(), 1U);
  EXPECT_EQ(bearers->bearerContexts()[0]->pdpType(), 3);  // IPv4, of LTE
  // The addresses are agreed on over the connection itself.
  EXPECT_FALSE(bearers->bearerContexts()[0]->hasPdpAddr());
  manager->disconnect(path);
  EXPECT_TRUE(log->waitFor<KCellularActivatedBearerContexts>(
      metric::kBearers, [](const auto& m) { return m.bearerContexts().empty(); }));
}

TEST_F(RealModem, IsFollowedFromCellToCellAndOutOfTheNetwork) {
  manager->enable(path);
  ASSERT_TRUE(waitForCell(0x1A2B, 0x1C2D3FF));
  modem.change([](AtModem& m) { m.cellId = 0xABCDE; });
  EXPECT_TRUE(waitForCell(0x1A2B, 0xABCDE));
  modem.change([](AtModem& m) {
    m.area = 0xF1;
    m.cellId = 0x1;
    m.registration = 5;
  });
  EXPECT_TRUE(waitForCell(0xF1, 0x1));
  EXPECT_TRUE(waitForEmm(0));
  modem.change([](AtModem& m) { m.registration = 3; });
  EXPECT_TRUE(waitForEmm(1));
  modem.change([](AtModem& m) { m.registration = 2; });
  EXPECT_TRUE(waitForEmm(11));
  modem.change([](AtModem& m) { m.registration = 1; });
  EXPECT_TRUE(waitForEmm(0));
  manager->enable(path, false);
  EXPECT_TRUE(becomesTrue([&] { return !has(metric::kLteScellInfo); }));
  EXPECT_TRUE(becomesTrue([&] { return !has(metric::kLteRsrpRsrqSinr); }));
}

TEST_F(RealModem, IsFollowedToUmts) {
  modem.change([](AtModem& m) {
    m.technology = 2;
    m.area = 0x2F;
    m.cellId = 0x12345;
  });
  manager->enable(path);
  ASSERT_TRUE(log->waitFor<KCellularWcdmaCellInfo>(metric::kUmtsCellInfo, [](const auto& cell) {
    return cell.lac() == 0x2F && cell.cellId() == 0x12345;
  }));
  ASSERT_TRUE(log->waitForCount(metric::kMmContext, 1));
  EXPECT_EQ(log->newest<KCellularMmContext>(metric::kMmContext)->regStatus(), 0);
  EXPECT_FALSE(has(metric::kLteScellInfo));
}

TEST_F(RealModem, IsFollowedWhereItsPlaceIsPushed) {
  manager->enable(path);
  manager->setUpLocation(path, kPlaceOfCell, true);
  ASSERT_TRUE(waitForCell(0x1A2B, 0x1C2D3FF));
  modem.change([](AtModem& m) { m.cellId = 0xFACE; });
  EXPECT_TRUE(waitForCell(0x1A2B, 0xFACE));
}

TEST_F(RealModem, HasItsPlaceSwitchedOnWhereThatIsOffAndOffAgain) {
  manager->enable(path);
  ASSERT_TRUE(waitForCell(0x1A2B, 0x1C2D3FF));
  source.reset();
  EXPECT_EQ(sourcesOfPlaces(), kPlaceOfCell);  // as it was found
  manager->setUpLocation(path, 0, false);
  ASSERT_TRUE(becomesTrue([&] { return sourcesOfPlaces() == 0; }));
  startSource();
  ASSERT_TRUE(waitForCell(0x1A2B, 0x1C2D3FF));
  EXPECT_EQ(sourcesOfPlaces(), kPlaceOfCell);
  source.reset();
  EXPECT_EQ(sourcesOfPlaces(), 0U);
}

TEST_F(RealModem, HasItsSignalMeasuredOnlyWhileItIsWatched) {
  manager->enable(path);
  ASSERT_TRUE(waitForRsrp(-91));
  EXPECT_EQ(signalRate(), 1U);
  source.reset();
  EXPECT_EQ(signalRate(), 0U);
}

TEST_F(RealModem, IsFoundAgainAfterModemManagerCrashed) {
  manager->enable(path);
  ASSERT_TRUE(waitForCell(0x1A2B, 0x1C2D3FF));
  ASSERT_TRUE(waitForRsrp(-91));
  manager->kill();
  ASSERT_TRUE(becomesTrue([&] { return !has(metric::kLteScellInfo) && !has(metric::kSimFiles); }));
  modem.change([](AtModem& m) {
    m.cellId = 0xBEEF;
    m.rsrp = 60;
  });
  manager->start();
  path = manager->plugIn(modem);
  manager->enable(path);
  EXPECT_TRUE(waitForCell(0x1A2B, 0xBEEF));
  EXPECT_TRUE(waitForRsrp(-81));
}

}  // namespace
}  // namespace qel::testing
