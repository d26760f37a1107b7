// Data, strings, marks and skipping.
#include "messages/runtime/PBDataReader.h"

#include <gtest/gtest.h>

#include <limits>

#include "Wire.h"
#include "messages/lte_rrc.h"

namespace qel {
namespace {

using testing::ExactBuffer;
using testing::hex;
using testing::joined;
using testing::tag;
using testing::varint;
using testing::WireType;

constexpr auto kMax64 = std::numeric_limits<std::uint64_t>::max();

TEST(ReadData, takesAsManyBytesAsTheLengthSays) {
  for (const std::size_t size : {0U, 1U, 127U, 128U, 300U}) {
    SCOPED_TRACE(size);
    const Bytes content(size, 0xA5);
    const ExactBuffer input(joined(varint(size), content));
    PBDataReader reader(input.view());
    EXPECT_EQ(PBReaderReadData(reader), content);
    EXPECT_EQ(reader._pos, input.view().size());
    EXPECT_FALSE(reader._error);
  }
}

TEST(ReadData, givesNothingAndSetsTheErrorFlagAtEveryCut) {
  const Bytes whole = joined(varint(200), Bytes(200, 0xA5));
  for (std::size_t length = 0; length < whole.size(); ++length) {
    SCOPED_TRACE(length);
    const ExactBuffer input(ByteView(whole).first(length));
    PBDataReader reader(input.view());
    EXPECT_EQ(PBReaderReadData(reader), std::nullopt);
    EXPECT_TRUE(reader._error);
  }
}

TEST(ReadData, refusesLengthsThatWrapRoundTheAddressSpace) {
  for (const std::uint64_t length : {kMax64, kMax64 - 1, kMax64 - 10, std::uint64_t{1} << 63}) {
    SCOPED_TRACE(length);
    const ExactBuffer input(joined(varint(length), Bytes(20, 0)));
    PBDataReader reader(input.view());
    EXPECT_EQ(PBReaderReadData(reader), std::nullopt);
    EXPECT_TRUE(reader._error);
  }
}

TEST(ReadData, takesALengthOfTenUnendedBytesForZero) {
  const ExactBuffer input(Bytes(12, 0xFF));
  PBDataReader reader(input.view());
  EXPECT_EQ(PBReaderReadData(reader), Bytes());
  EXPECT_EQ(reader._pos, 10U);
}

TEST(ReadData, stopsAtTheMark) {
  const ExactBuffer input(hex("03026162"));  // three bytes of which the data are two
  PBDataReader reader(input.view());
  PBReaderMark mark;
  ASSERT_TRUE(PBReaderPlaceMark(reader, mark));
  EXPECT_EQ(PBReaderReadData(reader), hex("6162"));

  const ExactBuffer short_(hex("02026162"));  // two bytes of which the data would be two
  PBDataReader narrow(short_.view());
  ASSERT_TRUE(PBReaderPlaceMark(narrow, mark));
  EXPECT_EQ(PBReaderReadData(narrow), std::nullopt);
  EXPECT_TRUE(narrow._error);
}

TEST(ReadString, keepsEveryByteAsItCame) {
  const ExactBuffer input(hex("0661c3a400ff62"));
  PBDataReader reader(input.view());
  EXPECT_EQ(PBReaderReadString(reader), std::string("a\xC3\xA4\0\xFF"
                                                    "b",
                                                    6));
}

TEST(ReadString, givesNothingAndSetsTheErrorFlagAtEveryCut) {
  const Bytes whole = hex("05696e666f73");
  for (std::size_t length = 0; length < whole.size(); ++length) {
    SCOPED_TRACE(length);
    const ExactBuffer input(ByteView(whole).first(length));
    PBDataReader reader(input.view());
    EXPECT_EQ(PBReaderReadString(reader), std::nullopt);
    EXPECT_TRUE(reader._error);
  }
}

TEST(Mark, narrowsTheReaderAndWidensItAgain) {
  const ExactBuffer input(hex("02aabbcc"));
  PBDataReader reader(input.view());
  PBReaderMark mark;
  ASSERT_TRUE(PBReaderPlaceMark(reader, mark));
  EXPECT_EQ(reader._pos, 1U);
  EXPECT_EQ(reader._length, 3U);
  PBReaderRecallMark(reader, mark);
  EXPECT_EQ(reader._length, 4U);
  EXPECT_EQ(reader._pos, 1U) << "recalling a mark moves the end only";
}

TEST(Mark, mayBeEmptyAndMayReachTheEnd) {
  PBReaderMark mark;
  const ExactBuffer empty(hex("00"));
  PBDataReader nothing(empty.view());
  ASSERT_TRUE(PBReaderPlaceMark(nothing, mark));
  EXPECT_EQ(nothing._length, nothing._pos);

  const ExactBuffer full(hex("02aabb"));
  PBDataReader all(full.view());
  ASSERT_TRUE(PBReaderPlaceMark(all, mark));
  EXPECT_EQ(all._length, 3U);
}

TEST(Mark, failsPastTheEndAndLeavesTheEndAlone) {
  const std::vector<std::uint64_t> lengths = {
      6,           127,        128,   0xFFFF'FFFF, std::uint64_t{1} << 32, std::uint64_t{1} << 63,
      kMax64 - 10, kMax64 - 1, kMax64};
  for (const std::uint64_t length : lengths) {
    SCOPED_TRACE(length);
    const ExactBuffer input(joined(varint(length), Bytes(5, 0)));
    PBDataReader reader(input.view());
    PBReaderMark mark;
    EXPECT_FALSE(PBReaderPlaceMark(reader, mark));
    EXPECT_EQ(reader._length, input.view().size());
  }
}

TEST(Mark, nestsOnlyWithinTheOuterMark) {
  const ExactBuffer input(hex("0203aabbcc"));  // the inner length is right, but for the outer one
  PBDataReader reader(input.view());
  PBReaderMark outer;
  PBReaderMark inner;
  ASSERT_TRUE(PBReaderPlaceMark(reader, outer));
  EXPECT_FALSE(PBReaderPlaceMark(reader, inner));
}

struct Skippable {
  const char* name;
  WireType type;
  Bytes value;
};

std::vector<Skippable> skippables() {
  return {{"varint of one byte", WireType::varint, varint(0)},
          {"varint of ten bytes", WireType::varint, varint(kMax64)},
          {"eight bytes", WireType::fixed64, Bytes(8, 0xFF)},
          {"nothing delimited", WireType::delimited, varint(0)},
          {"delimited", WireType::delimited, joined(varint(130), Bytes(130, 0xFF))},
          {"four bytes", WireType::fixed32, Bytes(4, 0xFF)},
          {"empty group", WireType::groupStart, tag(7, WireType::groupEnd)},
          {"full group", WireType::groupStart,
           joined(testing::varintField(1, kMax64), tag(2, WireType::fixed64), Bytes(8, 0xFF),
                  testing::delimitedField(3, Bytes(3, 0xFF)), tag(4, WireType::fixed32),
                  Bytes(4, 0xFF), tag(5, WireType::groupStart), tag(5, WireType::groupEnd),
                  tag(7, WireType::groupEnd))}};
}

TEST(SkipValue, takesExactlyTheValueOfEveryWireType) {
  for (const Skippable& skippable : skippables()) {
    SCOPED_TRACE(skippable.name);
    const ExactBuffer input(joined(skippable.value, Bytes{0x55}));
    PBDataReader reader(input.view());
    EXPECT_TRUE(PBReaderSkipValueWithTag(reader, 7, static_cast<std::uint8_t>(skippable.type)));
    EXPECT_EQ(reader._pos, skippable.value.size());
    EXPECT_FALSE(reader._error);
  }
}

TEST(SkipValue, failsAtEveryCutOfEveryWireType) {
  for (const Skippable& skippable : skippables()) {
    for (std::size_t length = 0; length < skippable.value.size(); ++length) {
      SCOPED_TRACE(skippable.name + std::string(" cut to ") + std::to_string(length));
      const ExactBuffer input(ByteView(skippable.value).first(length));
      PBDataReader reader(input.view());
      EXPECT_FALSE(PBReaderSkipValueWithTag(reader, 7, static_cast<std::uint8_t>(skippable.type)));
    }
  }
}

TEST(SkipValue, failsOnWireTypesThatDoNotExistAndOnALooseEndOfGroup) {
  for (const std::uint8_t type : Bytes{4, 6, 7}) {
    const ExactBuffer input(Bytes(16, 0));
    PBDataReader reader(input.view());
    EXPECT_FALSE(PBReaderSkipValueWithTag(reader, 7, type)) << int{type};
  }
}

TEST(SkipValue, takesAnUnendedVarintForTenBytes) {
  const ExactBuffer input(Bytes(11, 0xFF));
  PBDataReader reader(input.view());
  EXPECT_TRUE(PBReaderSkipValueWithTag(reader, 7, 0));
  EXPECT_EQ(reader._pos, 10U);
}

TEST(SkipValue, refusesDelimitedLengthsNear64Bits) {
  const ExactBuffer input(joined(varint(kMax64), Bytes(8, 0)));
  PBDataReader reader(input.view());
  EXPECT_FALSE(PBReaderSkipValueWithTag(reader, 7, 2));
}

constexpr std::uint64_t kFar = ~std::uint64_t{0};

// Went on reading behind the input.
TEST(PBDataReader, aMarkThatCouldNotBePlacedIsRecalledWithoutHarm) {
  const ExactBuffer input(hex("0801057f"));
  PBDataReader reader(input.view());
  reader._pos = 2;
  PBReaderMark mark;
  EXPECT_FALSE(PBReaderPlaceMark(reader, mark));
  PBReaderRecallMark(reader, mark);
  EXPECT_EQ(reader._length, 4U);
  EXPECT_EQ(PBReaderReadVarint(reader), 0x7FU);
  EXPECT_EQ(PBReaderReadVarint(reader), 0U);
  EXPECT_TRUE(reader._error);
}

// A position behind the length counted as nearly endless room.
TEST(PBDataReader, readsNothingWhereThePositionIsBehindTheLength) {
  const ExactBuffer input(hex("01610801"));
  for (const std::uint64_t position :
       {std::uint64_t{3}, std::uint64_t{4}, std::uint64_t{5}, kFar}) {
    for (const std::uint64_t length : {std::uint64_t{0}, std::uint64_t{2}, std::uint64_t{3}}) {
      const auto reader = [&] {
        PBDataReader made(input.view());
        made._pos = position;
        made._length = length;
        return made;
      };
      auto varint = reader();
      EXPECT_EQ(PBReaderReadVarint(varint), 0U);
      EXPECT_TRUE(varint._error);
      auto data = reader();
      EXPECT_FALSE(PBReaderReadData(data));
      auto text = reader();
      EXPECT_FALSE(PBReaderReadString(text));
      for (const std::uint8_t wireType : std::initializer_list<std::uint8_t>{0, 1, 2, 3, 5}) {
        auto skipped = reader();
        EXPECT_FALSE(PBReaderSkipValueWithTag(skipped, 1, wireType));
      }
    }
  }
}

// Every primitive in every state that the members can be put in: what it reads is in the input.
TEST(PBDataReader, readsNothingOutsideTheInputInAnyState) {
  const ExactBuffer input(hex("0203616263ff010b0802030c"));
  const std::uint64_t size = input.view().size();
  const std::uint64_t places[] = {0,        1,        2,        size - 1, size,
                                  size + 1, size + 9, kFar / 2, kFar - 1, kFar};
  for (const std::uint64_t position : places) {
    for (const std::uint64_t length : places) {
      for (const bool error : {false, true}) {
        const auto inState = [&](const auto& work) {
          PBDataReader reader(input.view());
          reader._pos = position;
          reader._length = length;
          reader._error = error;
          EXPECT_LE(reader.left().size(), size);
          work(reader);
          EXPECT_LE(reader.left().size(), size);
          EXPECT_TRUE(reader._error || !error) << "once set, it stays set";
        };
        inState([](PBDataReader& reader) { PBReaderReadVarint(reader); });
        inState([&](PBDataReader& reader) {
          const auto data = PBReaderReadData(reader);
          EXPECT_TRUE(!data || data->size() < size);
        });
        inState([&](PBDataReader& reader) {
          PBReaderMark mark;
          PBReaderPlaceMark(reader, mark);
          PBReaderReadVarint(reader);
          PBReaderRecallMark(reader, mark);
          PBReaderReadString(reader);
        });
        inState([&](PBDataReader& reader) { PBReaderRecallMark(reader, {length}); });
        for (std::uint8_t wireType = 0; wireType < 8; ++wireType) {
          inState([&](PBDataReader& reader) { PBReaderSkipValueWithTag(reader, 1, wireType); });
        }
        inState([](PBDataReader& reader) { KCellularLteRrcState().readFrom(reader); });
      }
    }
  }
}

}  // namespace
}  // namespace qel
