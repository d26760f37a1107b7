// Reading varints: every length, every cut, and what is too long.
#include <gtest/gtest.h>

#include <limits>

#include "Wire.h"
#include "messages/runtime/MessageReader.h"
#include "messages/runtime/PBDataReader.h"

namespace qel {
namespace {

using testing::ExactBuffer;
using testing::varint;

constexpr auto kMax64 = std::numeric_limits<std::uint64_t>::max();

// Zero, one, the largest of every length and the smallest of the next, and the largest of all.
std::vector<std::uint64_t> interestingValues() {
  std::vector<std::uint64_t> values = {0, 1, kMax64};
  for (unsigned bits = 7; bits < 64; bits += 7) {
    values.push_back((std::uint64_t{1} << bits) - 1);
    values.push_back(std::uint64_t{1} << bits);
  }
  return values;
}

TEST(Varint, readsEveryLengthAndStopsBehindIt) {
  for (const std::uint64_t value : interestingValues()) {
    SCOPED_TRACE(value);
    const ExactBuffer input(testing::joined(varint(value), Bytes{0x55}));
    PBDataReader reader(input.view());
    EXPECT_EQ(PBReaderReadVarint(reader), value);
    EXPECT_EQ(reader._pos, varint(value).size());
    EXPECT_FALSE(reader._error);
  }
}

TEST(Varint, isZeroWithTheErrorFlagAtEveryCut) {
  for (const std::uint64_t value : interestingValues()) {
    const Bytes whole = varint(value);
    for (std::size_t length = 0; length < whole.size(); ++length) {
      SCOPED_TRACE(std::to_string(value) + " cut to " + std::to_string(length));
      const ExactBuffer input(ByteView(whole).first(length));
      PBDataReader reader(input.view());
      EXPECT_EQ(PBReaderReadVarint(reader), 0U);
      EXPECT_TRUE(reader._error);
      EXPECT_EQ(reader._pos, length);
    }
  }
}

TEST(Varint, mayHaveMoreBytesThanItNeeds) {
  const ExactBuffer input(testing::hex("818000"));
  PBDataReader reader(input.view());
  EXPECT_EQ(PBReaderReadVarint(reader), 1U);
  EXPECT_EQ(reader._pos, 3U);
}

TEST(Varint, losesWhatTheTenthByteHasBeyond64Bits) {
  const ExactBuffer input(testing::hex("ffffffffffffffffff7f"));
  PBDataReader reader(input.view());
  EXPECT_EQ(PBReaderReadVarint(reader), kMax64);
  EXPECT_FALSE(reader._error);
}

TEST(Varint, ofTenBytesWithoutAnEndIsZeroAndReadingGoesOnBehindThem) {
  for (const std::size_t length : {10U, 11U, 12U}) {
    SCOPED_TRACE(length);
    const ExactBuffer input(Bytes(length, 0xFF));
    PBDataReader reader(input.view());
    EXPECT_EQ(PBReaderReadVarint(reader), 0U);
    EXPECT_EQ(reader._pos, 10U);
    EXPECT_FALSE(reader._error);
  }
}

TEST(Varint, inAMarkedPartEndsAtTheMark) {
  const ExactBuffer input(testing::hex("018001"));
  PBDataReader reader(input.view());
  PBReaderMark mark;
  ASSERT_TRUE(PBReaderPlaceMark(reader, mark));
  EXPECT_EQ(PBReaderReadVarint(reader), 0U);
  EXPECT_TRUE(reader._error);
  EXPECT_EQ(reader._pos, 2U);
}

TEST(DecodedScalar, takesTheLow32BitsOfA32BitField) {
  EXPECT_EQ(decodedScalar<Encoding::uint64>(kMax64), kMax64);
  EXPECT_EQ(decodedScalar<Encoding::uint32>(kMax64), 0xFFFFFFFFU);
  EXPECT_EQ(decodedScalar<Encoding::uint32>(0x1'0000'0005), 5U);
  EXPECT_EQ(decodedScalar<Encoding::int32>(kMax64), -1);
  EXPECT_EQ(decodedScalar<Encoding::int32>(0x1'8000'0000), std::numeric_limits<int>::min());
  EXPECT_EQ(decodedScalar<Encoding::int32>(0x7FFF'FFFF), std::numeric_limits<int>::max());
}

TEST(DecodedScalar, unfoldsZigZagFromTheLow32Bits) {
  EXPECT_EQ(decodedScalar<Encoding::sint32>(0), 0);
  EXPECT_EQ(decodedScalar<Encoding::sint32>(1), -1);
  EXPECT_EQ(decodedScalar<Encoding::sint32>(2), 1);
  EXPECT_EQ(decodedScalar<Encoding::sint32>(0xFFFF'FFFE), std::numeric_limits<int>::max());
  EXPECT_EQ(decodedScalar<Encoding::sint32>(0xFFFF'FFFF), std::numeric_limits<int>::min());
  EXPECT_EQ(decodedScalar<Encoding::sint32>(0x1'0000'0002), 1);
}

TEST(DecodedScalar, isTrueForEveryBitOfA64BitVarint) {
  EXPECT_FALSE(decodedScalar<Encoding::boolean>(0));
  for (unsigned bit = 0; bit < 64; ++bit) {
    EXPECT_TRUE(decodedScalar<Encoding::boolean>(std::uint64_t{1} << bit)) << "bit " << bit;
  }
}

}  // namespace
}  // namespace qel
