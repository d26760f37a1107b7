#include "rrc/reader/Walker.h"

#include <gtest/gtest.h>

#include "rrc/BitWriter.h"
#include "rrc/SchemaFiles.h"

namespace qel::rrc {
namespace {

using generator::Tables;
using testing::BitWriter;
using testing::tablesOf;

// A schema of one message A, whose marks are found by name.
class Sample {
 public:
  explicit Sample(std::string_view notation)
      : _tables(tablesOf(notation)), _schema(_tables.schema()) {}

  std::optional<Reading> read(const BitWriter& bits) {
    _message = bits.bytes();
    return readBytes(_message);
  }
  std::optional<Reading> readBytes(ByteView bytes) {
    return walk(_schema, _tables.message("A"), bytes);
  }
  Mark operator[](const std::string& name) const {
    const auto& names = _tables.markNames;
    const auto place = std::find(names.begin(), names.end(), name) - names.begin();
    return static_cast<Mark>(static_cast<std::size_t>(Mark::first) +
                             static_cast<std::size_t>(place));
  }

 private:
  Tables _tables;
  Schema _schema;
  Bytes _message;
};

std::vector<std::int64_t> elementsOf(const Node& list) {
  std::vector<std::int64_t> elements;
  list.each([&](const Node& element) { elements.push_back(element.number().value_or(-999)); });
  return elements;
}

TEST(Walker, readsNumbersInAsFewBitsAsTheirRange) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  !level INT -70..-22\n"
      "  !same INT 7..7\n"
      "  !yes BOOL\n"
      "  !nothing NULL\n"
      "  !wide INT 0..262143\n");
  const auto reading =
      sample.read(BitWriter().number(-64, -70, -22).flag(true).number(200000, 0, 262143));
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->top()[sample["level"]].number(), -64);
  EXPECT_EQ(reading->top()[sample["same"]].number(), 7);
  EXPECT_EQ(reading->top()[sample["yes"]].number(), 1);
  EXPECT_TRUE(reading->top()[sample["nothing"]]);
  EXPECT_EQ(reading->top()[sample["nothing"]].number(), std::nullopt);
  EXPECT_EQ(reading->top()[sample["wide"]].number(), 200000);
}

TEST(Walker, refusesANumberBeyondItsRange) {
  Sample sample("message A = SEQUENCE\n  !level INT 0..4\n");
  EXPECT_TRUE(sample.read(BitWriter().bits(4, 3)));
  EXPECT_FALSE(sample.read(BitWriter().bits(5, 3)));
}

TEST(Walker, readsOnlyTheFieldsWhoseBitIsSet) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  !one? INT 0..7\n"
      "  !two INT 0..7\n"
      "  !three? INT 0..7\n");
  const auto reading = sample.read(BitWriter().bits(0b01, 2).bits(5, 3).bits(6, 3));
  ASSERT_TRUE(reading);
  EXPECT_FALSE(reading->top()[sample["one"]]);
  EXPECT_EQ(reading->top()[sample["two"]].number(), 5);
  EXPECT_EQ(reading->top()[sample["three"]].number(), 6);
}

TEST(Walker, givesNumbersForEnumeratedValues) {
  Sample sample("message A = SEQUENCE\n  !blocks ENUM 5: 6 15 - 50\n");
  const std::pair<unsigned, std::optional<std::int64_t>> values[] = {
      {0, 6}, {1, 15}, {2, std::nullopt}, {3, 50}, {4, std::nullopt}};
  for (const auto& [place, number] : values) {
    const auto reading = sample.read(BitWriter().bits(place, 3));
    ASSERT_TRUE(reading);
    EXPECT_EQ(reading->top()[sample["blocks"]].number(), number);
    EXPECT_EQ(reading->top()[sample["blocks"]].index(), place);
  }
  EXPECT_FALSE(sample.read(BitWriter().bits(5, 3)));
}

TEST(Walker, givesThePlaceOfAnEnumeratedValueThatIsNewer) {
  Sample sample("message A = SEQUENCE\n  !kind ENUM 3: 1 2 3 ...\n  !next INT 0..255\n");
  const auto known = sample.read(BitWriter().flag(false).bits(2, 2).bits(9, 8));
  ASSERT_TRUE(known);
  EXPECT_EQ(known->top()[sample["kind"]].number(), 3);
  const auto newer = sample.read(BitWriter().flag(true).smallNumber(1).bits(9, 8));
  ASSERT_TRUE(newer);
  EXPECT_EQ(newer->top()[sample["kind"]].index(), 4);
  EXPECT_EQ(newer->top()[sample["kind"]].number(), std::nullopt);
  EXPECT_EQ(newer->top()[sample["next"]].number(), 9);
}

TEST(Walker, readsStringsOfBits) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  !fixed BITS 28\n"
      "  !ranged BITS 1..8\n"
      "  !free BITS\n"
      "  !long BITS 100\n"
      "  !end INT 0..255\n");
  const auto reading = sample.read(BitWriter()
                                       .bits(0x1234567, 28)
                                       .number(3, 1, 8)
                                       .bits(0b101, 3)
                                       .length(10)
                                       .bits(0x2AA, 10)
                                       .bits(0, 50)
                                       .bits(0, 50)
                                       .bits(77, 8));
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->top()[sample["fixed"]].number(), 0x1234567);
  EXPECT_EQ(reading->top()[sample["ranged"]].number(), 0b101);
  EXPECT_EQ(reading->top()[sample["free"]].number(), 0x2AA);
  EXPECT_EQ(reading->top()[sample["long"]].number(), std::nullopt);
  EXPECT_EQ(reading->top()[sample["end"]].number(), 77);
}

TEST(Walker, readsStringsOfBytesAtAnyBit) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  !flag BOOL\n"
      "  !fixed OCTETS 2\n"
      "  !ranged OCTETS 1..16\n"
      "  !free OCTETS\n");
  Bytes long300(300, 0x5A);
  const auto reading = sample.read(BitWriter()
                                       .flag(true)
                                       .octets(Bytes{1, 2})
                                       .number(3, 1, 16)
                                       .octets(Bytes{3, 4, 5})
                                       .length(300)
                                       .octets(long300));
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->top()[sample["fixed"]].octets(), (Bytes{1, 2}));
  EXPECT_EQ(reading->top()[sample["ranged"]].octets(), (Bytes{3, 4, 5}));
  EXPECT_EQ(reading->top()[sample["free"]].octets(), long300);
}

TEST(Walker, refusesStringsThatComeInFragmentsOrEndTooEarly) {
  Sample sample("message A = SEQUENCE\n  !free OCTETS\n");
  Bytes fragment(17000);
  fragment[0] = 0xC1;
  EXPECT_FALSE(sample.readBytes(fragment));
  EXPECT_FALSE(sample.readBytes(Bytes{5, 1, 2, 3, 4}));
  EXPECT_TRUE(sample.readBytes(Bytes{5, 1, 2, 3, 4, 5}));
}

TEST(Walker, readsListsAndTheirBounds) {
  Sample sample("message A = SEQUENCE\n  !bands LIST 1..5 OF INT 1..64\n");
  const auto list = [](unsigned count) {
    BitWriter bits;
    bits.bits(count - 1, 3);
    for (unsigned i = 1; i <= count; ++i) bits.number(i, 1, 64);
    return bits;
  };
  const auto reading = sample.read(list(5));
  ASSERT_TRUE(reading);
  EXPECT_EQ(elementsOf(reading->top()[sample["bands"]]),
            (std::vector<std::int64_t>{1, 2, 3, 4, 5}));
  EXPECT_FALSE(sample.read(list(6)));
  EXPECT_FALSE(sample.readBytes(Bytes{0b10000000}));  // five, and none there
}

TEST(Walker, hangsWhatIsMarkedOnTheNearestMarkedField) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  !outer SEQUENCE\n"
      "    unmarked SEQUENCE\n"
      "      !value INT 0..15\n"
      "      other INT 0..15\n"
      "  !value INT 0..15\n"
      "  items LIST 0..3 OF SEQUENCE\n"
      "    !item INT 0..15\n");
  const auto reading =
      sample.read(BitWriter().bits(1, 4).bits(2, 4).bits(3, 4).bits(2, 2).bits(4, 4).bits(5, 4));
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->top()[sample["outer"]][sample["value"]].number(), 1);
  EXPECT_EQ(reading->top()[sample["value"]].number(), 3);
  std::vector<std::int64_t> items;
  reading->top().each([&](const Node& node) {
    if (node.mark() == sample["item"]) items.push_back(*node.number());
  });
  EXPECT_EQ(items, (std::vector<std::int64_t>{4, 5}));
}

TEST(Walker, readsTheChosenAlternative) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  !choice CHOICE\n"
      "    !none NULL\n"
      "    !few INT 0..15\n"
      "    !many INT 0..255\n");
  const auto reading = sample.read(BitWriter().bits(2, 2).bits(200, 8));
  ASSERT_TRUE(reading);
  const Node choice = reading->top()[sample["choice"]];
  EXPECT_EQ(choice.index(), 2);
  EXPECT_EQ(choice.first().mark(), sample["many"]);
  EXPECT_EQ(choice.first().number(), 200);
  EXPECT_FALSE(sample.read(BitWriter().bits(3, 2).bits(200, 8)));
}

TEST(Walker, readsAlternativesThatWereAddedAndPassesOverNewerOnes) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  !choice CHOICE\n"
      "    !old INT 0..3\n"
      "    ...\n"
      "    skip\n"
      "    !added INT 0..255\n"
      "  !next INT 0..255\n");
  const auto with = [](std::size_t place) {
    return BitWriter().flag(true).smallNumber(place).contained(BitWriter().bits(99, 8)).bits(7, 8);
  };
  for (const std::size_t place : {0U, 1U, 2U, 100U}) {
    const auto reading = sample.read(with(place));
    ASSERT_TRUE(reading) << place;
    const Node choice = reading->top()[sample["choice"]];
    EXPECT_EQ(choice.index(), static_cast<std::int64_t>(place) + 1);
    EXPECT_EQ(choice[sample["added"]].number(),
              place == 1 ? std::optional<std::int64_t>(99) : std::nullopt);
    EXPECT_EQ(reading->top()[sample["next"]].number(), 7);
  }
}

constexpr const char* kExtensible =
    "message A = SEQUENCE\n"
    "  !root INT 0..15\n"
    "  ...\n"
    "  skip\n"
    "  !one INT 0..255\n"
    "  group\n"
    "    !two? INT 0..255\n"
    "    !three? INT 0..255\n";

TEST(Walker, readsAdditionsAndGroupsAndPassesOverOthers) {
  Sample sample(kExtensible);
  const BitWriter group = BitWriter().bits(0b01, 2).bits(33, 8);
  const auto reading = sample.read(BitWriter()
                                       .flag(true)
                                       .bits(9, 4)
                                       .smallNumber(4)
                                       .bits(0b11111, 5)
                                       .contained(BitWriter().bits(0xABCDEF, 24))
                                       .contained(BitWriter().bits(11, 8))
                                       .contained(group)
                                       .contained(BitWriter().bits(1, 1))
                                       .contained(BitWriter().bits(0, 40)));
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->top()[sample["root"]].number(), 9);
  EXPECT_EQ(reading->top()[sample["one"]].number(), 11);
  EXPECT_FALSE(reading->top()[sample["two"]]);
  EXPECT_EQ(reading->top()[sample["three"]].number(), 33);
}

TEST(Walker, readsAnAdditionNoFurtherThanItsLength) {
  Sample sample(kExtensible);
  const auto withLength = [](std::size_t length) {
    return BitWriter().flag(true).bits(9, 4).smallNumber(1).bits(0b01, 2).length(length).bits(11,
                                                                                              8);
  };
  EXPECT_TRUE(sample.read(withLength(1)));
  EXPECT_FALSE(sample.read(withLength(0)));
  EXPECT_FALSE(sample.read(withLength(5)));
}

TEST(Walker, readsWhatBytesContainOnItsOwn) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  flag BOOL\n"
      "  !late? OCTETS OF B\n"
      "  !next INT 0..255\n"
      "B = SEQUENCE\n"
      "  !inner INT 0..1023\n");
  const BitWriter inside = BitWriter().bits(1000, 10);
  const auto reading = sample.read(BitWriter().flag(true).flag(true).contained(inside).bits(5, 8));
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->top()[sample["late"]][sample["inner"]].number(), 1000);
  EXPECT_EQ(reading->top()[sample["next"]].number(), 5);
  EXPECT_FALSE(sample.read(BitWriter().bits(0b11, 2).length(1).bits(0, 8).bits(5, 8)));
}

TEST(Walker, stopsForGoodWhereTheSchemaStops) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  !list LIST 1..4 OF CHOICE\n"
      "    !known INT 0..7\n"
      "    !unknown STOP\n"
      "  !behind INT 0..255\n");
  const auto reading = sample.read(BitWriter().bits(3, 2).bits(0, 1).bits(6, 3).bits(1, 1));
  ASSERT_TRUE(reading);
  const Node list = reading->top()[sample["list"]];
  EXPECT_EQ(list.first()[sample["known"]].number(), 6);
  EXPECT_EQ(list.index(), 4);
  EXPECT_FALSE(reading->top()[sample["behind"]]);
}

TEST(Walker, stopsInsideOfAnAdditionForThatOnly) {
  Sample sample(
      "message A = SEQUENCE\n"
      "  inner SEQUENCE\n"
      "    ...\n"
      "    group\n"
      "      !first? INT 0..255\n"
      "      rest? STOP\n"
      "      !never? INT 0..255\n"
      "  !behind INT 0..255\n");
  const BitWriter group = BitWriter().bits(0b111, 3).bits(1, 8).bits(0xFFFF, 16);
  const auto reading =
      sample.read(BitWriter().flag(true).smallNumber(0).flag(true).contained(group).bits(42, 8));
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->top()[sample["first"]].number(), 1);
  EXPECT_FALSE(reading->top()[sample["never"]]);
  EXPECT_EQ(reading->top()[sample["behind"]].number(), 42);
}

TEST(Walker, passesOverWhatStandsBehindTheMessage) {
  Sample sample("message A = SEQUENCE\n  !x INT 0..3\n");
  EXPECT_TRUE(sample.readBytes(Bytes{0xFF, 0xFF, 0xFF}));
  EXPECT_FALSE(sample.readBytes(Bytes{}));
}

TEST(Walker, refusesMessagesThatAreTooLong) {
  Sample sample("message A = SEQUENCE\n  !x INT 0..3\n");
  EXPECT_TRUE(sample.readBytes(Bytes(kLongestMessage)));
  EXPECT_FALSE(sample.readBytes(Bytes(kLongestMessage + 1)));
}

TEST(Walker, refusesMoreFieldsThanItsLimitEvenIfTheyNeedNoBits) {
  const auto nulls = [](const char* count) {
    return "message A = SEQUENCE\n  x LIST " + std::string(count) + " OF LIST 100 OF NULL\n";
  };
  Sample few(nulls("190"));
  EXPECT_TRUE(few.readBytes(Bytes{}));
  Sample many(nulls("60000"));
  EXPECT_FALSE(many.readBytes(Bytes{}));
}

}  // namespace
}  // namespace qel::rrc
