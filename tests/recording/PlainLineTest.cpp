#include "recording/PlainLine.h"

#include <gtest/gtest.h>

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
