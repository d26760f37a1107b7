// What every writer operation appends.
#include "messages/runtime/PBDataWriter.h"

#include <gtest/gtest.h>

#include <limits>

#include "Wire.h"
#include "messages/lte_rrc.h"

namespace qel {
namespace {

using testing::hex;

constexpr auto kMin32 = std::numeric_limits<std::int32_t>::min();
constexpr auto kMax32 = std::numeric_limits<std::int32_t>::max();

// What `write` appends to an empty writer, in hexadecimal.
template <class Write>
std::string written(Write&& write) {
  PBDataWriter writer;
  write(writer);
  return hexText(writer.data());
}

TEST(Writer, writesUnsignedVarintsInAsFewBytesAsTheyNeed) {
  const auto uint64 = [](std::uint64_t value) {
    return written([=](auto& writer) { PBDataWriterWriteUint64Field(writer, value, 1); });
  };
  EXPECT_EQ(uint64(0), "0800");
  EXPECT_EQ(uint64(1), "0801");
  EXPECT_EQ(uint64(127), "087f");
  EXPECT_EQ(uint64(128), "088001");
  EXPECT_EQ(uint64(std::numeric_limits<std::uint64_t>::max()), "08ffffffffffffffffff01");

  const auto uint32 = [](std::uint32_t value) {
    return written([=](auto& writer) { PBDataWriterWriteUint32Field(writer, value, 1); });
  };
  EXPECT_EQ(uint32(0), "0800");
  EXPECT_EQ(uint32(0xFFFFFFFF), "08ffffffff0f");
}

TEST(Writer, widensANegativeInt32ToTenBytes) {
  const auto int32 = [](std::int32_t value) {
    return written([=](auto& writer) { PBDataWriterWriteInt32Field(writer, value, 1); });
  };
  EXPECT_EQ(int32(0), "0800");
  EXPECT_EQ(int32(kMax32), "08ffffffff07");
  EXPECT_EQ(int32(-1), "08ffffffffffffffffff01");
  EXPECT_EQ(int32(kMin32), "0880808080f8ffffffff01");
}

TEST(Writer, foldsSint32ByZigZag) {
  const auto sint32 = [](std::int32_t value) {
    return written([=](auto& writer) { PBDataWriterWriteSint32Field(writer, value, 1); });
  };
  EXPECT_EQ(sint32(0), "0800");
  EXPECT_EQ(sint32(-1), "0801");
  EXPECT_EQ(sint32(1), "0802");
  EXPECT_EQ(sint32(kMax32), "08feffffff0f");
  EXPECT_EQ(sint32(kMin32), "08ffffffff0f");
}

TEST(Writer, writesABooleanAsOneOrZero) {
  EXPECT_EQ(written([](auto& writer) { PBDataWriterWriteBOOLField(writer, true, 2); }), "1001");
  EXPECT_EQ(written([](auto& writer) { PBDataWriterWriteBOOLField(writer, false, 2); }), "1000");
}

TEST(Writer, writesDataAndStringsBehindTheirLength) {
  EXPECT_EQ(written([](auto& writer) { PBDataWriterWriteDataField(writer, {}, 2); }), "1200");
  EXPECT_EQ(written([](auto& writer) { PBDataWriterWriteDataField(writer, hex("00ff"), 2); }),
            "120200ff");
  EXPECT_EQ(written([](auto& writer) { PBDataWriterWriteStringField(writer, "\xC3\xA4", 2); }),
            "1202c3a4");
  const std::string text(130, 'x');
  EXPECT_EQ(
      written([&](auto& writer) { PBDataWriterWriteStringField(writer, text, 2); }).substr(0, 8),
      "12820178");
}

TEST(Writer, writesFieldNumbersOfEverySize) {
  const auto numbered = [](std::uint32_t number) {
    return written([=](auto& writer) { PBDataWriterWriteUint32Field(writer, 1, number); });
  };
  EXPECT_EQ(numbered(15), "7801");
  EXPECT_EQ(numbered(16), "800101");
  EXPECT_EQ(numbered(0x1FFFFFFF), "f8ffffff0f01");
}

TEST(Writer, leavesTheTagOutWhenTheNumberIsAllOnes) {
  PBDataWriter writer;
  PBDataWriterWriteUint64Field(writer, 1, kPBNoTag);
  PBDataWriterWriteUint32Field(writer, 2, kPBNoTag);
  PBDataWriterWriteInt32Field(writer, 3, kPBNoTag);
  PBDataWriterWriteSint32Field(writer, -2, kPBNoTag);
  PBDataWriterWriteBOOLField(writer, true, kPBNoTag);
  PBDataWriterWriteDataField(writer, hex("aa"), kPBNoTag);
  PBDataWriterWriteStringField(writer, "b", kPBNoTag);
  EXPECT_EQ(hexText(writer.data()), "010203030101aa0162");
}

TEST(Writer, writesAMessageWithinAMessageBehindItsLength) {
  KCellularLteRrcState nested;
  EXPECT_EQ(written([&](auto& writer) { PBDataWriterWriteSubmessage(writer, nested, 3); }), "1a00");
  nested.setTimestamp(1000);
  EXPECT_EQ(written([&](auto& writer) { PBDataWriterWriteSubmessage(writer, nested, 3); }),
            "1a0308e807");
}

TEST(WriterMark, fillsInALengthOfAsFewBytesAsItNeeds) {
  for (const std::size_t size : {0U, 1U, 127U, 128U, 16383U, 16384U}) {
    SCOPED_TRACE(size);
    PBDataWriter writer;
    PBDataWriterMark mark;
    PBDataWriterPlaceMark(writer, mark, 2);
    for (std::size_t i = 0; i < size; ++i) PBDataWriterWriteUint32Field(writer, 0x25, kPBNoTag);
    PBDataWriterRecallMark(writer, mark);
    EXPECT_EQ(writer.takeData(), testing::delimitedField(2, Bytes(size, 0x25)));
  }
}

TEST(WriterMark, nests) {
  PBDataWriter writer;
  PBDataWriterMark outer;
  PBDataWriterMark inner;
  PBDataWriterPlaceMark(writer, outer, 1);
  PBDataWriterWriteUint32Field(writer, 5, 2);
  PBDataWriterPlaceMark(writer, inner, 3);
  for (int i = 0; i < 200; ++i) PBDataWriterWriteBOOLField(writer, true, kPBNoTag);
  PBDataWriterRecallMark(writer, inner);
  PBDataWriterWriteUint32Field(writer, 6, 4);
  PBDataWriterRecallMark(writer, outer);
  EXPECT_EQ(writer.takeData(),
            testing::delimitedField(1, testing::joined(testing::varintField(2, 5),
                                                       testing::delimitedField(3, Bytes(200, 1)),
                                                       testing::varintField(4, 6))));
}

TEST(Writer, handsItsBytesOver) {
  PBDataWriter writer;
  PBDataWriterWriteUint32Field(writer, 1, 1);
  EXPECT_EQ(hexText(writer.takeData()), "0801");
  EXPECT_TRUE(writer.data().empty());
}

// Wrote in front of its buffer, and read behind it.
TEST(PBDataWriter, recallsNoMarkThatIsNotItsOwn) {
  PBDataWriter writer;
  PBDataWriterRecallMark(writer, {});
  EXPECT_EQ(writer.size(), 0U);
  PBDataWriterMark mark;
  PBDataWriterPlaceMark(writer, mark, 1);
  PBDataWriterWriteUint32Field(writer, 300, 2);
  PBDataWriterRecallMark(writer, {});
  PBDataWriterRecallMark(writer, {writer.size() + 1});
  PBDataWriterRecallMark(writer, {~std::size_t{0}});
  PBDataWriterRecallMark(writer, mark);
  EXPECT_EQ(hexText(writer.data()), "0a0310ac02");
  writer.clear();
  PBDataWriterRecallMark(writer, mark);
  EXPECT_EQ(writer.size(), 0U);
}

}  // namespace
}  // namespace qel
