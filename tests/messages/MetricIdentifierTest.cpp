// Metric identifiers in place of field numbers: taken, logged and never stored.
#include <gtest/gtest.h>

#include "Wire.h"
#include "base/Rendering.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/gsm.h"
#include "messages/lte_serving.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

using testing::CapturedSystemLog;
using testing::decoded;
using testing::joined;
using testing::tag;
using testing::varintField;
using testing::WireType;
using Lines = std::vector<std::string>;

TEST(MetricIdentifier, asATagIsLoggedWithItsValueAndReadingGoesOn) {
  const CapturedSystemLog log;
  const auto message =
      decoded<KCellularLteRrcState>(joined(varintField(19972, 4711), varintField(1, 5)));
  ASSERT_TRUE(message);
  EXPECT_EQ(jsonText(message->dictionaryRepresentation()), R"({"timestamp": 5})");
  EXPECT_EQ(log.lines(), (Lines{"valid metricId tag", "Unknown tag: 4e04:4711"}));
}

TEST(MetricIdentifier, isTakenInEveryMessageWhateverTheMetric) {
  for (const MetricName& metric : KBBMetricUtility::catalogue()) {
    SCOPED_TRACE(metric.name);
    const CapturedSystemLog log;
    const auto message =
        decoded<RxInfo>(joined(varintField(metric.identifier, 7), varintField(2, 50)));
    ASSERT_TRUE(message);
    EXPECT_EQ(jsonText(message->dictionaryRepresentation()), R"({"rsrp_range": 50})");
    ASSERT_EQ(log.lines().size(), 2U);
    EXPECT_EQ(log.lines()[0], "valid metricId tag");
  }
}

TEST(MetricIdentifier, isTakenInsideNestedMessagesToo) {
  const CapturedSystemLog log;
  const auto message = decoded<KCellularLteServingCellMeasurement>(
      testing::delimitedField(3, joined(varintField(19, 1), varintField(2, 50))));
  ASSERT_TRUE(message);
  EXPECT_EQ(jsonText(message->dictionaryRepresentation()), R"({"rx_info": [{"rsrp_range": 50}]})");
  EXPECT_EQ(log.lines(), (Lines{"valid metricId tag", "Unknown tag: 13:1"}));
}

TEST(MetricIdentifier, isReadAsAVarintWhateverItsWireType) {
  for (const auto type : {WireType::fixed64, WireType::delimited, WireType::groupStart,
                          WireType::fixed32, static_cast<WireType>(7)}) {
    SCOPED_TRACE(static_cast<int>(type));
    const CapturedSystemLog log;
    const auto message = decoded<KCellularLteRrcState>(
        joined(tag(54030, type), testing::varint(300), varintField(1, 5)));
    ASSERT_TRUE(message);
    EXPECT_EQ(message->timestamp(), 5U);
    EXPECT_EQ(log.lines(), (Lines{"valid metricId tag", "Unknown tag: d30e:300"}));
  }
}

TEST(MetricIdentifier, withEndOfGroupEndsTheMessageUnlogged) {
  const CapturedSystemLog log;
  const auto message = decoded<KCellularLteRrcState>(
      joined(varintField(1, 5), tag(19972, WireType::groupEnd), varintField(2, 1)));
  ASSERT_TRUE(message);
  EXPECT_FALSE(message->hasState());
  EXPECT_EQ(log.lines(), Lines());
}

TEST(MetricIdentifier, logsTheLow32BitsOfItsValue) {
  const CapturedSystemLog log;
  ASSERT_TRUE(decoded<KCellularLteRrcState>(varintField(19, 0x1'FFFF'FFFF)));
  EXPECT_EQ(log.lines(), (Lines{"valid metricId tag", "Unknown tag: 13:4294967295"}));
}

TEST(MetricIdentifier, isFoundInTheLow16BitsOfATag) {
  const CapturedSystemLog log;
  ASSERT_TRUE(decoded<KCellularLteRrcState>(varintField(0x10000 + 19, 1)));
  EXPECT_EQ(log.lines(), (Lines{"valid metricId tag", "Unknown tag: 13:1"}));
}

TEST(MetricIdentifier, withAValueThatIsCutOffGivesNoMessage) {
  const CapturedSystemLog log;
  EXPECT_FALSE(decoded<KCellularLteRrcState>(joined(tag(19, WireType::varint), Bytes{0x80})));
  EXPECT_EQ(log.lines(), (Lines{"valid metricId tag", "Unknown tag: 13:0"}));
}

TEST(MetricIdentifier, isNotLookedForAmongFieldsThatAreNone) {
  const CapturedSystemLog log;
  ASSERT_TRUE(decoded<KCellularLteRrcState>(joined(varintField(1, 19), varintField(60, 19))));
  EXPECT_EQ(log.lines(), Lines());
}

TEST(Field19, ofTheLteReselectionReportIsWrittenButNeverDecoded) {
  KCellularLteSelReselCellInfo local;
  local.setThreshServingLowQ(12);
  EXPECT_TRUE(local.hasThreshServingLowQ());
  EXPECT_EQ(local.data(), varintField(19, 12));
  EXPECT_EQ(jsonText(local.dictionaryRepresentation()),
            R"({"multi_band_info": [], "Thresh_serving_lowQ": 12})");

  const CapturedSystemLog log;
  const auto message = decoded<KCellularLteSelReselCellInfo>(
      joined(varintField(18, 3), local.data(), varintField(20, 4)));
  ASSERT_TRUE(message);
  EXPECT_FALSE(message->hasThreshServingLowQ());
  EXPECT_EQ(message->threshServingLowQ(), 0U);
  EXPECT_EQ(jsonText(message->dictionaryRepresentation()),
            R"({"multi_band_info": [], "Thresh_serving_lowP": 3, "priority_operating_freq": 4})");
  EXPECT_EQ(log.lines(), (Lines{"valid metricId tag", "Unknown tag: 13:12"}));
}

TEST(Field19, ofTheGsmIdleConfigurationIsWrittenButNeverDecoded) {
  KCellularGsmIdleConfig local;
  local.setCrOffset(12);
  EXPECT_EQ(local.data(), varintField(19, 12));
  EXPECT_EQ(jsonText(local.dictionaryRepresentation()), R"({"cr_offset": 12})");

  const CapturedSystemLog log;
  const auto message =
      decoded<KCellularGsmIdleConfig>(joined(varintField(18, 1), local.data(), varintField(20, 4)));
  ASSERT_TRUE(message);
  EXPECT_FALSE(message->hasCrOffset());
  EXPECT_EQ(message->crOffset(), 0U);
  EXPECT_EQ(jsonText(message->dictionaryRepresentation()), R"({"c2_valid": 1, "tmp_offset": 4})");
  EXPECT_EQ(log.lines(), (Lines{"valid metricId tag", "Unknown tag: 13:12"}));
}

}  // namespace
}  // namespace qel
