#include "rrc/reader/BitReader.h"

#include <gtest/gtest.h>

#include "rrc/BitWriter.h"

namespace qel::rrc {
namespace {

using testing::BitWriter;

TEST(BitReader, takesBitsAcrossBytes) {
  const Bytes bytes = {0b10110011, 0b01010101, 0b11110000};
  BitReader reader(bytes);
  EXPECT_TRUE(reader.flag());
  EXPECT_EQ(reader.bits(3), 0b011U);
  EXPECT_EQ(reader.bits(10), 0b0011010101U);
  EXPECT_EQ(reader.position(), 14U);
  EXPECT_EQ(reader.left(), 10U);
  EXPECT_EQ(reader.bits(10), 0b0111110000U);
  EXPECT_FALSE(reader.failed());
}

TEST(BitReader, takesSixtyFourBitsAtAnyPlace) {
  const Bytes bytes(9, 0xFF);
  for (unsigned before = 0; before <= 8; ++before) {
    BitReader reader(bytes);
    reader.bits(before);
    EXPECT_EQ(reader.bits(64), UINT64_MAX);
    EXPECT_FALSE(reader.failed());
  }
}

TEST(BitReader, failsPastTheEndAndStaysSo) {
  const Bytes bytes = {0xFF};
  BitReader reader(bytes);
  EXPECT_EQ(reader.bits(9), 0U);
  EXPECT_TRUE(reader.failed());
  EXPECT_EQ(reader.bits(1), 0U);
}

TEST(BitReader, readsNothingOfNothing) {
  BitReader reader({});
  EXPECT_EQ(reader.bits(0), 0U);
  EXPECT_FALSE(reader.failed());
  EXPECT_FALSE(reader.flag());
  EXPECT_TRUE(reader.failed());
}

TEST(BitReader, takesAsFewBitsAsARangeNeeds) {
  const struct {
    std::int64_t low, high;
    std::size_t bits;
  } ranges[] = {{5, 5, 0},           {0, 1, 1},           {-70, -22, 6},      {0, 255, 8},
                {1, 256, 8},         {0, 256, 9},         {0, 262143, 18},    {-1, 6, 3},
                {0, 4294967295, 32}, {65536, 262143, 18}, {INT32_MIN, -1, 31}};
  for (const auto& range : ranges) {
    for (const std::int64_t value : {range.low, range.high, (range.low + range.high) / 2}) {
      const Bytes bytes = BitWriter().number(value, range.low, range.high).bytes();
      BitReader reader(bytes);
      EXPECT_EQ(reader.integer(range.low, range.high), value);
      EXPECT_EQ(reader.position(), range.bits);
      EXPECT_FALSE(reader.failed());
    }
  }
}

TEST(BitReader, refusesANumberBeyondItsRange) {
  const Bytes bytes = BitWriter().bits(49, 6).bytes();  // -70 + 49 = -21
  BitReader reader(bytes);
  reader.integer(-70, -22);
  EXPECT_TRUE(reader.failed());
}

TEST(BitReader, readsLengthsOfBothForms) {
  for (const std::size_t length : {0U, 1U, 127U, 128U, 129U, 16383U}) {
    const Bytes bytes = BitWriter().length(length).bytes();
    BitReader reader(bytes);
    EXPECT_EQ(reader.length(), length);
    EXPECT_EQ(reader.left(), 0U);
    EXPECT_FALSE(reader.failed());
  }
}

TEST(BitReader, refusesLengthsThatComeInFragments) {
  for (const std::uint8_t first : Bytes{0xC0, 0xC1, 0xC4, 0xFF}) {
    const Bytes bytes = {first, 0, 0, 0};
    BitReader reader(bytes);
    EXPECT_EQ(reader.length(), 0U);
    EXPECT_TRUE(reader.failed());
  }
}

TEST(BitReader, readsSmallAndGreaterNumbers) {
  for (const std::size_t number : {0U, 1U, 63U, 64U, 200U}) {
    const Bytes bytes = BitWriter().smallNumber(number).bytes();
    BitReader reader(bytes);
    EXPECT_EQ(reader.smallNumber(), number);
    EXPECT_FALSE(reader.failed());
  }
}

TEST(BitReader, refusesANumberOfMoreThanEightBytesOrNone) {
  for (const std::size_t size : {0U, 9U}) {
    const Bytes bytes = BitWriter().bits(1, 1).length(size).bits(0, 64).bits(0, 64).bytes();
    BitReader reader(bytes);
    EXPECT_EQ(reader.smallNumber(), 0U);
    EXPECT_TRUE(reader.failed());
  }
}

TEST(BitReader, readsHowManyAdditionsFollow) {
  const Bytes few = BitWriter().bits(0, 1).bits(62, 6).bytes();
  BitReader reader(few);
  EXPECT_EQ(reader.smallLength(), 63U);
  const Bytes many = BitWriter().bits(1, 1).length(70).bytes();
  BitReader further(many);
  EXPECT_EQ(further.smallLength(), 70U);
  const Bytes none = BitWriter().bits(1, 1).length(0).bytes();
  BitReader empty(none);
  empty.smallLength();
  EXPECT_TRUE(empty.failed());
}

TEST(BitReader, givesAPartThatEndsWhereItEnds) {
  const Bytes bytes = {0xAB, 0xCD, 0xEF};
  BitReader reader(bytes);
  reader.bits(4);
  BitReader part = reader.part(8);
  EXPECT_EQ(part.position(), 4U);
  EXPECT_EQ(part.bits(8), 0xBCU);
  EXPECT_EQ(part.bits(1), 0U);
  EXPECT_TRUE(part.failed());
  EXPECT_EQ(reader.bits(12), 0xDEFU);
  EXPECT_FALSE(reader.failed());
}

TEST(BitReader, givesNoPartThatIsLongerThanItself) {
  const Bytes bytes = {0xAB};
  BitReader reader(bytes);
  EXPECT_TRUE(reader.part(9).failed());
  EXPECT_TRUE(reader.failed());
}

}  // namespace
}  // namespace qel::rrc
