// The functions over packed lists, in both families.
#include "messages/runtime/PBRepeated.h"

#include <gtest/gtest.h>

#include <array>
#include <limits>
#include <stdexcept>

#include "messages/gsm.h"
#include "messages/lte_serving.h"

namespace qel {
namespace {

constexpr auto kMin32 = std::numeric_limits<std::int32_t>::min();
constexpr auto kMaxU32 = std::numeric_limits<std::uint32_t>::max();

TEST(PBRepeated, addsSetsCopiesAndClearsUnsignedValues) {
  PBRepeatedUInt32 array;
  PBRepeatedUInt32Add(array, 1);
  PBRepeatedUInt32Add(array, kMaxU32);
  EXPECT_EQ(array.count(), 2U);
  EXPECT_EQ(array.list()[1], kMaxU32);

  PBRepeatedUInt32 copy;
  PBRepeatedUInt32Add(copy, 77);
  PBRepeatedUInt32Copy(copy, array);
  EXPECT_TRUE(PBRepeatedUInt32IsEqual(copy, array)) << "a copy replaces what was there";
  EXPECT_EQ(PBRepeatedUInt32Hash(copy), PBRepeatedUInt32Hash(array));

  constexpr std::array<std::uint32_t, 3> kValues = {3, 1, 2};
  PBRepeatedUInt32Set(array, kValues.data(), kValues.size());
  EXPECT_EQ(array.values, (Sequence<std::uint32_t>{3, 1, 2}));
  EXPECT_FALSE(PBRepeatedUInt32IsEqual(copy, array));
  EXPECT_EQ(PBRepeatedUInt32NSArray(array), (List{3U, 1U, 2U}));

  PBRepeatedUInt32Clear(array);
  EXPECT_EQ(array.count(), 0U);
  EXPECT_EQ(array.values.capacity(), 0U) << "clearing frees the memory";
  EXPECT_TRUE(PBRepeatedUInt32NSArray(array).empty());
}

TEST(PBRepeated, addsSetsCopiesAndClearsSignedValues) {
  PBRepeatedInt32 array;
  PBRepeatedInt32Add(array, -1);
  PBRepeatedInt32Add(array, kMin32);
  EXPECT_EQ(array.count(), 2U);
  EXPECT_EQ(array.list()[1], kMin32);

  PBRepeatedInt32 copy;
  PBRepeatedInt32Add(copy, 77);
  PBRepeatedInt32Copy(copy, array);
  EXPECT_TRUE(PBRepeatedInt32IsEqual(copy, array));
  EXPECT_EQ(PBRepeatedInt32Hash(copy), PBRepeatedInt32Hash(array));

  constexpr std::array<std::int32_t, 3> kValues = {-3, 1, 2};
  PBRepeatedInt32Set(array, kValues.data(), kValues.size());
  EXPECT_EQ(array.values, (Sequence<std::int32_t>{-3, 1, 2}));
  EXPECT_FALSE(PBRepeatedInt32IsEqual(copy, array));
  EXPECT_EQ(PBRepeatedInt32NSArray(array), (List{-3, 1, 2}));

  PBRepeatedInt32Clear(array);
  EXPECT_EQ(array.count(), 0U);
  EXPECT_EQ(array.values.capacity(), 0U);
}

TEST(PBRepeated, tellsListsApartByOrderAndByCount) {
  const PBRepeatedUInt32 ascending{{1, 2}};
  const PBRepeatedUInt32 descending{{2, 1}};
  const PBRepeatedUInt32 longer{{1, 2, 0}};
  EXPECT_FALSE(PBRepeatedUInt32IsEqual(ascending, descending));
  EXPECT_FALSE(PBRepeatedUInt32IsEqual(ascending, longer));
  EXPECT_NE(PBRepeatedUInt32Hash(ascending), PBRepeatedUInt32Hash(descending));
  EXPECT_NE(PBRepeatedUInt32Hash(ascending), PBRepeatedUInt32Hash(longer));
}

// The reason that reading at `index` is refused with, or "" when it is not.
template <class Read>
std::string refusal(Read&& read) {
  try {
    read();
  } catch (const std::out_of_range& exception) {
    return exception.what();
  }
  return "";
}

TEST(PBRepeated, refusesAnIndexOutOfRangeWithIndexAndCount) {
  KCellularLteSelReselCellInfo info;
  EXPECT_EQ(refusal([&] { info.multiBandInfoAtIndex(0); }), "idx (0) is out of range (0)");
  info.addMultiBandInfo(3);
  info.addMultiBandInfo(7);
  EXPECT_EQ(info.multiBandInfoAtIndex(1), 7U);
  EXPECT_EQ(refusal([&] { info.multiBandInfoAtIndex(1); }), "");
  EXPECT_EQ(refusal([&] { info.multiBandInfoAtIndex(2); }), "idx (2) is out of range (2)");
  EXPECT_EQ(
      refusal([&] { info.multiBandInfoAtIndex(std::numeric_limits<std::size_t>::max()); }),
      "idx (" + std::to_string(std::numeric_limits<std::size_t>::max()) + ") is out of range (2)");

  KCellularGsmCsRfMeasurement measurement;
  EXPECT_EQ(refusal([&] { measurement.csTxPwrAtIndex(5); }), "idx (5) is out of range (0)");
}

TEST(RepeatedMessages, refuseAnIndexOutOfRange) {
  KCellularLteSelReselCellInfo info;
  EXPECT_THROW(info.nbrEutraAtIndex(0), std::out_of_range);
  const auto neighbour = std::make_shared<NbrEutra>();
  info.addNbrEutra(neighbour);
  EXPECT_EQ(info.nbrEutraAtIndex(0), neighbour);
  EXPECT_THROW(info.nbrEutraAtIndex(1), std::out_of_range);
}

}  // namespace
}  // namespace qel
