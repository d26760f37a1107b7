// The catalogue of metric identifiers, and which class decodes which metric.
#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <thread>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

using testing::CapturedSystemLog;

struct Expected {
  std::uint32_t identifier;
  const char* name;
  const char* className;
};

// In the order of the baseband's own list. The payload of 20005 has no class.
constexpr Expected kExpected[] = {
    {0x4E04, "KCellularLteRrcState", "KCellularLteRrcState"},
    {0x4E18, "KCellularLteCdrxConfig", "KCellularLteCdrxConfig"},
    {0x4E25, "KCellularLteRadioLinkFailure", nullptr},
    {0x40C2, "KCellularLteScellInfo", "KCellularLteScellInfo"},
    {0xD30E, "KCellularLteSelReselCellInfo", "KCellularLteSelReselCellInfo"},
    {0xD301, "KCellularLteServingCellMeasurement", "KCellularLteServingCellMeasurement"},
    {0xD302, "KCellularLteTxPower", "KCellularLteTxPower"},
    {0x4F6A, "KCellularRsrpRsrqSinr", "KCellularLteRsrpRsrqSinr"},
    {0xD50C, "KCellularEmmContext", "KCellularEmmContext"},
    {0xD30B, "KCellularLteComponentCarrierInfo", "KCellularLteComponentCarrierInfo"},
    {0xD313, "KCellularLteCarrierAggregationStatus", "KCellularLteCarrierAggregationStatus"},
    {0xD310, "KCellularLteNbrInterRatCellMeas", "KCellularLteNbrInterRatCellMeas"},
    {0xD30F, "KCellularLteNbrEutraCellMeas", "KCellularLteNbrEutraCellMeas"},
    {0xD509, "KCellularMmCommonInfo", "KCellularMmCommonInfo"},
    {0xD50D, "KCellularActivatedBearerContexts", "KCellularActivatedBearerContexts"},
    {0xD112, "KCellularWcdmaRrcConnectionState", "KCellularWcdmaRrcConnectionState"},
    {0x300C, "KCellularWcdmaCellInfo", "KCellularWcdmaCellInfo"},
    {0xD102, "KCellularWcdmaScellMeasurement", "KCellularWcdmaScellMeasurement"},
    {0xD103, "KCellularWcdmaTxPower", "KCellularWcdmaTxPower"},
    {0xD105, "KCellularWcdmaNbrCellMeas", "KCellularWcdmaNbrCellMeas"},
    {0xD104, "KCellularWcdmaSelReselCellInfo", "KCellularWcdmaSelReselCellInfo"},
    {0xD113, "KCellularWcdmaRrcConfiguration", "KCellularWcdmaRrcConfiguration"},
    {0xD50A, "KCellularMmContext", "KCellularMmContext"},
    {0xD50B, "KCellularGmmContext", "KCellularGmmContext"},
    {0x2E0C, "kCellularGsmScellInfo", "KCellularGsmScellInfo"},
    {0xD001, "kCellularGsmIdleConfig", "KCellularGsmIdleConfig"},
    {0xD002, "kCellularGsmIdleScellMeasurement", "KCellularGsmIdleScellMeasurement"},
    {0xD003, "kCellularGsmCsRfMeasurement", "KCellularGsmCsRfMeasurement"},
    {0xD009, "kCellularGsmGrrEventMeasCr", "KCellularGsmGrrEventMeasCr"},
    {0xD00C, "kCellularGsmGprsConfig", "KCellularGsmGprsConfig"},
    {0x13, "kCellularSimCardFiles", "KCellularSimCardFiles"},
};

TEST(Catalogue, listsThirtyOneMetricsInTheBasebandsOrder) {
  const auto catalogue = KBBMetricUtility::catalogue();
  ASSERT_EQ(catalogue.size(), 31U);
  ASSERT_EQ(std::size(kExpected), catalogue.size());
  for (std::size_t i = 0; i < catalogue.size(); ++i) {
    EXPECT_EQ(catalogue[i].identifier, kExpected[i].identifier) << i;
    EXPECT_EQ(catalogue[i].name, kExpected[i].name) << i;
  }
}

TEST(Catalogue, knowsExactlyItsOwnIdentifiersAmongAll16BitNumbers) {
  const CapturedSystemLog log;
  std::set<std::uint32_t> identifiers;
  for (const Expected& metric : kExpected) identifiers.insert(metric.identifier);
  std::size_t found = 0;
  for (std::uint32_t number = 0; number <= 0xFFFF; ++number) {
    const bool valid = KBBMetricUtility::isValidMetricIdTag(number, "RxInfo");
    ASSERT_EQ(valid, identifiers.contains(number)) << number;
    if (valid) ++found;
  }
  EXPECT_EQ(found, 31U);
  EXPECT_EQ(log.lines(), std::vector<std::string>(31, "valid metricId tag"))
      << "each success is logged once, a failure is not";
}

TEST(Catalogue, doesNotLookBeyondWhatItWasAsked) {
  EXPECT_FALSE(KBBMetricUtility::isValidMetricIdTag(0x10000 + 19, "RxInfo"));
  EXPECT_FALSE(KBBMetricUtility::isValidMetricIdTag(kMetricEventBase + 19972, "RxInfo"));
}

TEST(Catalogue, doesNotConsultTheClass) {
  const CapturedSystemLog log;
  EXPECT_TRUE(KBBMetricUtility::isValidMetricIdTag(19, "KCellularSimCardFiles"));
  EXPECT_TRUE(KBBMetricUtility::isValidMetricIdTag(19, "KCellularGsmIdleConfig"));
  EXPECT_TRUE(KBBMetricUtility::isValidMetricIdTag(19, ""));
}

TEST(Catalogue, knowsAMetricThatNoClassDecodes) {
  const CapturedSystemLog log;
  EXPECT_TRUE(KBBMetricUtility::isValidMetricIdTag(20005, "RxInfo"));
  EXPECT_EQ(findMetricMessage(20005), nullptr);
}

TEST(Catalogue, answersSeveralThreadsAtOnce) {
  const CapturedSystemLog log;
  std::vector<std::thread> threads;
  for (int i = 0; i < 4; ++i) {
    threads.emplace_back([] {
      for (const Expected& metric : kExpected) {
        EXPECT_TRUE(KBBMetricUtility::isValidMetricIdTag(metric.identifier, "RxInfo"));
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(log.lines().size(), 4 * std::size(kExpected));
}

TEST(MetricMessages, haveAClassForEveryMetricButOne) {
  ASSERT_EQ(metricMessages().size(), 30U);
  std::size_t position = 0;
  for (const Expected& metric : kExpected) {
    SCOPED_TRACE(metric.name);
    const MetricMessage* found = findMetricMessage(metric.identifier);
    if (!metric.className) {
      EXPECT_EQ(found, nullptr);
      continue;
    }
    ASSERT_NE(found, nullptr);
    EXPECT_EQ(found, &metricMessages()[position++]) << "in the catalogue's order";
    EXPECT_EQ(found->className, metric.className);
  }
}

TEST(MetricMessages, decodeToTheClassThatTheyName) {
  for (const MetricMessage& metric : metricMessages()) {
    SCOPED_TRACE(metric.className);
    const auto message = metric.decode({});
    ASSERT_TRUE(message);
    EXPECT_EQ(message->className(), metric.className);
    const Bytes cutOff = {0x08};
    EXPECT_EQ(metric.decode(cutOff), nullptr);
  }
}

TEST(MetricMessages, areFoundByThePlainIdentifierOnly) {
  EXPECT_EQ(findMetricMessage(0), nullptr);
  EXPECT_EQ(findMetricMessage(kMetricEventBase + 19972), nullptr);
  ASSERT_NE(findMetricMessage(19972), nullptr);
  EXPECT_EQ(findMetricMessage(19972)->className, "KCellularLteRrcState");
}

}  // namespace
}  // namespace qel
