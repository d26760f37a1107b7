#include "recording/EventLine.h"

#include <gmock/gmock.h>

namespace qel {
namespace {

using ::testing::HasSubstr;

RecordedEvent eventOf(std::string_view line) {
  auto parsed = parseEventLine(line);
  if (const auto* bad = std::get_if<LineFault>(&parsed)) {
    ADD_FAILURE() << bad->reason;
    return {};
  }
  return std::get<RecordedEvent>(parsed);
}

LineFault faultOf(std::string_view line) {
  const auto parsed = parseEventLine(line);
  if (const auto* bad = std::get_if<LineFault>(&parsed)) return *bad;
  ADD_FAILURE() << "taken for an event: " << line;
  return {};
}

TEST(EventLine, AMetricHasTimeKindAndItsOtherKeysInOrder) {
  const RecordedEvent event =
      eventOf(R"({"time_ms": 1500000000000, "event": "metric", "kKeyMetricID": 3952132,)"
              R"( "kKeyProfileID": 0, "kKeyPayload": "COgHEAMg+gE="})");
  EXPECT_EQ(event.timeMs, 1500000000000U);
  EXPECT_EQ(event.kind, RecordedKind::metric);
  ASSERT_EQ(event.entries.size(), 3U);
  EXPECT_EQ(event.entries.at(0).key.view(), "kKeyMetricID");
  EXPECT_EQ(event.entries.at(0).value, Value(3952132));
  EXPECT_EQ(event.entries.at(1).key.view(), "kKeyProfileID");
  EXPECT_EQ(event.entries.at(2).value, Value(Bytes{0x08, 0xE8, 0x07, 0x10, 3, 0x20, 0xFA, 1}));
}

TEST(EventLine, ATriggerNeedsNoMetric) {
  const RecordedEvent event =
      eventOf(R"({"time_ms": 7, "event": "trigger", "kKeyTriggerID": 8323091})");
  EXPECT_EQ(event.kind, RecordedKind::trigger);
  EXPECT_EQ(event.entries, (Dictionary{{"kKeyTriggerID", 8323091}}));
}

TEST(EventLine, OtherKeysOfEveryKindAreKept) {
  const RecordedEvent event = eventOf(
      R"({"a": null, "b": true, "c": -9223372036854775808, "d": 18446744073709551615, "e": 0.5,)"
      R"( "time_ms": 1, "f": "ü", "g": [1, [2]], "h": {"y": 1, "x": 2}, "event": "trigger"})");
  const Dictionary expected = {{"a", Value()},
                               {"b", true},
                               {"c", std::numeric_limits<std::int64_t>::min()},
                               {"d", std::numeric_limits<std::uint64_t>::max()},
                               {"e", 0.5F},
                               {"f", "ü"},
                               {"g", List{Value(1), Value(List{Value(2)})}},
                               {"h", Dictionary{{"y", 1}, {"x", 2}}}};
  EXPECT_EQ(event.entries, expected);
  EXPECT_EQ(event.entries.at(7).value.asDictionary()->at(0).key.view(), "y");
}

TEST(EventLine, AMetricWithoutPayloadIsLeftToItsReader) {
  EXPECT_FALSE(eventOf(R"({"time_ms": 1, "event": "metric", "kKeyMetricID": 5})")
                   .entries.contains("kKeyPayload"));
}

TEST(EventLine, AnEmptyPayloadIsAPayload) {
  const RecordedEvent event =
      eventOf(R"({"time_ms": 1, "event": "metric", "kKeyMetricID": 5, "kKeyPayload": ""})");
  EXPECT_EQ(*event.entries.find("kKeyPayload"), Value(Bytes{}));
}

struct BadLine {
  const char* line;
  const char* reason;
};

TEST(EventLine, EveryBadLineIsNamedByWhatIsWrong) {
  const BadLine lines[] = {
      {"", "empty line"},
      {"  \t", "empty line"},
      {"[]", "not a JSON object"},
      {"7", "not a JSON object"},
      {"{}", "\"time_ms\" is missing"},
      {R"({"time_ms": -1, "event": "metric"})", "\"time_ms\" is no unsigned integer"},
      {R"({"time_ms": 1.5, "event": "metric"})", "\"time_ms\" is no unsigned integer"},
      {R"({"time_ms": "1", "event": "metric"})", "\"time_ms\" is no unsigned integer"},
      {R"({"time_ms": 99999999999999999999, "event": "metric"})",
       "\"time_ms\" is no unsigned integer"},
      {R"({"time_ms": 1})", "\"event\" is missing"},
      {R"({"time_ms": 1, "event": 3})", "\"event\" is no text"},
      {R"({"time_ms": 1, "event": "Metric"})", "unknown \"event\" \"Metric\""},
      {R"({"time_ms": 1, "event": "metric"})", "\"kKeyMetricID\" is missing"},
      {R"({"time_ms": 1, "event": "metric", "kKeyMetricID": true})", "is no 64-bit integer"},
      {R"({"time_ms": 1, "event": "metric", "kKeyMetricID": "5"})", "is no 64-bit integer"},
      {R"({"time_ms": 1, "event": "metric", "kKeyMetricID": 5.0})", "is no 64-bit integer"},
      {R"({"time_ms": 1, "event": "metric", "kKeyMetricID": 18446744073709551615})",
       "is no 64-bit integer"},
      {R"({"time_ms": 1, "event": "trigger", "kKeyPayload": 5})", "is no standard base64 text"},
      {R"({"time_ms": 1, "event": "trigger", "kKeyPayload": "abc"})", "is no standard base64 text"},
      {R"({"time_ms": 1, "event": "trigger", "kKeyPayload": "ab-_"})",
       "is no standard base64 text"},
      {R"({"time_ms": 1, "event": "trigger", "x": 1e300})", "\"x\" is nested too deep or out of"},
  };
  for (const BadLine& bad : lines) {
    const LineFault fault = faultOf(bad.line);
    EXPECT_THAT(fault.reason, HasSubstr(bad.reason)) << bad.line;
    EXPECT_TRUE(fault.isJson) << bad.line;
  }
}

TEST(EventLine, WhatIsNoJsonSaysWhere) {
  const LineFault fault = faultOf(R"({"time_ms": 1, "event": "metr)");
  EXPECT_FALSE(fault.isJson);
  EXPECT_THAT(fault.reason, HasSubstr("not JSON, column"));
  EXPECT_FALSE(faultOf("{\"time_ms\": 1, \"event\": \"trigger\", \"x\": \"\xFF\"}").isJson);
}

TEST(EventLine, DeepNestingIsRefusedWithoutHarm) {
  const std::string deep = std::string(100'000, '[') + std::string(100'000, ']');
  EXPECT_THAT(faultOf("{\"time_ms\": 1, \"event\": \"trigger\", \"x\": " + deep + "}").reason,
              HasSubstr("nested too deep"));
}

TEST(EventLine, WritingAndReadingGiveTheSameEvent) {
  RecordedEvent event;
  event.timeMs = 1'700'000'000'123;
  event.kind = RecordedKind::metric;
  event.entries = {{"kKeyMetricID", std::int64_t{3952132}},
                   {"kKeyPayload", Bytes{0, 1, 0xFE, 0xFF}},
                   {"quote\"", "line\nbreak"},
                   {"deep", List{Value(Dictionary{{"x", -1}}), Value(1.25F), Value()}}};
  const std::string line = eventLine(event);
  EXPECT_EQ(line.find('\n'), std::string::npos);
  const RecordedEvent read = eventOf(line);
  EXPECT_EQ(read.timeMs, event.timeMs);
  EXPECT_EQ(read.kind, event.kind);
  EXPECT_EQ(read.entries, event.entries);
}

TEST(EventLine, IsWrittenAsDocumented) {
  RecordedEvent event;
  event.timeMs = 1500000000000;
  event.entries = {{"kKeyMetricID", 3952132},
                   {"kKeyProfileID", 0},
                   {"kKeyPayload", Bytes{0x08, 0xE8, 0x07, 0x10, 3, 0x20, 0xFA, 1}}};
  EXPECT_EQ(eventLine(event),
            R"({"time_ms": 1500000000000, "event": "metric", "kKeyMetricID": 3952132,)"
            R"( "kKeyProfileID": 0, "kKeyPayload": "COgHEAMg+gE="})");
}

}  // namespace
}  // namespace qel
