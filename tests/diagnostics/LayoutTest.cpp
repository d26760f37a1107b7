// The reader of layouts, and what all layouts keep to.

#include <gtest/gtest.h>

#include <array>
#include <set>

#include "sources/diagnostics/layouts/LteLayouts.h"

namespace qel::diagnostics {
namespace {

constexpr std::array kNothing = {FieldRow{Field::pci, 0, 0, 8}};

TEST(Layout, takesBitsOfALittleEndianNumber) {
  constexpr std::array kRows = {FieldRow{Field::pci, 1, 4, 12}, FieldRow{Field::earfcn, 0, 0, 32},
                                FieldRow{Field::area, 3, 7, 1}};
  const Layout layout{.bytes = 4, .head = kRows};
  const auto reading = read(layout, Bytes{0x01, 0x23, 0x45, 0x86});
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->head.number(Field::pci), 0x452U);
  EXPECT_EQ(reading->head.number(Field::earfcn), 0x86452301U);
  EXPECT_EQ(reading->head.number(Field::area), 1U);
  EXPECT_FALSE(reading->head.has(Field::band));
  EXPECT_EQ(reading->head.find(Field::band), std::nullopt);
}

TEST(Layout, takesANumberThatReachesIntoTheNextWord) {
  constexpr std::array kRows = {FieldRow{Field::cellId, 0, 7, 32}};
  const Layout layout{.bytes = 5, .head = kRows};
  const auto reading = read(layout, Bytes{0x80, 0xFF, 0xFF, 0xFF, 0x7F});
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->head.number(Field::cellId), 0xFFFFFFFFU);
}

TEST(Layout, scalesAndTakesSigns) {
  constexpr std::array kRows = {FieldRow{Field::rsrp, 0, 0, 8, {1.0 / 16, -180}},
                                FieldRow{Field::txPower, 0, 0, 8, {1, 0, true}},
                                FieldRow{Field::rssi, 0, 0, 8, {0.5, 10, true}}};
  const Layout layout{.bytes = 1, .head = kRows};
  const auto low = read(layout, Bytes{0x80});
  EXPECT_EQ(low->head[Field::rsrp], -172);
  EXPECT_EQ(low->head[Field::txPower], -128);
  EXPECT_EQ(low->head[Field::rssi], -54);
  const auto high = read(layout, Bytes{0x7F});
  EXPECT_EQ(high->head[Field::txPower], 127);
}

TEST(Layout, refusesWhatIsShorter) {
  const Layout layout{.bytes = 3, .head = kNothing};
  EXPECT_TRUE(read(layout, Bytes(3)));
  EXPECT_FALSE(read(layout, Bytes(2)));
  EXPECT_FALSE(read(layout, Bytes()));
}

constexpr std::array kCounted = {FieldRow{Field::count, 0, 0, 16}};
constexpr std::array kPci = {FieldRow{Field::pci, 1, 0, 8}};
constexpr Layout kRepeating{
    .bytes = 2, .head = kCounted, .record = kPci, .firstRecord = 2, .recordBytes = 4};

TEST(Layout, readsAsManyRecordsAsTheHeadSays) {
  const auto reading = read(kRepeating, Bytes{2, 0, 9, 1, 9, 9, 9, 2, 9, 9});
  ASSERT_TRUE(reading);
  ASSERT_EQ(reading->records.size(), 2U);
  EXPECT_EQ(reading->records[0].number(Field::pci), 1U);
  EXPECT_EQ(reading->records[1].number(Field::pci), 2U);
}

TEST(Layout, needsOfTheLastRecordWhatIsReadOfIt) {
  EXPECT_TRUE(read(kRepeating, Bytes{2, 0, 9, 1, 9, 9, 9, 2}));
  EXPECT_FALSE(read(kRepeating, Bytes{2, 0, 9, 1, 9, 9, 9}));
}

TEST(Layout, refusesMoreRecordsThanItWillRead) {
  const std::size_t most = kMostRecords;
  Bytes bytes(2 + 4 * (most + 1), 1);
  bytes[0] = static_cast<std::uint8_t>(most);
  bytes[1] = static_cast<std::uint8_t>(most >> 8);
  EXPECT_TRUE(read(kRepeating, bytes));
  bytes[0] = static_cast<std::uint8_t>(most + 1);
  bytes[1] = static_cast<std::uint8_t>((most + 1) >> 8);
  EXPECT_FALSE(read(kRepeating, bytes));
}

TEST(Layout, isFoundByCodePartAndVersion) {
  const Layout* layout = findLayout(kLteMeasurementLog, 25, 36);
  ASSERT_TRUE(layout);
  EXPECT_EQ(layout->version, 36);
  EXPECT_FALSE(findLayout(kLteMeasurementLog, 25, 37));
  EXPECT_FALSE(findLayout(kLteMeasurementLog, 24, 36));
  EXPECT_FALSE(findLayout(0xB0FF, 0, 1));
}

// So the rows of a code can be found as one stretch.
TEST(LteLayouts, standTogetherByCodeAndPartWithAscendingVersions) {
  std::set<std::pair<unsigned, unsigned>> seen;
  const Layout* before = nullptr;
  for (const Layout& layout : lteLayouts()) {
    const bool goesOn = before && before->code == layout.code && before->part == layout.part;
    if (goesOn) {
      EXPECT_LT(before->version, layout.version) << layout.code;
    } else {
      EXPECT_TRUE(seen.insert({layout.code, layout.part}).second) << layout.code;
    }
    before = &layout;
  }
  EXPECT_GE(seen.size(), 11U);
}

}  // namespace
}  // namespace qel::diagnostics
