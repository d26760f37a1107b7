#include "base/Rendering.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <limits>

#include "base/LineBuffer.h"

namespace qel {
namespace {

TEST(JsonText, writesFloatsShortAndAlwaysWithAPoint) {
  EXPECT_EQ(jsonText(Value(-14.5F)), "-14.5");
  EXPECT_EQ(jsonText(Value(20.0F)), "20.0");
  EXPECT_EQ(jsonText(Value(1.4F)), "1.4");
  EXPECT_EQ(jsonText(Value(0.0F)), "0.0");
  EXPECT_EQ(jsonText(Value(-0.0F)), "-0.0");
  EXPECT_EQ(jsonText(Value(16777216.0F)), "16777216.0");
}

TEST(JsonText, writesEveryFloatSoThatItReadsBack) {
  for (const float value : {std::numeric_limits<float>::max(), std::numeric_limits<float>::min(),
                            std::numeric_limits<float>::denorm_min(), 0.1F, 1.0F / 3, 123456.79F}) {
    const std::string text = jsonText(Value(value));
    EXPECT_NE(text.find('.'), std::string::npos) << text;
    EXPECT_EQ(text.find('e'), std::string::npos) << text;
    EXPECT_EQ(std::strtof(text.c_str(), nullptr), value) << text;
  }
}

TEST(JsonText, hasNoNumberForAFloatThatIsNone) {
  EXPECT_EQ(jsonText(Value(std::numeric_limits<float>::infinity())), "null");
  EXPECT_EQ(jsonText(Value(std::numeric_limits<float>::quiet_NaN())), "null");
}

TEST(JsonText, writesIntegersWhole) {
  EXPECT_EQ(jsonText(Value(std::numeric_limits<std::uint64_t>::max())), "18446744073709551615");
  EXPECT_EQ(jsonText(Value(std::numeric_limits<std::int64_t>::min())), "-9223372036854775808");
}

TEST(JsonText, writesContainersOnOneLineInOrder) {
  const Dictionary dictionary{
      {"tac", 1}, {"lac", List{1, 3, 7}}, {"on", true}, {"b", Bytes{10}}, {"none", Value()}};
  EXPECT_EQ(jsonText(dictionary),
            R"({"tac": 1, "lac": [1, 3, 7], "on": true, "b": "<0a>", "none": null})");
  EXPECT_EQ(jsonText(Dictionary()), "{}");
  EXPECT_EQ(jsonText(Value(List())), "[]");
}

TEST(JsonText, escapesWhatJsonCannotHold) {
  EXPECT_EQ(jsonText(Value("a\"b\\c\n\r\t\b\f")), R"("a\"b\\c\n\r\t\b\f")");
  EXPECT_EQ(jsonText(Value(std::string("\0\x1F\x7F", 3))), "\"\\u0000\\u001f\x7F\"");
  EXPECT_EQ(jsonText(Value("é€😀")), "\"é€😀\"");
}

TEST(JsonText, escapesAtTheEndOfTextsOfAnyLength) {
  for (std::size_t length = 1; length < 40; ++length) {
    const std::string text(length, 'x');
    EXPECT_EQ(jsonText(Value(text + '"')), '"' + text + "\\\"\"");
    EXPECT_EQ(jsonText(Value('\n' + text)), "\"\\n" + text + '"');
  }
}

TEST(JsonText, escapesWhereverItStands) {
  for (std::size_t place = 0; place < 20; ++place) {
    std::string text(20, 'x');
    text[place] = '"';
    EXPECT_EQ(jsonText(Value(text)),
              '"' + text.substr(0, place) + "\\\"" + text.substr(place + 1) + '"');
    text[place] = '\x7F';
    EXPECT_EQ(jsonText(Value(text)), '"' + text + '"');
  }
}

TEST(JsonText, writesIntegersOfEveryLength) {
  std::uint64_t number = 1;
  for (int digits = 1; digits < 20; ++digits, number *= 10) {
    for (const std::uint64_t value : {number - 1, number, number + 1, 9 * number}) {
      EXPECT_EQ(jsonText(Value(value)), std::to_string(value));
      const auto negative = -static_cast<std::int64_t>(number);
      EXPECT_EQ(jsonText(Value(negative)), std::to_string(negative));
    }
  }
}

TEST(JsonText, writesEveryShortInteger) {
  for (std::int64_t value = -1100; value < 110000; ++value) {
    ASSERT_EQ(jsonText(Value(value)), std::to_string(value));
  }
}

TEST(JsonText, isTheSameInALineThatIsUsedAgain) {
  LineBuffer line;
  for (const std::size_t length : {3U, 5000U, 0U, 700U}) {
    const Dictionary dictionary = {{"text", std::string(length, 'z')}, {"number", 7}};
    line.clear();
    line.append("before ");
    appendJson(line, dictionary);
    EXPECT_EQ(line.view(), "before " + jsonText(dictionary));
  }
}

TEST(JsonText, findsRoomForLongTextsAndManyElements) {
  const std::string text(100000, 'y');
  Dictionary dictionary;
  dictionary.append(Text(text), text);
  dictionary.append("list", List(3000, Value(std::numeric_limits<std::int64_t>::min())));
  const std::string rendered = jsonText(dictionary);
  EXPECT_TRUE(rendered.starts_with("{\"" + text + "\": \"" + text + "\", \"list\": [-92233"));
  const std::string_view marks = R"({"": "", "list": []})";
  EXPECT_EQ(rendered.size(), marks.size() + 2 * text.size() + 3000 * 20 + 2999 * 2);
  std::string line = "before ";
  appendJson(line, Dictionary{{"a", 1}});
  EXPECT_EQ(line, "before {\"a\": 1}");
}

TEST(JsonText, replacesBytesThatAreNotUtf8) {
  EXPECT_EQ(jsonText(Value("a\xFFz")), "\"a\xEF\xBF\xBDz\"");
}

TEST(CellText, showsTextAsItStands) {
  EXPECT_EQ(cellText(Value("say \"hi\"")), "say \"hi\"");
  EXPECT_EQ(cellText(Value("")), "");
}

TEST(CellText, showsBooleansAsNumbersAndBytesBare) {
  EXPECT_EQ(cellText(Value(true)), "1");
  EXPECT_EQ(cellText(Value(false)), "0");
  EXPECT_EQ(cellText(Value(Bytes{0x0A, 0x1B, 0x2C})), "<0a1b2c>");
}

TEST(CellText, showsNumbersAndContainersAsJson) {
  EXPECT_EQ(cellText(Value(-86)), "-86");
  EXPECT_EQ(cellText(Value(20.0F)), "20.0");
  EXPECT_EQ(cellText(Value(List{true, "x"})), R"([true, "x"])");
  EXPECT_EQ(cellText(Value(Dictionary{{"tac", 1}})), R"({"tac": 1})");
}

}  // namespace
}  // namespace qel
