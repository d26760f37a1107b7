#include "recording/PayloadLine.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

std::string reasonFor(std::string_view line) {
  const auto parsed = parsePayloadLine(line);
  const auto* reason = std::get_if<std::string>(&parsed);
  return reason ? *reason : "";
}

TEST(PayloadLine, hasAMetricAndBytes) {
  const auto parsed = parsePayloadLine(R"({"metric": 19972, "payload": "08E807ff"})");
  const auto& line = std::get<PayloadLine>(parsed);
  EXPECT_EQ(line.metric, 19972);
  EXPECT_EQ(line.payload, (Bytes{0x08, 0xE8, 0x07, 0xFF}));
  EXPECT_EQ(std::get<PayloadLine>(parsePayloadLine(R"({"payload":"","metric":-7})")).metric, -7);
}

TEST(PayloadLine, hasAMetricThatIsNoneWhereItsNumberIsTooLarge) {
  const auto parsed = parsePayloadLine(R"({"metric": 9223372036854775808, "payload": ""})");
  EXPECT_EQ(std::get<PayloadLine>(parsed).metric, -1);
}

TEST(PayloadLine, saysWhatIsWrongWithIt) {
  EXPECT_EQ(reasonFor(""), "empty line");
  EXPECT_EQ(reasonFor("{"), "not a JSON object");
  EXPECT_EQ(reasonFor("[]"), "not a JSON object");
  EXPECT_EQ(reasonFor(R"({"metric": 1, "payload": ""} x)"), "not a JSON object");
  EXPECT_EQ(reasonFor(R"({"payload": ""})"), "\"metric\" is not an integer");
  EXPECT_EQ(reasonFor(R"({"metric": "1", "payload": ""})"), "\"metric\" is not an integer");
  EXPECT_EQ(reasonFor(R"({"metric": 1})"), "\"payload\" is not a string");
  EXPECT_EQ(reasonFor(R"({"metric": 1, "payload": 5})"), "\"payload\" is not a string");
  EXPECT_EQ(reasonFor(R"({"metric": 1, "payload": "0"})"), "\"payload\" is not hexadecimal bytes");
  EXPECT_EQ(reasonFor(R"({"metric": 1, "payload": "0g"})"), "\"payload\" is not hexadecimal bytes");
}

}  // namespace
}  // namespace qel
