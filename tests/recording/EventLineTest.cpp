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
      {R"({"time_ms": 253402300800000, "event": "trigger"})", "\"time_ms\" is after the year 9999"},
      {R"({"time_ms": 18446744073709551615, "event": "trigger"})",
       "\"time_ms\" is after the year 9999"},
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

std::string lineWith(const std::string& entries) {
  return R"({"time_ms": 1, "event": "trigger")" + entries + "}";
}

// Ended the program with the parser's exception.
TEST(EventLine, ANumberBeyondEveryTypeIsAFaultOfItsLine) {
  for (const char* number : {"1e400", "-1e400", "1e999999999", "[[1e400]]", "{\"y\": 1e400}"}) {
    const LineFault fault = faultOf(lineWith(std::string(R"(, "x": )") + number));
    EXPECT_EQ(fault.reason, "\"x\" is nested too deep or out of range") << number;
    EXPECT_TRUE(fault.isJson) << number;
  }
  EXPECT_TRUE(faultOf(R"({"time_ms": 1e400, "event": "trigger"})").isJson);
  EXPECT_EQ(faultOf("1e400").reason, "not a JSON object");
  EXPECT_EQ(faultOf("[1e400]").reason, "not a JSON object");
}

TEST(EventLine, NumbersTooSmallForTheirTypeAreZero) {
  EXPECT_EQ(eventOf(lineWith(R"(, "x": 1e-400, "y": -1e-60)")).entries,
            (Dictionary{{"x", 0.0F}, {"y", -0.0F}}));
}

// The largest number was written in digits that were then out of range.
TEST(EventLine, TheLargestNumberIsReadAsItIsWritten) {
  RecordedEvent event;
  event.kind = RecordedKind::trigger;
  event.entries = {{"x", std::numeric_limits<float>::max()},
                   {"y", std::numeric_limits<float>::lowest()}};
  EXPECT_EQ(eventOf(eventLine(event)).entries, event.entries);
  EXPECT_FALSE(faultOf(lineWith(R"(, "x": 3.5e38)")).reason.empty());
}

std::string keys(std::size_t count) {
  std::string text;
  for (std::size_t i = 0; i < count; ++i) text += ", \"k" + std::to_string(i) + "\": 1";
  return text;
}

// Each key was compared with all those before it: 300,000 of them took minutes.
TEST(EventLine, KeysBeyondTheLimitAreNotRead) {
  EXPECT_EQ(eventOf(lineWith(keys(254))).entries.size(), 254U);
  EXPECT_EQ(eventOf(lineWith(keys(253) + R"(, "x": null)")).entries.size(), 254U) << "not plain";
  for (const char* more : {"", R"(, "x": null)"}) {
    const LineFault fault = faultOf(lineWith(keys(255) + more));
    EXPECT_EQ(fault.reason, "more than 256 keys in one object");
    EXPECT_TRUE(fault.isJson);
  }
  EXPECT_EQ(faultOf(lineWith(keys(300'000))).reason, "more than 256 keys in one object");
  EXPECT_EQ(faultOf(lineWith(R"(, "x": {"a": 1)" + keys(256) + "}")).reason,
            "more than 256 keys in one object");
}

TEST(EventLine, ValuesBeyondTheLimitAreNotRead) {
  const auto list = [](std::size_t count) {
    std::string text = R"(, "x": [0)";
    for (std::size_t i = 1; i < count; ++i) text += ",0";
    return lineWith(text + "]");
  };
  EXPECT_EQ(eventOf(list(65536 - 3)).entries.find("x")->asList()->size(), 65533U);
  EXPECT_EQ(faultOf(list(65536 - 2)).reason, "more than 65536 values");
}

TEST(EventLine, ObjectsAndArraysNestAsDeepAsTheLimit) {
  const auto nested = [](std::size_t depth) {
    return lineWith(R"(, "x": )" + std::string(depth, '[') + std::string(depth, ']'));
  };
  EXPECT_EQ(eventOf(nested(31)).entries.size(), 1U);
  EXPECT_THAT(faultOf(nested(32)).reason, HasSubstr("nested too deep"));
}

TEST(EventLine, OfAKeyThatComesAgainTheLastValueCounts) {
  EXPECT_EQ(eventOf(lineWith(R"(, "x": 1, "y": 2, "x": 3, "time_ms": 9)")).entries,
            (Dictionary{{"x", 3}, {"y", 2}}));
}

TEST(EventLine, AFaultQuotesNoMoreThanAMessageCanHold) {
  const std::string name(100'000, 'n');
  EXPECT_LT(faultOf(R"({"time_ms": 1, "event": ")" + name + "\"}").reason.size(), 200U);
  EXPECT_LT(faultOf(lineWith(", \"" + name + "\": 1e300")).reason.size(), 200U);
}

// A delete in a key reached the message as it was.
TEST(EventLine, AFaultQuotesNothingThatATerminalObeys) {
  EXPECT_THAT(faultOf(lineWith(", \"a\x7F\xC2\x9B\": 1e300")).reason,
              HasSubstr(R"("a\u007f\u009b")"));
  EXPECT_THAT(faultOf("{\"time_ms\": 1, \"event\": \"\xE2\x80\xAE\"}").reason,
              HasSubstr(R"("\u202e")"));
}

Value nestedLists(std::size_t depth) {
  Value value{List()};
  for (std::size_t i = 1; i < depth; ++i) value = List{std::move(value)};
  return value;
}

Dictionary numbered(std::size_t count) {
  Dictionary dictionary;
  for (std::size_t i = 0; i < count; ++i) dictionary.append(std::to_string(i), 1);
  return dictionary;
}

TEST(EventLine, WhatHasAReadableFormIsReadAndNothingElse) {
  const auto isRead = [](Dictionary entries) {
    RecordedEvent event;
    event.kind = RecordedKind::trigger;
    event.entries = std::move(entries);
    const bool read = std::holds_alternative<RecordedEvent>(parseEventLine(eventLine(event)));
    EXPECT_EQ(hasReadableForm(event), read);
    return read;
  };
  EXPECT_TRUE(isRead(numbered(254)));
  EXPECT_FALSE(isRead(numbered(255)));
  EXPECT_TRUE(isRead({{"x", numbered(256)}}));
  EXPECT_FALSE(isRead({{"x", numbered(257)}}));
  EXPECT_TRUE(isRead({{"x", nestedLists(31)}}));
  EXPECT_FALSE(isRead({{"x", nestedLists(32)}}));
  EXPECT_TRUE(isRead({{"x", List(65536 - 3, Value(1))}}));
  EXPECT_FALSE(isRead({{"x", List(65536 - 2, Value(1))}}));
  EXPECT_FALSE(isRead({{"kKeyPayload", "no base64"}}));
  EXPECT_TRUE(isRead({{"x", "\xFF\0\n"}, {"y", std::numeric_limits<float>::quiet_NaN()}}));
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
