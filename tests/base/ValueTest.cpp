#include "base/Value.h"

#include <gtest/gtest.h>

#include <limits>

namespace qel {
namespace {

constexpr std::uint64_t kLargest = std::numeric_limits<std::uint64_t>::max();
constexpr std::int64_t kSmallest = std::numeric_limits<std::int64_t>::min();

TEST(Value, countsAnyIntegralNumberAsAnInteger) {
  EXPECT_EQ(Value(-5).asInt64(), -5);
  EXPECT_EQ(Value(5U).asInt64(), 5);
  EXPECT_EQ(Value(20.0F).asInt64(), 20);
  EXPECT_EQ(Value(kSmallest).asInt64(), kSmallest);
  EXPECT_EQ(Value(kLargest).asInt64(), std::nullopt);
  EXPECT_EQ(Value(kLargest).asUInt64(), kLargest);
  EXPECT_EQ(Value(-1).asUInt64(), std::nullopt);
  EXPECT_EQ(Value(0x1p63F).asInt64(), std::nullopt);
  EXPECT_EQ(Value(-0x1p63F).asInt64(), kSmallest);
}

TEST(Value, countsNoOtherKindAsAnInteger) {
  EXPECT_EQ(Value(true).asInt64(), std::nullopt);
  EXPECT_EQ(Value("5").asInt64(), std::nullopt);
  EXPECT_EQ(Value(0.5F).asInt64(), std::nullopt);
  EXPECT_EQ(Value().asInt64(), std::nullopt);
}

TEST(Value, narrowsToThirtyTwoBitsOnlyWhatFits) {
  EXPECT_EQ(Value(2147483647U).asInt32(), 2147483647);
  EXPECT_EQ(Value(2147483648U).asInt32(), std::nullopt);
  EXPECT_EQ(Value(std::int64_t{-2147483648}).asInt32(), std::numeric_limits<std::int32_t>::min());
  EXPECT_EQ(Value(std::int64_t{-2147483649}).asInt32(), std::nullopt);
}

TEST(Value, countsAnyNumberExactInSinglePrecisionAsAFloat) {
  EXPECT_EQ(Value(20U).asFloat(), 20.0F);
  EXPECT_EQ(Value(-1050).asFloat(), -1050.0F);
  EXPECT_EQ(Value(16777216U).asFloat(), 16777216.0F);
  EXPECT_EQ(Value(16777217U).asFloat(), std::nullopt);
  EXPECT_EQ(Value(kSmallest).asFloat(), -0x1p63F);
  EXPECT_EQ(Value(std::numeric_limits<std::int64_t>::max()).asFloat(), std::nullopt);
  EXPECT_EQ(Value(kLargest).asFloat(), std::nullopt);
  EXPECT_EQ(Value(false).asFloat(), std::nullopt);
}

TEST(Value, keepsTheFullRangeOfNumbersAsDouble) {
  EXPECT_EQ(Value(kLargest).asDouble(), 0x1p64);
  EXPECT_EQ(Value("1").asDouble(), std::nullopt);
  EXPECT_EQ(Value(true).asDouble(), std::nullopt);
}

TEST(Value, isEqualByKindAndContent) {
  EXPECT_EQ(Value(5), Value(5U));
  EXPECT_NE(Value(-1), Value(kLargest));
  EXPECT_NE(Value(1), Value(true));
  EXPECT_NE(Value(1), Value(1.0F));
  EXPECT_EQ(Value(List{1, "a"}), Value(List{1, "a"}));
  EXPECT_NE(Value(Bytes{1}), Value(Bytes{2}));
  EXPECT_EQ(Value(), Value());
}

TEST(Value, copiesAllTheWayDown) {
  Dictionary inner{{"a", 1}};
  const Value original(List{inner});
  Value copy = original;
  copy = *copy.asList()->front().asDictionary()->find("a");
  EXPECT_EQ(copy, Value(1));
  EXPECT_EQ(original.asList()->front(), Value(inner));
}

TEST(Value, canTakeTheValueOfItsOwnElement) {
  Value value(List{Value(List{"deep"})});
  value = Value(value.asList()->front());
  EXPECT_EQ(value, Value(List{"deep"}));
}

TEST(Text, borrowsOnlyWhatItIsToldTo) {
  EXPECT_TRUE(Text(Name("key")).isName());
  EXPECT_TRUE(Text(Text(Name("key"))).isName());
  const Text owned(std::string(100, 'x'));
  const Text copy = owned;
  EXPECT_FALSE(copy.isName());
  EXPECT_EQ(copy.view(), std::string(100, 'x'));
}

TEST(Dictionary, keepsTheOrderInWhichKeysCame) {
  Dictionary dictionary{{"b", 1}, {"a", 2}};
  dictionary.set("c", 3);
  dictionary.set("b", 4);
  ASSERT_EQ(dictionary.size(), 3U);
  EXPECT_EQ(dictionary.at(0).key.view(), "b");
  EXPECT_EQ(dictionary.at(0).value, Value(4));
  EXPECT_EQ(dictionary.at(2).key.view(), "c");
}

TEST(Dictionary, isEqualWhateverTheOrder) {
  EXPECT_EQ((Dictionary{{"a", 1}, {"b", 2}}), (Dictionary{{"b", 2}, {"a", 1}}));
  EXPECT_NE((Dictionary{{"a", 1}}), (Dictionary{{"a", 1}, {"b", 2}}));
  EXPECT_NE((Dictionary{{"a", 1}}), (Dictionary{{"a", 2}}));
}

TEST(Dictionary, assignsAnAbsentValueByRemovingTheKey) {
  Dictionary dictionary{{"a", 1}, {"b", 2}};
  dictionary.assign("a", nullptr);
  EXPECT_FALSE(dictionary.contains("a"));
  const Value value(7);
  dictionary.assign("c", &value);
  EXPECT_EQ(*dictionary.find("c"), value);
}

TEST(DictionaryDeathTest, endsTheProgramOnAPositionOutside) {
  const Dictionary dictionary{{"a", 1}};
  EXPECT_DEATH(dictionary.at(1), "fatal error: entry 1 of a record with 1 entries");
}

}  // namespace
}  // namespace qel
