#include "fleet/DecodedLine.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/lte_neighbours.h"

namespace qel::fleet {
namespace {

using Json = nlohmann::json;

Json decoded(std::uint32_t metric, const Bytes& payload) {
  RecordedEvent event{5, RecordedKind::metric, {}};
  event.entries.append(kRecordedMetricKey, std::int64_t{metric} + kMetricEventBase);
  event.entries.append(kRecordedPayloadKey, payload);
  const auto line = decodedLine(event);
  return line ? Json::parse(*line) : Json();
}

TEST(DecodedLine, saysTheRecordAsTheTablesDo) {
  KCellularLteNbrEutraCellMeas report;
  report.setTimestamp(7);
  auto neighbour = std::make_shared<EgwErrcNbrEutraMeas>();
  neighbour->setNbrRsrp(50);
  neighbour->setNbrRsrq(19);
  report.addMeasNbrEutra(std::move(neighbour));
  const Json line = decoded(54031, report.data());
  EXPECT_EQ(line["time_ms"], 5);
  EXPECT_EQ(line["event"], "metric");
  EXPECT_EQ(line["metric"], "KCellularLteNbrEutraCellMeas");
  EXPECT_EQ(line["record"]["timestamp"], 7);
  EXPECT_EQ(line["units"]["timestamp"], "ms");
  const Json& entry = line["record"]["meas_nbr_eutra"][0];
  EXPECT_EQ(entry["nbr_rsrp"], -90);
  EXPECT_EQ(entry["nbr_rsrq"], -10.0);
  EXPECT_EQ(line["units"]["meas_nbr_eutra"]["nbr_rsrp"], "dBm");
  EXPECT_EQ(line["units"]["meas_nbr_eutra"]["nbr_rsrq"], "dB");
}

TEST(DecodedLine, isNoneOfAPayloadThatNobodyCanRead) {
  EXPECT_TRUE(decoded(54017, Bytes{0xFF}).is_null());
}

TEST(DecodedLine, ofAnUnknownMetricHasItsEntries) {
  RecordedEvent event{5, RecordedKind::trigger, {}};
  event.entries.append("kKeyTriggerID", 7);
  EXPECT_EQ(decodedLine(event).value(),
            R"({"time_ms": 5, "event": "trigger", "entries": {"kKeyTriggerID": 7}})");
}

}  // namespace
}  // namespace qel::fleet
