// What a modem says of its registration in 2G and 3G, from the log to the metrics.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "messages/nas.h"
#include "sources/Metrics.h"
#include "support/diagnostics/GsmPackets.h"
#include "support/diagnostics/ReportChecks.h"

namespace qel::diagnostics {
namespace {

using test::BodyWriter;
using test::Heart;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

KCellularMmContext mmOf(const Heart& heart) {
  return heart.report<KCellularMmContext>(metric::kMmContext);
}

KCellularGmmContext gmmOf(const Heart& heart) {
  return heart.report<KCellularGmmContext>(metric::kGmmContext);
}

Bytes areaLog(const Bytes& area, std::uint8_t routingArea = 7) {
  return BodyWriter().u8(1).u8(2).bytes(area).u8(routingArea).zeros(35);
}

TEST(NasGmmState, SaysHowFarThePhoneIsRegistered) {
  const std::int32_t expected[] = {5, 4, 11, 0, 6, 11, 0};
  for (std::uint8_t state = 0; state < 7; ++state) {
    Heart heart;
    EXPECT_THAT(heart.take(0x7130, Bytes{state, 0, 0}), ElementsAre(metric::kGmmContext));
    EXPECT_EQ(gmmOf(heart).regStatus(), expected[state]) << int{state};
  }
  Heart heart;
  heart.take(0x7130, Bytes{7, 0, 0});
  heart.take(0x7130, Bytes{3, 0, 4});
  EXPECT_EQ(heart.counts().damaged, 2U);
  EXPECT_FALSE(heart.knows(metric::kGmmContext));
}

TEST(NasGmmState, SaysHowTheLastUpdateEnded) {
  const std::int32_t expected[] = {0, 1, 2, 2};
  for (std::uint8_t status = 0; status < 4; ++status) {
    Heart heart;
    heart.take(0x7130, Bytes{3, 0, status});
    EXPECT_EQ(gmmOf(heart).updateStatus(), expected[status]) << int{status};
  }
}

TEST(NasMmState, SaysHowFarThePhoneIsRegistered) {
  struct Case {
    std::uint8_t state;
    std::uint8_t substate;
    std::int32_t status;
  };
  const Case cases[] = {{19, 8, 0}, {19, 3, 2}, {19, 4, 4}, {19, 6, 3}, {19, 2, 3},
                        {19, 1, 2}, {3, 0, 11}, {10, 0, 1}, {0, 0, 5}};
  for (const Case& row : cases) {
    Heart heart;
    EXPECT_THAT(heart.take(0x7131, Bytes{row.state, row.substate, 0}),
                ElementsAre(metric::kMmContext));
    EXPECT_EQ(mmOf(heart).regStatus(), row.status) << int{row.state} << " " << int{row.substate};
    EXPECT_EQ(mmOf(heart).updateStatus(), 1);
  }
}

TEST(NasMmState, LeavesTheRegistrationAsItWasDuringACall) {
  Heart heart;
  heart.take(0x7131, Bytes{19, 8, 0});
  heart.take(0x7131, Bytes{6, 0, 1});
  EXPECT_EQ(mmOf(heart).regStatus(), 0);
  EXPECT_EQ(mmOf(heart).updateStatus(), 2);
  heart.take(0x7131, Bytes{19, 3, 2});
  EXPECT_EQ(mmOf(heart).updateStatus(), 3);
}

TEST(NasMmState, DoesNotGuessWhatItDoesNotKnow) {
  Heart heart;
  heart.take(0x7131, Bytes{6, 0, 0});
  EXPECT_FALSE(mmOf(heart).hasRegStatus());
  heart.take(0x7131, Bytes{19, 8, 3});
  EXPECT_EQ(heart.counts().damaged, 1U);
}

TEST(NasArea, HasItsCodesHighByteFirst) {
  Heart heart;
  EXPECT_THAT(heart.take(0x7135, areaLog(test::area("310410", 0xD70C))),
              ElementsAre(metric::kMmContext, metric::kGmmContext));
  EXPECT_EQ(mmOf(heart).lai()->lac(), 0xD70CU);
  EXPECT_EQ(mmOf(heart).lai()->encodedPlmn(), (Bytes{0x13, 0x00, 0x14}));
  EXPECT_EQ(gmmOf(heart).rai()->lac(), 0xD70CU);
  EXPECT_EQ(gmmOf(heart).rai()->rac(), 7U);
  EXPECT_EQ(gmmOf(heart).rai()->encodedPlmn(), (Bytes{0x13, 0x00, 0x14}));
}

TEST(NasArea, IsNotOneThatWasDeleted) {
  Heart heart;
  EXPECT_THAT(heart.take(0x7135, areaLog(test::area("00101", 0xFFFE))), IsEmpty());
  EXPECT_THAT(heart.take(0x7135, areaLog(Bytes(5, 0xFF))), IsEmpty());
  EXPECT_FALSE(heart.knows(metric::kMmContext));
}

TEST(NasTemporaryIdentity, BelongsToOneOfTheDomains) {
  Heart heart;
  EXPECT_THAT(heart.take(0x7138, BodyWriter().u8(0).u32(0x11223344)),
              ElementsAre(metric::kMmContext));
  EXPECT_THAT(heart.take(0x7138, BodyWriter().u8(1).u32(0x55667788)),
              ElementsAre(metric::kGmmContext));
  EXPECT_EQ(mmOf(heart).tmsi(), 0x11223344U);
  EXPECT_EQ(gmmOf(heart).pTmsi(), 0x55667788U);
  heart.take(0x7138, BodyWriter().u8(0).u32(0xFFFFFFFF));
  EXPECT_FALSE(heart.knows(metric::kMmContext));
  EXPECT_THAT(heart.take(0x7138, BodyWriter().u8(2).u32(1)), IsEmpty());
}

TEST(NasEquivalents, AreAsManyAsTheModemSays) {
  Heart heart;
  BodyWriter log;
  log.bytes(test::plmn("00101")).u8(2).bytes(test::plmn("00102")).bytes(test::plmn("310026"));
  log.zeros(9);
  EXPECT_THAT(heart.take(0x7150, log), ElementsAre(metric::kMmCommonInfo));
  const auto common = heart.report<KCellularMmCommonInfo>(metric::kMmCommonInfo);
  ASSERT_THAT(common.eplmnLists(), SizeIs(2));
  EXPECT_EQ(common.eplmnLists()[0]->encodedPlmn(), test::plmn("00102"));
  EXPECT_EQ(common.eplmnLists()[1]->encodedPlmn(), test::plmn("310026"));
  Bytes tooMany = log;
  tooMany[3] = 6;
  heart.take(0x7150, tooMany);
  EXPECT_EQ(heart.counts().damaged, 1U);
}

TEST(NasTwins, AreReadBehindTheirSubscription) {
  Heart heart;
  EXPECT_THAT(heart.take(0x7B30, Bytes{1, 3, 0, 0}), IsEmpty());
  EXPECT_THAT(heart.take(0x7B30, Bytes{0, 3, 0, 0}), ElementsAre(metric::kGmmContext));
  EXPECT_THAT(heart.take(0x7B31, Bytes{0, 19, 8, 0}), ElementsAre(metric::kMmContext));
  EXPECT_THAT(heart.take(0x7B38, BodyWriter().u8(0).u8(0).u32(5)), ElementsAre(metric::kMmContext));
}

TEST(NasStates, StandEveryDamage) {
  const std::vector<std::uint32_t> metrics = {metric::kMmContext, metric::kGmmContext,
                                              metric::kMmCommonInfo};
  test::mistreat(0x7130, Bytes{3, 0, 0}, metrics);
  test::mistreat(0x7131, Bytes{19, 8, 0}, metrics);
  test::mistreat(0x7135, areaLog(test::area("00101", 0x1234)), metrics);
  test::mistreat(0x7138, BodyWriter().u8(0).u32(5), metrics);
  test::mistreat(0x7150, BodyWriter().bytes(test::plmn("00101")).u8(0).zeros(15), metrics);
}

}  // namespace
}  // namespace qel::diagnostics
