// Groups, which no message has: they are skipped with all that is in them.
#include <gtest/gtest.h>

#include "Wire.h"
#include "messages/lte_rrc.h"
#include "messages/runtime/PBDataReader.h"

namespace qel {
namespace {

using testing::decoded;
using testing::ExactBuffer;
using testing::joined;
using testing::tag;
using testing::varintField;
using testing::WireType;

Bytes repeated(const Bytes& part, std::size_t times) {
  Bytes all;
  all.reserve(part.size() * times);
  for (std::size_t i = 0; i < times; ++i) all.insert(all.end(), part.begin(), part.end());
  return all;
}

TEST(Group, isSkippedInAMessageThatGoesOnBehindIt) {
  const auto message = decoded<KCellularLteRrcState>(
      joined(varintField(1, 5), tag(100, WireType::groupStart), varintField(2, 3),
             tag(100, WireType::groupEnd), varintField(4, 250)));
  ASSERT_TRUE(message);
  EXPECT_EQ(message->timestamp(), 5U);
  EXPECT_FALSE(message->hasState()) << "a field within a group is no field of the message";
  EXPECT_EQ(message->prevStateDurMs(), 250U);
}

TEST(Group, closedByAnotherNumberIsRefused) {
  EXPECT_FALSE(decoded<KCellularLteRrcState>(
      joined(tag(100, WireType::groupStart), tag(101, WireType::groupEnd))));
  EXPECT_FALSE(decoded<KCellularLteRrcState>(
      joined(tag(100, WireType::groupStart), tag(101, WireType::groupStart),
             tag(100, WireType::groupEnd), tag(101, WireType::groupEnd))));
}

TEST(Group, isMatchedByTheSixteenBitsThatAFieldNumberHas) {
  const std::uint64_t beyond = 0x10000 + 100;
  const auto message = decoded<KCellularLteRrcState>(
      joined(tag(beyond, WireType::groupStart), tag(beyond, WireType::groupEnd),
             tag(100, WireType::groupStart), tag(beyond, WireType::groupStart),
             tag(beyond, WireType::groupEnd), tag(100, WireType::groupEnd), varintField(1, 5)));
  ASSERT_TRUE(message);
  EXPECT_EQ(message->timestamp(), 5U);
}

TEST(Group, withAnUnknownWireTypeInsideIsRefused) {
  for (const int type : {6, 7}) {
    EXPECT_FALSE(decoded<KCellularLteRrcState>(joined(tag(100, WireType::groupStart),
                                                      tag(5, static_cast<WireType>(type)),
                                                      tag(100, WireType::groupEnd))))
        << type;
  }
}

TEST(Group, aMillionDeepAndNeverClosedIsRefusedWithoutACallADepth) {
  const Bytes bytes = repeated(tag(100, WireType::groupStart), 1'000'000);
  EXPECT_FALSE(decoded<KCellularLteRrcState>(bytes));
}

TEST(Group, aMillionDeepAndClosedIsSkippedWithoutACallADepth) {
  constexpr std::size_t kDepth = 1'000'000;
  const Bytes bytes = joined(repeated(tag(100, WireType::groupStart), kDepth),
                             repeated(tag(100, WireType::groupEnd), kDepth), varintField(1, 5));
  const auto message = decoded<KCellularLteRrcState>(bytes);
  ASSERT_TRUE(message);
  EXPECT_EQ(message->timestamp(), 5U);
}

TEST(Group, hasNoMetricIdentifiersToLookFor) {
  // Inside a group 19 is a number like any other: its eight bytes are skipped, not read as varint.
  const ExactBuffer input(
      joined(tag(19, WireType::fixed64), Bytes(8, 0xFF), tag(100, WireType::groupEnd)));
  PBDataReader reader(input.view());
  EXPECT_TRUE(PBReaderSkipValueWithTag(reader, 100, 3));
  EXPECT_EQ(reader._pos, input.view().size());
}

}  // namespace
}  // namespace qel
