#include "fleet/collect/PhoneMessage.h"

#include <gtest/gtest.h>

#include "base/Bytes.h"
#include "fleet/DecodedLine.h"
#include "fleet/collect/CopyRows.h"
#include "messages/lte_serving.h"
#include "recording/EventLine.h"
#include "recording/RecordingReader.h"

namespace qel::fleet {
namespace {

constexpr const char* kTopic = "qelwatch/lab/KCellularLteRrcState";
constexpr const char* kNumbers = ", \"stream\": 7, \"number\": 1}";

std::string recorded(const std::string& payload) {
  return R"({"time_ms": 5, "event": "metric", "kKeyMetricID": 3952132, "kKeyPayload": ")" +
         payload + "\"" + kNumbers;
}

std::string decoded(const std::string& record, const std::string& metric = "KCellularLteRrcState") {
  return R"({"time_ms": 5, "event": "metric", "metric": ")" + metric + R"(", "record": )" + record +
         kNumbers;
}

NumberedEvent event(const std::string& payload) {
  const PhoneMessage message = readPhoneMessage(kTopic, payload);
  if (const auto* none = std::get_if<NoMessage>(&message)) ADD_FAILURE() << none->why;
  const auto* found = std::get_if<NumberedEvent>(&message);
  return found ? *found : NumberedEvent();
}

std::string whyNone(const std::string& topic, const std::string& payload) {
  const PhoneMessage message = readPhoneMessage(topic, payload);
  const auto* none = std::get_if<NoMessage>(&message);
  return none ? none->why : "";
}

TEST(PhoneMessage, isAnEventInEitherForm) {
  const NumberedEvent line = event(recorded("COgHEAMg+gE="));
  EXPECT_EQ(line.phone, "lab");
  EXPECT_EQ(line.stream, 7U);
  EXPECT_EQ(line.number, 1U);
  EXPECT_EQ(line.timeMs, 5U);
  EXPECT_EQ(line.metric, "KCellularLteRrcState");
  const NumberedEvent record = event(decoded(
      R"({"timestamp": 1000, "state": "KLTE_RRC_STATE_CONNECTED", "prev_state_dur_ms": 250})"));
  const CopyRow row = {"1970-01-01T00:00:01.000Z", "KLTE_RRC_STATE_CONNECTED", std::nullopt, "250",
                       std::nullopt};
  for (const NumberedEvent& each : {line, record}) {
    EXPECT_EQ(each.fault, "");
    ASSERT_EQ(each.rows.size(), 1U);
    EXPECT_EQ(each.rows.front(), row);
  }
}

TEST(PhoneMessage, isNoneOfAForeignTopic) {
  for (const char* topic : {"", "qelwatch", "qelwatch/lab", "qelwatch/lab/", "qelwatch//x",
                            "qelwatch/lab/x/y", "other/lab/x", "qelwatch/a b/x"}) {
    EXPECT_EQ(whyNone(topic, recorded("")), "the topic is none of a phone") << topic;
  }
}

TEST(PhoneMessage, isNoneWithoutANumberThatCanBe) {
  const std::string start = R"({"time_ms": 5, "event": "trigger")";
  for (const char* rest :
       {"}", R"(, "stream": 7})", R"(, "number": 1})", R"(, "stream": 7, "number": 0})",
        R"(, "stream": 7, "number": -1})", R"(, "stream": 7, "number": "1"})",
        R"(, "stream": 7, "number": 9223372036854775808})",
        R"(, "stream": 4294967296, "number": 1})", R"(, "stream": 7, "number": 1.5})"}) {
    EXPECT_EQ(whyNone(kTopic, start + rest), "it has no stream and number") << rest;
  }
  EXPECT_EQ(event(start + R"(, "stream": 4294967295, "number": 9223372036854775807})").number,
            9223372036854775807U);
}

TEST(PhoneMessage, isNoneWithoutTimeOrKind) {
  EXPECT_NE(whyNone(kTopic, std::string(R"({"event": "trigger")") + kNumbers), "");
  EXPECT_NE(whyNone(kTopic, std::string(R"({"time_ms": 5, "event": "x")") + kNumbers), "");
  EXPECT_NE(whyNone(kTopic, std::string(R"({"time_ms": 5, "event": "metric")") + kNumbers), "");
  EXPECT_NE(
      whyNone(kTopic, std::string(R"({"time_ms": -5, "event": "metric", "record": {})") + kNumbers),
      "");
}

TEST(PhoneMessage, isNoneThatIsTooLarge) {
  const std::string text(kLargestMessage + 1, ' ');
  EXPECT_EQ(whyNone(kTopic, text), "longer than 1048832 bytes");
}

TEST(PhoneMessage, keepsItsNumberWhateverItsContentIs) {
  EXPECT_EQ(event(recorded("CA==")).fault, "payload cannot be decoded");
  EXPECT_EQ(event(decoded(R"({"prev_state_dur_ms": "long"})")).fault,
            "prev_state_dur_ms is not of type bigint");
  EXPECT_EQ(event(decoded(R"({"timestamp": "now"})")).fault,
            "timestamp is not of type timestamp with time zone");
  EXPECT_EQ(event(decoded(R"({"timestamp": 253402300800000})")).rows.front().front(), "infinity");
  EXPECT_EQ(event(decoded(R"({"meas_nbr_eutra": [1, "a", null]})", "KCellularLteNbrEutraCellMeas"))
                .rows.size(),
            1U);
  const NumberedEvent unknown = event(decoded(R"({"a": 1})", "of another time"));
  EXPECT_EQ(unknown.metric, "of another time");
  EXPECT_EQ(unknown.content, "{\"a\": 1}");
  EXPECT_EQ(unknown.table, nullptr);
}

TEST(PhoneMessage, hasOnlySoManyRows) {
  KCellularLteServingCellMeasurement report;
  for (std::size_t i = 0; i <= kMostRowsOfAnEvent; ++i) {
    report.addRxInfo(std::make_shared<RxInfo>());
  }
  const std::string payload =
      R"({"time_ms": 5, "event": "metric", "kKeyMetricID": 3986177, "kKeyPayload": ")" +
      base64Text(report.data()) + "\"" + kNumbers;
  const NumberedEvent many = event(payload);
  EXPECT_EQ(many.fault, "more than 4096 entries");
  EXPECT_TRUE(many.rows.empty());
}

TEST(PhoneMessage, doesNotMultiplyALongText) {
  std::string entries = "{}";
  for (int i = 0; i < 100; ++i) entries += ", {}";
  const std::string text(100'000, 'x');
  EXPECT_EQ(event(decoded("{\"call_id\": \"" + text + "\", \"inst_values\": [" + entries + "]}",
                          "KCellularRsrpRsrqSinr"))
                .fault,
            "more than 4194304 bytes of rows");
}

TEST(PhoneMessage, isWhatAPhoneSaysOfItself) {
  const PhoneMessage status = readPhoneMessage("qelwatch/lab/status", "online");
  ASSERT_TRUE(std::holds_alternative<PhoneStatus>(status));
  EXPECT_EQ(std::get<PhoneStatus>(status).status, "online");
  const PhoneMessage queue = readPhoneMessage(
      "qelwatch/lab/queue", R"({"stream": 7, "dropped": 1, "lost": 2, "undecodable": 3})");
  ASSERT_TRUE(std::holds_alternative<PhoneQueue>(queue));
  EXPECT_EQ(std::get<PhoneQueue>(queue).undecodable, 3U);
  EXPECT_EQ(whyNone("qelwatch/lab/queue", R"({"stream": 7})"), "\"dropped\" is no number");
  EXPECT_EQ(whyNone("qelwatch/lab/status", "away"), "it is no status");
}

TEST(PhoneMessage, saysHowManyEventsWereTooLargeIfItSaysSo) {
  const std::string start = R"({"stream": 7, "dropped": 0, "lost": 0, "undecodable": 0)";
  const auto tooLarge = [&](const std::string& rest) {
    return std::get<PhoneQueue>(readPhoneMessage("qelwatch/lab/queue", start + rest)).tooLarge;
  };
  EXPECT_EQ(tooLarge(R"(, "too_large": 5})"), 5U);
  EXPECT_EQ(tooLarge("}"), 0U);
  for (const char* rest : {R"(, "too_large": -1})", R"(, "too_large": "5"})"}) {
    EXPECT_EQ(whyNone("qelwatch/lab/queue", start + rest), "\"too_large\" is no number") << rest;
  }
}

TEST(PhoneMessage, saysTheSameInBothFormsOfEveryEvent) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(QEL_SAMPLE, RecordingReader::BadLines::fail, fault);
  ASSERT_TRUE(reader) << fault.message;
  const auto numbered = [](std::string line) {
    line.pop_back();
    return line + kNumbers;
  };
  std::size_t withRows = 0;
  while (const auto read = reader->next()) {
    const auto decodedForm = decodedLine(*read);
    ASSERT_TRUE(decodedForm);
    const NumberedEvent one = event(numbered(eventLine(*read)));
    const NumberedEvent two = event(numbered(*decodedForm));
    EXPECT_EQ(one.fault, "");
    EXPECT_EQ(one.metric, two.metric);
    EXPECT_EQ(one.table, two.table);
    EXPECT_EQ(one.content, two.content);
    EXPECT_EQ(one.rows, two.rows) << one.metric;
    withRows += one.rows.empty() ? 0U : 1U;
  }
  EXPECT_GT(withRows, 4000U);
}

TEST(CopyRows, haveTextThatTheDatabaseTakes) {
  using std::string_literals::operator""s;
  EXPECT_EQ(databaseText("a\0b\xFF"s), "a\uFFFDb\uFFFD");
}

}  // namespace
}  // namespace qel::fleet
