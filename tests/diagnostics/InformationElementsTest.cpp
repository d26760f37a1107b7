// Elements of the non-access stratum one behind the other.
#include "sources/diagnostics/nas/InformationElements.h"

#include <gtest/gtest.h>

#include "sources/diagnostics/nas/EpsElements.h"

namespace qel::diagnostics {
namespace {

TEST(ElementReader, readsWhatIsThereAndThenFailsForGood) {
  const Bytes message = {1, 2, 0xAA, 0xBB, 0, 1, 0xCC};
  ElementReader reader(message);
  EXPECT_EQ(reader.octet(), 1);
  EXPECT_EQ(reader.counted().size(), 2U);
  EXPECT_EQ(reader.longCounted()[0], 0xCC);
  EXPECT_TRUE(reader.rest().empty());
  EXPECT_FALSE(reader.failed());
  EXPECT_EQ(reader.octet(), 0);
  EXPECT_TRUE(reader.failed());
  EXPECT_TRUE(reader.value(0).empty());
  EXPECT_TRUE(reader.failed());
}

TEST(ElementReader, failsWhereALengthGoesPastTheEnd) {
  for (const Bytes& message : {Bytes{}, Bytes{3, 1, 2}}) {
    ElementReader reader(message);
    reader.counted();
    EXPECT_TRUE(reader.failed());
  }
  const Bytes longer = {1, 0, 5};
  ElementReader reader(longer);
  reader.longCounted();
  EXPECT_TRUE(reader.failed());
}

constexpr std::array kFixed = {FixedElement{0x13, 2}, FixedElement{0x53, 1}};

TEST(OptionalElements, areToldApartByTheirIdentifiers) {
  const Bytes message = {0xF2, 0x53, 22, 0x4A, 1, 9, 0x13, 7, 8, 0x78, 0, 1, 5};
  OptionalElements elements(message, Protocol::eps, kFixed);
  const auto half = elements.next();
  ASSERT_TRUE(half);
  EXPECT_EQ(half->identifier, 0xF0);
  EXPECT_EQ(half->value[0], 0xF2);
  const auto cause = elements.next();
  EXPECT_EQ(cause->identifier, 0x53);
  EXPECT_EQ(cause->value[0], 22);
  EXPECT_EQ(elements.next()->value[0], 9);
  EXPECT_EQ(elements.next()->value.size(), 2U);
  const auto container = elements.next();
  EXPECT_EQ(container->identifier, 0x78);
  EXPECT_EQ(container->value[0], 5);
  EXPECT_FALSE(elements.next());
  EXPECT_FALSE(elements.failed());
}

TEST(OptionalElements, haveLongLengthsOnlyWhereTheProtocolHasThem) {
  const Bytes message = {0x78, 1, 5};
  OptionalElements elements(message, Protocol::gsmAndUmts, {});
  EXPECT_EQ(elements.next()->value[0], 5);
  OptionalElements longer(message, Protocol::eps, {});
  EXPECT_FALSE(longer.next());
  EXPECT_TRUE(longer.failed());
}

TEST(OptionalElements, failWhereOneIsLongerThanTheMessage) {
  for (const Bytes& message : {Bytes{0x53}, Bytes{0x4A}, Bytes{0x4A, 2, 1}, Bytes{0x13, 1}}) {
    OptionalElements elements(message, Protocol::eps, kFixed);
    EXPECT_FALSE(elements.next());
    EXPECT_TRUE(elements.failed());
  }
}

TEST(Timers, areInSeconds) {
  EXPECT_EQ(timerS(0b000'00101), 10U);
  EXPECT_EQ(timerS(0b001'11110), 1800U);
  EXPECT_EQ(timerS(0b010'01001), 3240U);
  EXPECT_EQ(timerS(0b111'00101), 0U) << "switched off";
  EXPECT_EQ(timerS(0b100'00001), 60U) << "what is not defined is taken for minutes";
  EXPECT_EQ(longTimerS(0b000'00001), 600U);
  EXPECT_EQ(longTimerS(0b001'00010), 7200U);
  EXPECT_EQ(longTimerS(0b010'00001), 36000U);
  EXPECT_EQ(longTimerS(0b011'00101), 10U);
  EXPECT_EQ(longTimerS(0b100'00010), 60U);
  EXPECT_EQ(longTimerS(0b101'00010), 120U);
  EXPECT_EQ(longTimerS(0b110'00001), 1152000U);
  EXPECT_EQ(longTimerS(0b111'00001), 0U);
}

TEST(TrackingAreas, areOfThreeKindsOfLists) {
  const PlmnCode one = {0x00, 0xF1, 0x10};
  const PlmnCode other = {0x62, 0xF2, 0x10};
  EXPECT_EQ(trackingAreas(Bytes{0x01, 0x00, 0xF1, 0x10, 0, 5, 0, 9}),
            (std::vector<TrackingArea>{{one, 5}, {one, 9}}));
  EXPECT_EQ(trackingAreas(Bytes{0x22, 0x00, 0xF1, 0x10, 0xFF, 0xFE}),
            (std::vector<TrackingArea>{{one, 0xFFFE}, {one, 0xFFFF}, {one, 0}}));
  EXPECT_EQ(trackingAreas(Bytes{0x41, 0x00, 0xF1, 0x10, 0, 5, 0x62, 0xF2, 0x10, 1, 2}),
            (std::vector<TrackingArea>{{one, 5}, {other, 0x102}}));
  EXPECT_EQ(trackingAreas(Bytes{0x00, 0x00, 0xF1, 0x10, 0, 5, 0x00, 0x62, 0xF2, 0x10, 0, 6}),
            (std::vector<TrackingArea>{{one, 5}, {other, 6}}))
      << "two lists";
}

TEST(TrackingAreas, areNothingWhenTheListIsDamagedOrTooLong) {
  EXPECT_FALSE(trackingAreas({}));
  EXPECT_FALSE(trackingAreas(Bytes{0x61, 0x00, 0xF1, 0x10, 0, 5})) << "a kind that does not exist";
  EXPECT_FALSE(trackingAreas(Bytes{0x01, 0x00, 0xF1, 0x10, 0, 5}));
  EXPECT_TRUE(trackingAreas(Bytes{0x2F, 0x00, 0xF1, 0x10, 0, 5}));
  EXPECT_FALSE(trackingAreas(Bytes{0x30, 0x00, 0xF1, 0x10, 0, 5})) << "seventeen";
}

TEST(AccessPointName, hasDotsBetweenItsLabels) {
  EXPECT_EQ(accessPointName(Bytes{3, 'i', 'm', 's', 2, 'x', 'y'}), "ims.xy");
  EXPECT_EQ(accessPointName({}), "");
  EXPECT_FALSE(accessPointName(Bytes{3, 'i', 'm'}));
  EXPECT_FALSE(accessPointName(Bytes{1, 7}));
  EXPECT_FALSE(accessPointName(Bytes(101, 0)));
}

TEST(NameServers, areTheFirstTwo) {
  const Bytes options = {0x80, 0, 0x0D, 4, 1, 1, 1, 1,    0, 0x10, 2, 5, 0xDC, 0,
                         0x0D, 4, 2,    2, 2, 2, 0, 0x0D, 4, 3,    3, 3, 3};
  EXPECT_EQ(nameServers(options), (std::vector<Bytes>{{1, 1, 1, 1}, {2, 2, 2, 2}}));
  EXPECT_FALSE(nameServers(ByteView(options).first(options.size() - 1)));
  EXPECT_FALSE(nameServers({}));
  EXPECT_EQ(nameServers(Bytes{0x80, 0, 0x0D, 2, 1, 1}), std::vector<Bytes>{})
      << "an address has four bytes";
}

}  // namespace
}  // namespace qel::diagnostics
