#include "metrics/MetricValidator.h"

#include <gtest/gtest.h>

#include <array>
#include <cinttypes>
#include <csignal>
#include <cstdio>

#include "base/Rendering.h"
#include "messages/lte_serving.h"
#include "messages/wcdma.h"
#include "metrics/Feed.h"
#include "support/FakeTransport.h"

namespace qel {
namespace {

using testing::FedValidator;
using testing::metricEvent;

using Lines = std::vector<std::string>;

TEST(MetricValidator, storesAndLogsAMetric) {
  FedValidator validator;
  KCellularWcdmaScellMeasurement report;
  report.setTimestamp(1500000000000);
  report.setConnectedMode(true);
  validator.feed(3985666, report);
  EXPECT_EQ(validator->myUMTSCellMeasDict,
            (Dictionary{{"timestamp", "2017-07-14 02:40:00 UTC"}, {"connected_mode", true}}));
  EXPECT_EQ(validator.out.lines(),
            (Lines{"Metric ID in Hex = 3CD102",
                   "Received UMTS Serving Cell Meas is {\"timestamp\": \"2017-07-14 02:40:00 "
                   "UTC\", \"connected_mode\": true}",
                   "Received Valid Metric"}));
  EXPECT_EQ(validator->metricID, 3985666);
}

TEST(MetricValidator, ignoresTheTwoIdentifiersWithoutAHandler) {
  for (const auto identifier : {MetricValidator::K_LTE_RLF, MetricValidator::K_LTE_SCELL_MEAS}) {
    FedValidator validator;
    EXPECT_FALSE(validator->processMetric(metricEvent(identifier, Bytes{0x08, 0x01})));
    validator->metricsDidUpdate(metricEvent(identifier, Bytes{0x08, 0x01}));
    const std::string first = identifier == MetricValidator::K_LTE_RLF
                                  ? "Metric ID in Hex = 3C4E25"
                                  : "Metric ID in Hex = 3CD301";
    EXPECT_EQ(validator.out.lines(),
              (Lines{first, "I dont care for this Metric", first, "I dont care for this Metric"}));
    EXPECT_FALSE(validator->myLTESCellMeasDict.has_value());
  }
}

TEST(MetricValidator, ignoresAnIdentifierInsideARangeOfHandledOnes) {
  FedValidator validator;
  EXPECT_FALSE(validator->processMetric(metricEvent(3985670, Bytes())));
  EXPECT_EQ(validator.out.lines(),
            (Lines{"Metric ID in Hex = 3CD106", "I dont care for this Metric"}));
}

TEST(MetricValidator, writesShortAndNegativeIdentifiersInHex) {
  FedValidator validator;
  for (const std::int64_t identifier : {5, 0, -1}) {
    validator->processMetric(metricEvent(identifier, Bytes()));
  }
  const Lines lines = validator.out.lines();
  EXPECT_EQ(lines.at(0), "Metric ID in Hex =  5");
  EXPECT_EQ(lines.at(2), "Metric ID in Hex =  0");
  EXPECT_EQ(lines.at(4), "Metric ID in Hex = FFFFFFFFFFFFFFFF");
}

TEST(MetricValidator, writesIdentifiersOfAnyLengthInHex) {
  FedValidator validator;
  std::size_t line = 0;
  for (unsigned width = 1; width <= 64; ++width) {
    const std::uint64_t bits = 0xA5C3'1E72'9B04'6DF8U >> (64 - width);
    validator->processMetric(metricEvent(static_cast<std::int64_t>(bits), Bytes()));
    std::array<char, 40> expected{};
    std::snprintf(expected.data(), expected.size(), "Metric ID in Hex = %2" PRIX64, bits);
    EXPECT_EQ(validator.out.lines().at(line), expected.data());
    line = validator.out.lines().size();
  }
}

TEST(MetricValidator, doesNotLookAtThePayloadOfAnUnknownMetric) {
  FedValidator validator;
  EXPECT_FALSE(validator->processMetric(metricEvent(1, Bytes{0xFF, 0xFF})));
}

TEST(MetricValidator, storesARecordWithoutATimestampUnchanged) {
  FedValidator validator;
  KCellularLteRrcState state;
  state.setState(3);
  validator.feed(MetricValidator::K_LTE_RRC_STATE, state);
  EXPECT_EQ(validator->myLTERRCStateDict, (Dictionary{{"state", "KLTE_RRC_STATE_CONNECTED"}}));
}

TEST(MetricValidator, replacesTheWholeRecord) {
  FedValidator validator;
  KCellularLteRrcState first;
  first.setState(3);
  first.setCause(4);
  KCellularLteRrcState second;
  second.setPrevStateDurMs(250);
  validator.feed(MetricValidator::K_LTE_RRC_STATE, first);
  validator.feed(MetricValidator::K_LTE_RRC_STATE, second);
  EXPECT_EQ(validator->myLTERRCStateDict, (Dictionary{{"prev_state_dur_ms", 250}}));
}

TEST(MetricValidator, takesAMissingPayloadForAnEmptyMessage) {
  FedValidator validator;
  validator->metricsDidUpdate(Dictionary{{"kKeyMetricID", MetricValidator::K_LTE_RRC_STATE}});
  EXPECT_EQ(validator->myLTERRCStateDict, Dictionary());
  validator->metricsDidUpdate(Dictionary{{"kKeyMetricID", MetricValidator::K_LTE_SEL_RESEL_INFO},
                                         {"kKeyPayload", "no bytes"}});
  EXPECT_EQ(validator->myLTESelReselDict, (Dictionary{{"multi_band_info", "[]"}}));
}

TEST(MetricValidator, rendersTimestampsOfAnySize) {
  FedValidator validator;
  KCellularLteRrcState state;
  state.setTimestamp(0);
  validator.feed(MetricValidator::K_LTE_RRC_STATE, state);
  EXPECT_EQ(*validator->myLTERRCStateDict->find("timestamp"), Value("1970-01-01 00:00:00 UTC"));
  state.setTimestamp(std::numeric_limits<std::uint64_t>::max());
  validator.feed(MetricValidator::K_LTE_RRC_STATE, state);
  const auto text = validator->myLTERRCStateDict->find("timestamp")->asText();
  EXPECT_EQ(text->substr(0, 10), "584556019-");
}

TEST(MetricValidator, doesNotCareForTriggerEvents) {
  FedValidator validator;
  validator->eventsDidUpdate(Dictionary{{"kKeyMetricID", 3985666}});
  validator->eventsDidUpdate(std::nullopt);
  EXPECT_EQ(validator.out.lines(), (Lines{"I dont care for events", "I dont care for events"}));
}

TEST(MetricValidator, listensBeforeItIsTheDelegateAndThereIsOne) {
  const testing::CapturedSystemLog log;
  const auto service = testing::installFakeService();
  const auto& shared = MetricValidator::shared();
  EXPECT_EQ(shared, MetricValidator::shared());
  EXPECT_EQ(service->calls, (Lines{"off", "on"}));
  EXPECT_EQ(TeskWrapper::sharedInstance()->delegate(), shared);
  EXPECT_EQ(shared->mySharedTeskInstance, TeskWrapper::sharedInstance());
}

// Lines were written out and thrown away where only the store was asked for.
TEST(MetricValidator, writesOutNoRecordForASinkThatWantsNoLines) {
  class Unwanting final : public LogSink {
   public:
    explicit Unwanting(Lines& lines) : _lines(lines) {}
    void write(std::string_view line) override { _lines.emplace_back(line); }
    bool wantsLines() const override { return false; }

   private:
    Lines& _lines;
  };
  const FedValidator validator;
  Lines lines;
  setStandardOutput(std::make_shared<Unwanting>(lines));
  KCellularLteRrcState report;
  report.setTimestamp(1500000000000);
  validator->metricsDidUpdate(metricEvent(MetricValidator::K_LTE_RRC_STATE, report));
  setStandardOutput(nullptr);
  EXPECT_EQ(lines, (Lines{"Received Valid Metric"}));
  EXPECT_EQ(*validator->myLTERRCStateDict, (Dictionary{{"timestamp", "2017-07-14 02:40:00 UTC"}}));
}

TEST(MetricValidator, knowsItsKeysAndTheBandwidths) {
  const FedValidator validator;
  EXPECT_EQ(validator->metricIDKey, "kKeyMetricID");
  EXPECT_EQ(validator->payloadKey, "kKeyPayload");
  EXPECT_EQ(validator->profileIDKey, "kKeyProfileID");
  EXPECT_EQ(validator->metricID, std::nullopt);
  EXPECT_EQ(validator->dlbwlookup,
            (BandwidthTable{{0, 1.4F}, {1, 3.0F}, {2, 5.0F}, {3, 10.0F}, {4, 15.0F}, {5, 20.0F}}));
}

void expectEnd(const std::optional<Dictionary>& event, const char* reason) {
  const FedValidator validator;
  EXPECT_EXIT(validator->metricsDidUpdate(event), ::testing::KilledBySignal(SIGABRT), reason);
}

TEST(MetricValidatorDeathTest, endsWithoutADictionary) {
  expectEnd(std::nullopt, "without a dictionary");
}

TEST(MetricValidatorDeathTest, endsWithoutAnIntegerIdentifier) {
  expectEnd(Dictionary(), "kKeyMetricID");
  expectEnd(Dictionary{{"kKeyMetricID", "3985666"}}, "kKeyMetricID");
  expectEnd(Dictionary{{"kKeyMetricID", true}}, "kKeyMetricID");
  expectEnd(Dictionary{{"kKeyMetricID", 0.5F}}, "kKeyMetricID");
  expectEnd(Dictionary{{"kKeyMetricID", std::numeric_limits<std::uint64_t>::max()}},
            "kKeyMetricID");
}

TEST(MetricValidatorDeathTest, endsWithAPayloadThatCannotBeDecoded) {
  expectEnd(metricEvent(MetricValidator::K_LTE_RRC_STATE, Bytes{0x08}),
            "metric 3C4E04 has an undecodable payload");
}

}  // namespace
}  // namespace qel
