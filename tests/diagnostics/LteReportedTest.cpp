// What a phone on LTE reports to its network comes out as neighbours.
#include <gtest/gtest.h>

#include "sources/Metrics.h"
#include "support/diagnostics/AirModem.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages
using nlohmann::json;

constexpr auto kNeighbours = metric::kLteNeighbours;
constexpr auto kOthers = metric::kLteInterRat;

bool isTold(const ToldMetrics& told, std::uint32_t metric) {
  return std::find(told.begin(), told.end(), metric) != told.end();
}

json neighbours(const AirModem& modem) { return modem.saying(kNeighbours)["meas_nbr_eutra"]; }

TEST(LteReported, cellsAreNeighboursWithTheirLevelsAsReported) {
  AirModem modem;
  EXPECT_TRUE(isTold(modem.air(AirChannel::ulDcch, measurementReport(2, {AirResult{301, 55, 15},
                                                                         AirResult{12, 40, {}}})),
                     kNeighbours));
  EXPECT_EQ(neighbours(modem),
            (json{{{"nbr_phys_cell_id", 301}, {"nbr_rsrp", 55}, {"nbr_rsrq", 15}},
                  {{"nbr_phys_cell_id", 12}, {"nbr_rsrp", 40}}}))
      << "which channel they are on was not seen";
}

TEST(LteReported, cellsHaveTheChannelThatWasToBeMeasured) {
  AirModem modem;
  modem.air(AirChannel::dlDcch,
            measureConfiguration({{.object = 3, .earfcn = 700, .identity = 2},
                                  {.object = 4, .earfcn = 2300, .identity = 9}}));
  modem.air(AirChannel::ulDcch, measurementReport(9, {AirResult{301, 55, 15}}));
  EXPECT_EQ(neighbours(modem)[0]["nbr_earfcn"], 2300);
  EXPECT_EQ(neighbours(modem)[0]["freq_band_ind"], 4);
}

TEST(LteReported, cellsHaveTheOtherChannelAfterAHandover) {
  AirModem modem;
  modem.air(AirChannel::dlDcch,
            measureConfiguration({{.object = 1, .earfcn = 1300, .identity = 1},
                                  {.object = 2, .earfcn = 2300, .identity = 2}}));
  modem.air(AirChannel::dlDcch, handover(77, 2300));
  EXPECT_EQ(modem.reader().picture().lte.camped, (LteCellName{2300, 77}));
  modem.air(AirChannel::ulDcch, measurementReport(1, {AirResult{301, 55, 15}}), {2300, 77});
  EXPECT_EQ(neighbours(modem)[0]["nbr_earfcn"], 2300) << "the own one, as it was before";
}

TEST(LteReported, cellsForgetTheirChannelsWithTheConnection) {
  AirModem modem;
  modem.air(AirChannel::dlDcch,
            measureConfiguration({{.object = 1, .earfcn = 700, .identity = 1}}));
  modem.air(AirChannel::dlDcch, connectionRelease(1));
  modem.air(AirChannel::ulDcch, measurementReport(1, {AirResult{301, 55, 15}}));
  EXPECT_FALSE(neighbours(modem)[0].contains("nbr_earfcn"));
}

TEST(LteReported, cellsOfUmtsAndGsmAreNeighboursOfOtherTechnologies) {
  AirModem modem;
  EXPECT_TRUE(
      isTold(modem.air(AirChannel::ulDcch,
                       measurementReport(1, {AirUmtsResult{.psc = 444, .rscp = -3, .ecn0 = 30}})),
             kOthers));
  modem.air(
      AirChannel::ulDcch,
      measurementReport(2, {AirGsmResult{.arfcn = 620, .network = 5, .station = 3, .rssi = 40}}));
  const json others = modem.saying(kOthers);
  EXPECT_EQ(others["meas_nbr_utra"], (json{{{"psc", 444}, {"rscp", -3}, {"ecno", 30}}}));
  EXPECT_EQ(others["meas_nbr_geran"], (json{{{"arfcn", 620}, {"bsic", 43}, {"rxlev", 40}}}));
}

TEST(LteReported, cellsAreForgottenAfterHalfAMinuteAndWithTheCell) {
  AirModem modem;
  const auto report = measurementReport(1, {AirUmtsResult{.psc = 444, .rscp = 20, .ecn0 = 30}});
  modem.air(AirChannel::ulDcch, report);
  modem.wait(30'001);
  modem.air(AirChannel::dlDcch, ciphering());
  EXPECT_TRUE(modem.saying(kOthers).is_null());
  modem.air(AirChannel::ulDcch, report);
  modem.air(AirChannel::dlDcch, ciphering(), {.earfcn = 1300, .pci = 186});
  EXPECT_TRUE(modem.saying(kOthers).is_null());
}

TEST(LteReported, cellsAreKeptUpToALimit) {
  AirModem modem;
  for (unsigned psc = 0; psc < 100; ++psc) {
    modem.wait(1);
    modem.air(AirChannel::ulDcch,
              measurementReport(1, {AirUmtsResult{.psc = psc, .rscp = 20, .ecn0 = 30}}));
  }
  const json others = modem.saying(kOthers)["meas_nbr_utra"];
  EXPECT_EQ(others.size(), 64U);
  EXPECT_EQ(others.front()["psc"], 36) << "the oldest are gone";
}

}  // namespace
}  // namespace qel::diagnostics
