#include "recording/PlainLine.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

namespace qel {
namespace {

TEST(PlainLine, isReadLikeAnyOther) {
  const auto event = readPlainLine(
      R"({"time_ms": 1500000000000, "event": "metric", "kKeyMetricID": 3952132, "own": "a b",)"
      R"( "kKeyPayload": "COgHEAMg+gE=", "kKeyProfileID": 0})");
  ASSERT_TRUE(event);
  EXPECT_EQ(event->timeMs, 1500000000000U);
  EXPECT_EQ(event->kind, RecordedKind::metric);
  ASSERT_EQ(event->entries.size(), 4U);
  EXPECT_EQ(event->entries.at(0).key.view(), "kKeyMetricID");
  EXPECT_EQ(event->entries.at(0).value, Value(std::uint64_t{3952132}));
  EXPECT_EQ(event->entries.at(1).key.view(), "own");
  EXPECT_EQ(event->entries.at(1).value, Value("a b"));
  EXPECT_EQ(event->entries.at(2).value, Value(Bytes{0x08, 0xE8, 0x07, 0x10, 3, 0x20, 0xFA, 1}));
  EXPECT_EQ(event->entries.at(3).value, Value(std::uint64_t{0}));
}

TEST(PlainLine, mayHaveBlanksAnywhereBetweenItsParts) {
  const auto event =
      readPlainLine("\t{ \"event\" :\"trigger\" ,\"x\":999999999999999999 , \"time_ms\": 0\t} \r");
  ASSERT_TRUE(event);
  EXPECT_EQ(event->kind, RecordedKind::trigger);
  EXPECT_EQ(event->timeMs, 0U);
  EXPECT_EQ(event->entries, (Dictionary{{"x", std::uint64_t{999999999999999999}}}));
}

TEST(PlainLine, hasNumbersOfEveryLengthAtAnyDistanceFromItsEnd) {
  const std::string digits = "987654321012345678";
  for (std::size_t length = 1; length <= digits.size(); ++length) {
    const std::string number = digits.substr(0, length);
    for (const char* rest :
         {"}", " }", "  }", "     }", "      }", "       }", ",\"y\":\"zzzzz\"}"}) {
      const auto event = readPlainLine(R"({"time_ms":1,"event":"trigger","x":)" + number + rest);
      ASSERT_TRUE(event) << number << rest;
      EXPECT_EQ(*event->entries.find("x"), Value(std::uint64_t{std::stoull(number)}));
    }
  }
}

TEST(PlainLine, hasNothingBesideADigitForADigit) {
  const std::string good = "1234567890123";
  for (std::size_t place = 0; place < good.size(); ++place) {
    for (int character = 0; character < 256; ++character) {
      std::string number = good;
      number[place] = static_cast<char>(character);
      const std::string line = R"({"event":"trigger","x":)" + number + R"(,"time_ms":1})";
      const bool isAtAnEnd = place == 0 || place + 1 == good.size();
      const bool isBlank = character == ' ' || character == '\t' || character == '\r';
      const bool isDigit = character >= (place == 0 ? '1' : '0') && character <= '9';
      EXPECT_EQ(readPlainLine(line).has_value(), isDigit || (isBlank && isAtAnEnd)) << line;
    }
  }
}

TEST(PlainLine, hasItsKeysInAnyOrder) {
  std::vector<std::string> parts = {R"("time_ms":5)", R"("event":"metric")", R"("kKeyMetricID":7)",
                                    R"( "kKeyPayload" :"AA==")", R"("x":"y")"};
  std::sort(parts.begin(), parts.end());
  do {
    std::string line;
    for (const std::string& part : parts) line += (line.empty() ? "{" : ",") + part;
    const auto event = readPlainLine(line + "}");
    ASSERT_TRUE(event) << line;
    EXPECT_EQ(event->timeMs, 5U);
    EXPECT_EQ(event->entries,
              (Dictionary{{"kKeyMetricID", 7U}, {"kKeyPayload", Bytes{0}}, {"x", "y"}}));
  } while (std::next_permutation(parts.begin(), parts.end()));
}

TEST(PlainLine, hasEachKeyOnceHoweverItIsWritten) {
  for (const char* key : {"time_ms", "event", "kKeyMetricID", "kKeyPayload", "x"}) {
    const std::string value = key == std::string_view("event")         ? "\"metric\""
                              : key == std::string_view("kKeyPayload") ? "\"\""
                                                                       : "1";
    for (const char* colon : {":", " :"}) {
      const std::string again = "\"" + std::string(key) + "\"" + colon + value;
      const std::string line = "{\"" + std::string(key) + "\":" + value + "," + again;
      EXPECT_FALSE(readPlainLine(line + R"(,"time_ms":1,"event":"metric"})")) << line;
      EXPECT_FALSE(readPlainLine(line + "}")) << line;
    }
  }
}

// Whether such lines are good is not for the short way to say.
TEST(PlainLine, leavesEveryOtherLineToTheParser) {
  const std::string start = R"({"time_ms": 1, "event": "trigger")";
  for (const char* rest : {R"(, "x": -1})",
                           R"(, "x": 1.5})",
                           R"(, "x": 1e3})",
                           R"(, "x": 01})",
                           R"(, "x": 1234567890123456789})",
                           R"(, "x": true})",
                           R"(, "x": null})",
                           R"(, "x": [1]})",
                           R"(, "x": {}})",
                           R"(, "x": "a\n"})",
                           R"(, "x": "\u00fc"})",
                           "\"x\": \"\xC3\xBC\"}",
                           R"(, "x\t": 1})",
                           R"(, "x": 1, "x": 2})",
                           R"(, "time_ms": 2})",
                           R"(, "event": "metric"})",
                           R"(, "kKeyPayload": "abc"})",
                           R"(, "kKeyPayload": 5})",
                           R"(, "x": 1)",
                           R"(, "x": )",
                           R"(, "x")",
                           R"(, })",
                           R"(} x)",
                           R"(}})",
                           R"(, "x": "never ends})",
                           ""}) {
    EXPECT_FALSE(readPlainLine(start + rest)) << start + rest;
  }
  for (const char* line :
       {"", " ", "[]", "{}", "{", "7", R"({"time_ms": 1})", R"({"event": "trigger"})",
        R"({"time_ms": "1", "event": "trigger"})", R"({"time_ms": 1, "event": "Metric"})",
        R"({"time_ms": 1, "event": 3})"}) {
    EXPECT_FALSE(readPlainLine(line)) << line;
  }
}

}  // namespace
}  // namespace qel
