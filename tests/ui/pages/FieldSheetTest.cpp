#include "ui/pages/FieldSheet.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "messages/nas.h"
#include "messages/sim.h"
#include "messages/wcdma.h"
#include "ui/pages/FieldOrigin.h"
#include "ui/pages/Scene.h"
#include "ui/screens/QelViewItems.h"

namespace qel {
namespace {

using ::testing::HasSubstr;
using testing::kStartMs;

class FieldSheetTest : public ::testing::Test {
 protected:
  std::optional<FieldSheet> sheet(const char* category, const char* field, int section = 0,
                                  const char* technology = "LTE") {
    const auto row = rowOfField(scene.viewpoint(), technology, category, section, field);
    if (!row) return std::nullopt;
    return fieldSheet(scene.viewpoint(), technology, category, section, *row, scene.validator.utc);
  }

  static std::string line(const FieldSheet& of, std::string_view id) {
    std::string text;
    for (const SheetLine& each : of.lines) {
      if (each.id != id) continue;
      text += (text.empty() ? "" : "; ") + (id == "decoded" ? each.label + ": " : "") + each.value;
    }
    return text;
  }

  testing::Scene scene;
};

TEST_F(FieldSheetTest, tellsAllOfANeighboursLevel) {
  scene.at(0);
  scene.neighbour(200, -98);
  scene.reportNeighbours();
  scene.at(7000);
  const auto told = sheet("LTE Neighbor Cell Meas", "nbr_rsrp");
  ASSERT_TRUE(told);
  EXPECT_EQ(told->label, "RSRP");
  EXPECT_EQ(told->key, "nbr_rsrp");
  EXPECT_EQ(told->place, "LTE, LTE Neighbor Cell Meas, LTE 0");
  EXPECT_EQ(told->value, "-98");
  EXPECT_EQ(told->unit, "dBm");
  EXPECT_EQ(told->word, "fair");
  EXPECT_EQ(line(*told, "meaning"), "RSRP as the reported index: dBm + 140, 0 to 97.");
  EXPECT_EQ(line(*told, "range"), "-140 to -43 dBm");
  EXPECT_EQ(line(*told, "clause"), "3GPP TS 36.133, clause 9.1.4");
  EXPECT_EQ(line(*told, "raw"), "42 (dBm + 140)");
  EXPECT_EQ(line(*told, "hexadecimal"), "0x2a");
  EXPECT_EQ(line(*told, "age"), "5 s, since 08:00:00");
  EXPECT_EQ(line(*told, "source"), "KCellularLteNbrEutraCellMeas, metric 3986191");
  EXPECT_EQ(told->changesAtMs, kStartMs + 10'000);
}

TEST_F(FieldSheetTest, putsAllOfItIntoTheClipboard) {
  scene.cell({});
  const auto told = sheet("Serving Cell Info", "cell_id");
  ASSERT_TRUE(told);
  EXPECT_THAT(told->clipboard, HasSubstr("Cell identity (cell_id)\nLTE, Serving Cell Info\n"));
  EXPECT_THAT(told->clipboard, HasSubstr("Value: 1192961\n"));
  EXPECT_THAT(told->clipboard, HasSubstr("eNodeB: 4660\nSector: 1\n"));
  EXPECT_EQ(line(*told, "hexadecimal"), "0x123401");
}

TEST_F(FieldSheetTest, tellsAnEnumerationsNumberAndMeaning) {
  scene.rrc(testing::kConnected);
  const auto told = sheet("RRC State", "state");
  ASSERT_TRUE(told);
  EXPECT_EQ(told->value, "KLTE_RRC_STATE_CONNECTED");
  EXPECT_EQ(line(*told, "raw"), "3");
  EXPECT_EQ(line(*told, "decoded"), "Means: connected");
  EXPECT_TRUE(told->curve.empty());
}

TEST_F(FieldSheetTest, tellsTheTimeThatAnEntryCarriesOfItsReport) {
  KCellularLteTxPower report;
  report.setTimestamp(1'500'000'000'000);
  auto power = std::make_shared<TxPowerInfo>();
  power->setPucchTxPower(-12);
  report.addTxPowerInfo(power);
  scene.validator.feed(MetricValidator::K_LTE_TX_POWER, report);
  const auto time = sheet("Tx Power", "timestamp");
  ASSERT_TRUE(time);
  EXPECT_EQ(line(*time, "raw"), "1500000000000 (milliseconds since 1970-01-01 00:00 UTC)");
  EXPECT_EQ(line(*time, "decoded"), "UTC: 2017-07-14T02:40:00.000Z");
  const auto negative = sheet("Tx Power", "pucch_tx_power");
  ASSERT_TRUE(negative);
  EXPECT_EQ(line(*negative, "raw"), "-12");
  EXPECT_EQ(line(*negative, "hexadecimal"), "0xfffffff4");
}

TEST_F(FieldSheetTest, readsTheBytesOfAFile) {
  KCellularSimCardFiles report;
  for (const std::uint32_t identifier : {0x2FE2U, 0x6F7BU}) {
    auto file = std::make_shared<ElementaryFile>();
    file->setEfId(identifier);
    file->setContent(Bytes{0x62, 0xF2, 0x10});
    report.addEfList(file);
  }
  scene.validator.feed(MetricValidator::K_SIM_FILE_INFO, report);
  const auto told = sheet("SIM Files", "content", 1, "Device Info");
  ASSERT_TRUE(told);
  EXPECT_EQ(told->value, "<62f210>");
  EXPECT_EQ(line(*told, "raw"), "3 bytes");
  EXPECT_EQ(line(*told, "hexadecimal"), "62f210");
  EXPECT_EQ(line(*told, "decoded"), "Networks: 262-01");
}

TEST_F(FieldSheetTest, followsTheSameCellThroughTheReports) {
  for (std::uint64_t second = 0; second < 5; ++second) {
    scene.at(second * 1000);
    if (second % 2 == 0) scene.neighbour(300, -70);
    scene.neighbour(200, -98 - static_cast<std::int32_t>(second));
    scene.reportNeighbours();
  }
  const auto told = sheet("LTE Neighbor Cell Meas", "nbr_rsrp", 1);
  ASSERT_TRUE(told);
  EXPECT_EQ(told->value, "-102");
  ASSERT_EQ(told->curve.size(), 1U);
  ASSERT_EQ(told->curve[0].size(), 5U);
  for (std::size_t i = 0; i < 5; ++i) {
    EXPECT_EQ(told->curve[0][i].timeMs, kStartMs + i * 1000);
    EXPECT_EQ(told->curve[0][i].value, -98 - static_cast<float>(i));
  }
  EXPECT_EQ(told->lowest, -140);
  EXPECT_EQ(told->highest, -44);
}

TEST_F(FieldSheetTest, drawsNoLineThroughReportsWithoutTheCell) {
  for (std::uint64_t second = 0; second < 5; ++second) {
    scene.at(second * 1000);
    if (second != 2) scene.neighbour(200, -98);
    scene.neighbour(300, -99);
    scene.reportNeighbours();
  }
  const auto told = sheet("LTE Neighbor Cell Meas", "nbr_rsrp", 0);
  ASSERT_TRUE(told);
  ASSERT_EQ(told->curve.size(), 2U);
  EXPECT_EQ(told->curve[0].size(), 2U);
  EXPECT_EQ(told->curve[1].size(), 2U);
}

TEST_F(FieldSheetTest, endsItsCurveAtTheMoment) {
  for (std::uint64_t second = 0; second < 10; ++second) {
    scene.at(second * 1000);
    scene.neighbour(200, -98);
    scene.reportNeighbours();
  }
  Viewpoint earlier = scene.viewpoint(false);
  earlier.nowMs = kStartMs + 4000;
  const auto row = rowOfField(earlier, "LTE", "LTE Neighbor Cell Meas", 0, "nbr_rsrp");
  ASSERT_TRUE(row);
  const auto told =
      fieldSheet(earlier, "LTE", "LTE Neighbor Cell Meas", 0, *row, scene.validator.utc);
  ASSERT_TRUE(told);
  ASSERT_EQ(told->curve.size(), 1U);
  EXPECT_EQ(told->curve[0].size(), 5U);
  EXPECT_EQ(line(*told, "age"), "just now, at 08:00:04");
  EXPECT_FALSE(told->changesAtMs);
}

TEST_F(FieldSheetTest, looksAtTheNewestReportsAloneWhereThereAreVeryMany) {
  constexpr std::uint64_t kReports = 20'000;
  for (std::uint64_t i = 0; i < kReports; ++i) {
    scene.at(i * 25);
    scene.neighbour(200, -98);
    scene.reportNeighbours();
  }
  const auto told = sheet("LTE Neighbor Cell Meas", "nbr_rsrp");
  ASSERT_TRUE(told);
  ASSERT_EQ(told->curve.size(), 1U);
  EXPECT_EQ(told->curve[0].size(), 16'384U);
  EXPECT_EQ(told->curve[0].back().timeMs, kStartMs + (kReports - 1) * 25);
}

TEST_F(FieldSheetTest, isNoneForAnythingThatIsNoField) {
  const Viewpoint viewpoint = scene.viewpoint();
  const auto at = [&](const char* technology, const char* category, int section, int row) {
    return fieldSheet(viewpoint, technology, category, section, row).has_value();
  };
  EXPECT_FALSE(at("LTE", "Tx Power", 0, 0)) << "Waiting for Update";
  EXPECT_FALSE(at("LTE", "RRC State", 0, 0)) << "nothing was reported";
  EXPECT_FALSE(at("LTE", "Sel Resel Parameters", 0, 3)) << "an empty place for a report";
  EXPECT_FALSE(at("UMTS", "Serving Cell Meas", 0, 0)) << "Come back later";
  EXPECT_FALSE(at("LTE", "Nothing", 0, 0));
  EXPECT_FALSE(at("LTE", "Tx Power", 7, 0));
  EXPECT_FALSE(at("LTE", "Tx Power", -1, 0));
  EXPECT_FALSE(at("LTE", "Tx Power", 0, 7));
  EXPECT_FALSE(at("LTE", "RRC State", 1, -1));
}

TEST_F(FieldSheetTest, isThereForAFieldThatIsCalledLikeItsValue) {
  KCellularActivatedBearerContexts report;
  auto bearer = std::make_shared<BearerContext>();
  bearer->setApn("apn");
  bearer->setPdpAddr(Bytes{192, 0, 2, 118});
  report.addBearerContexts(bearer);
  scene.validator.feed(MetricValidator::K_CELLULAR_ACTIVE_BEARER, report);
  const auto told = sheet("Active Bearers", "apn");
  ASSERT_TRUE(told);
  EXPECT_EQ(told->value, "apn");
  EXPECT_EQ(told->label, "Access point name");
  EXPECT_EQ(line(*sheet("Active Bearers", "pdp_addr"), "decoded"), "IPv4: 192.0.2.118");
}

// Those whose values a metric brings are found through the dispatch table alone.
TEST(FieldOrigins, areKnownForEveryCategoryOfTheMenuThatHasATable) {
  const QelViewItems items;
  int known = 0;
  for (const std::string& technology : items.launchViewItemNames) {
    for (const std::string& name : items.firstLevelViewItems.at(technology)) {
      const Category* category = findCategory(technology + ' ' + name, Routine::cells);
      if (!category) continue;
      const auto origin = originOf(*category);
      ASSERT_TRUE(origin) << category->key;
      EXPECT_EQ(origin->copy != nullptr, category->list != nullptr) << category->key;
      ++known;
    }
  }
  EXPECT_EQ(known, 36);
}

}  // namespace
}  // namespace qel
