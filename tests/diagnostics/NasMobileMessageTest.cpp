// Messages about registration in 2G and 3G, from the log to the metrics. The bytes are written as
// the tables of 24.008, clauses 9.2 and 9.4, have them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "messages/nas.h"
#include "sources/Metrics.h"
#include "support/diagnostics/GsmPackets.h"
#include "support/diagnostics/MobilePackets.h"
#include "support/diagnostics/ReportChecks.h"

namespace qel::diagnostics {
namespace {

using test::area;
using test::BodyWriter;
using test::fromPhone;
using test::Heart;
using test::toPhone;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

constexpr std::uint16_t kLog = 0x713A;

KCellularMmContext mmOf(const Heart& heart) {
  return heart.report<KCellularMmContext>(metric::kMmContext);
}
KCellularGmmContext gmmOf(const Heart& heart) {
  return heart.report<KCellularGmmContext>(metric::kGmmContext);
}
KCellularMmCommonInfo commonOf(const Heart& heart) {
  return heart.report<KCellularMmCommonInfo>(metric::kMmCommonInfo);
}

Bytes locationAccept() {
  return BodyWriter()
      .u8(0x05)
      .u8(0x02)
      .bytes(area("00101", 0x1234))
      .bytes(Bytes{0x17, 5, 0xF4, 0xA1, 0xB2, 0xC3, 0xD4})
      .u8(0xA1)  // follow-on proceed
      .u8(0x4A)
      .u8(3)
      .bytes(test::plmn("00102"))
      .bytes(Bytes{0x35, 1, 0x22});  // T3212: 2 hours
}

// The phone is on a GSM cell of that area.
void camp(Heart& heart, std::uint32_t lac) {
  test::Broadcast cell;
  cell.lac = lac;
  heart.take(0x512F, radioMessage(test::RadioChannel::broadcast, systemInformation3(cell), 18));
}

TEST(NasLocationUpdate, IsUnderWayOnceThePhoneAsks) {
  Heart heart;
  EXPECT_THAT(heart.take(kLog, fromPhone(Bytes{0x05, 0x48, 0x70})),
              ElementsAre(metric::kMmContext));
  EXPECT_EQ(mmOf(heart).regStatus(), 11);
  EXPECT_FALSE(mmOf(heart).isCombinedProc());
  EXPECT_TRUE(mmOf(heart).hasIsCombinedProc());
}

TEST(NasLocationUpdate, IsAcceptedWithAreaIdentityAndTimer) {
  Heart heart;
  EXPECT_THAT(heart.take(kLog, toPhone(locationAccept())),
              ElementsAre(metric::kMmContext, metric::kMmCommonInfo));
  const auto mm = mmOf(heart);
  EXPECT_EQ(mm.regStatus(), 0);
  EXPECT_EQ(mm.updateStatus(), 1);
  EXPECT_EQ(mm.lai()->lac(), 0x1234U);
  EXPECT_EQ(mm.lai()->encodedPlmn(), test::plmn("00101"));
  EXPECT_EQ(mm.tmsi(), 0xA1B2C3D4U);
  EXPECT_EQ(mm.t3212DurS(), 7200U);
  EXPECT_EQ(mm.procFailureCause(), 0);
  EXPECT_EQ(mm.rejectCause(), 0);
  ASSERT_THAT(commonOf(heart).eplmnLists(), SizeIs(1));
  EXPECT_EQ(commonOf(heart).eplmnLists()[0]->encodedPlmn(), test::plmn("00102"));
}

TEST(NasLocationUpdate, TakesTheTimerOfTheCellElse) {
  Heart heart;
  camp(heart, 0x1234);
  heart.take(kLog, toPhone(BodyWriter().u8(5).u8(2).bytes(area("00101", 0x1234))));
  EXPECT_EQ(mmOf(heart).t3212DurS(), 7200U);  // 20 tenths of an hour
  EXPECT_FALSE(mmOf(heart).hasTmsi());
}

TEST(NasLocationUpdate, MayTakeTheTemporaryIdentityAway) {
  Heart heart;
  heart.take(kLog, toPhone(locationAccept()));
  const Bytes imsi{0x17, 8, 0x09, 0x10, 0x10, 0, 0, 0, 0, 0};
  heart.take(kLog, toPhone(BodyWriter().u8(5).u8(2).bytes(area("00101", 1)).bytes(imsi)));
  EXPECT_FALSE(mmOf(heart).hasTmsi());
  EXPECT_TRUE(commonOf(heart).imsi().value_or(Bytes()).empty()) << "only a card tells it";
}

TEST(NasLocationUpdate, IsRefusedWithACause) {
  struct Case {
    std::uint8_t cause;
    std::int32_t reported;
    std::int32_t status;
  };
  const Case cases[] = {{2, 2, 3},   {11, 11, 3}, {12, 12, 3}, {17, 17, 2},
                        {22, 22, 2}, {48, 63, 2}, {63, 63, 2}};
  for (const Case& row : cases) {
    Heart heart;
    heart.take(kLog, toPhone(Bytes{0x05, 0x04, row.cause}));
    EXPECT_EQ(mmOf(heart).regStatus(), 1);
    EXPECT_EQ(mmOf(heart).rejectCause(), row.reported);
    EXPECT_EQ(mmOf(heart).updateStatus(), row.status) << row.reported;
    EXPECT_EQ(mmOf(heart).procFailureCause(), 11);
  }
}

TEST(NasForbiddenAreas, AreThoseWhereTheNetworkRefused) {
  Heart heart;
  camp(heart, 0x1111);
  EXPECT_THAT(heart.take(kLog, toPhone(Bytes{0x05, 0x04, 12})), Contains(metric::kMmCommonInfo));
  camp(heart, 0x2222);
  heart.take(kLog, toPhone(Bytes{0x08, 0x0B, 13, 0}));
  camp(heart, 0x3333);
  heart.take(kLog, toPhone(Bytes{0x05, 0x04, 15}));
  heart.take(kLog, toPhone(Bytes{0x05, 0x04, 15}));
  const auto common = commonOf(heart);
  ASSERT_THAT(common.regProvFlaiLists(), SizeIs(1));
  EXPECT_EQ(common.regProvFlaiLists()[0]->lac(), 0x1111U);
  ASSERT_THAT(common.roamingFlaiLists(), SizeIs(2));
  EXPECT_EQ(common.roamingFlaiLists()[0]->lac(), 0x2222U);
  EXPECT_EQ(common.roamingFlaiLists()[1]->lac(), 0x3333U);
  heart.take(kLog, toPhone(BodyWriter().u8(5).u8(2).bytes(area("00101", 0x1111))));
  EXPECT_THAT(commonOf(heart).regProvFlaiLists(), IsEmpty());
}

TEST(NasForbiddenAreas, AreNotKeptWhenThePlaceIsUnknownAndNotWithoutEnd) {
  Heart heart;
  EXPECT_THAT(heart.take(kLog, toPhone(Bytes{0x05, 0x04, 12})), ElementsAre(metric::kMmContext));
  for (std::uint32_t lac = 1; lac <= 50; ++lac) {
    camp(heart, lac);
    heart.take(kLog, toPhone(Bytes{0x05, 0x04, 13}));
  }
  ASSERT_THAT(commonOf(heart).roamingFlaiLists(), SizeIs(40));
  EXPECT_EQ(commonOf(heart).roamingFlaiLists()[0]->lac(), 11U);
}

TEST(NasTmsi, IsGivenAnew) {
  Heart heart;
  heart.take(kLog, toPhone(BodyWriter()
                               .u8(0x05)
                               .u8(0x1A)
                               .bytes(area("00101", 0x77))
                               .bytes(Bytes{5, 0xF4, 0, 0, 0, 9})));
  EXPECT_EQ(mmOf(heart).tmsi(), 9U);
  EXPECT_EQ(mmOf(heart).lai()->lac(), 0x77U);
}

TEST(NasAuthentication, MayBeRejectedByTheNetwork) {
  Heart heart;
  heart.take(kLog, toPhone(Bytes{0x05, 0x11}));
  heart.take(kLog, toPhone(Bytes{0x08, 0x14}));
  EXPECT_EQ(mmOf(heart).procFailureCause(), 12);
  EXPECT_EQ(gmmOf(heart).procFailureCause(), 12);
}

// With everything that may stand in it.
Bytes packetAccept(std::uint8_t type, std::uint8_t first) {
  BodyWriter out;
  out.u8(0x08).u8(type).u8(first).u8(0x49);  // T3312: 54 minutes, in tenths of an hour
  if (type == 0x02) out.u8(0x44);
  out.bytes(area("00101", 0x1234)).u8(0x56);
  out.bytes(Bytes{0x19, 1, 2, 3, 0x18, 5, 0xF4, 0, 0, 0, 8, 0x23, 5, 0xF4, 0, 0, 0, 9});
  out.bytes(Bytes{0x17, 0x21, 0x8C, 0x4A, 3}).bytes(test::plmn("00103"));
  return out;
}

TEST(NasAttach, IsForBothDomainsWhereTheNetworkGrantsIt) {
  Heart heart;
  const Bytes request{0x08, 0x01, 3, 0xE5, 0xE0, 0x34, 0x03, 0, 0};
  EXPECT_THAT(heart.take(kLog, fromPhone(request)),
              ElementsAre(metric::kGmmContext, metric::kMmContext));
  EXPECT_EQ(gmmOf(heart).regStatus(), 11);
  EXPECT_EQ(gmmOf(heart).regProc(), 4);
  EXPECT_TRUE(mmOf(heart).isCombinedProc());
  EXPECT_THAT(heart.take(kLog, toPhone(packetAccept(0x02, 0x03))),
              ElementsAre(metric::kGmmContext, metric::kMmContext, metric::kMmCommonInfo));
  const auto gmm = gmmOf(heart);
  EXPECT_EQ(gmm.regStatus(), 0);
  EXPECT_EQ(gmm.updateStatus(), 0);
  EXPECT_EQ(gmm.rai()->lac(), 0x1234U);
  EXPECT_EQ(gmm.rai()->rac(), 0x56U);
  EXPECT_EQ(gmm.pTmsi(), 8U);
  EXPECT_EQ(gmm.t3312DurS(), 9U * 360U);
  EXPECT_EQ(gmm.regProc(), 4);
  EXPECT_EQ(mmOf(heart).tmsi(), 9U);
  EXPECT_EQ(mmOf(heart).lai()->lac(), 0x1234U);
  EXPECT_EQ(commonOf(heart).eplmnLists()[0]->encodedPlmn(), test::plmn("00103"));
}

TEST(NasAttach, SaysWhyOneDomainIsLeftOut) {
  Heart heart;
  BodyWriter accept;
  accept.u8(0x08).u8(0x02).u8(0x01).u8(0xE0).u8(0x44).bytes(area("00101", 0x1234)).u8(1);
  accept.u8(0x25).u8(16);
  heart.take(kLog, toPhone(accept));
  EXPECT_EQ(gmmOf(heart).regProc(), 1);
  EXPECT_EQ(gmmOf(heart).t3312DurS(), 0U) << "switched off";
  EXPECT_EQ(mmOf(heart).rejectCause(), 16);
  EXPECT_EQ(mmOf(heart).regStatus(), 1);
}

TEST(NasRoutingAreaUpdate, IsAsTheNetworkGrantsIt) {
  for (const bool combined : {true, false}) {
    Heart heart;
    heart.take(kLog, toPhone(packetAccept(0x09, combined ? 0x10 : 0x00)));
    EXPECT_EQ(gmmOf(heart).regProc(), combined ? 3 : 2);
    EXPECT_EQ(gmmOf(heart).pTmsi(), 8U);
    EXPECT_EQ(heart.knows(metric::kMmContext), combined);
  }
  Heart heart;
  heart.take(kLog, fromPhone(Bytes{0x08, 0x08, 0x70}));
  EXPECT_EQ(gmmOf(heart).regProc(), 2);
  heart.take(kLog, fromPhone(Bytes{0x08, 0x08, 0x72}));
  EXPECT_EQ(gmmOf(heart).regProc(), 3);
}

TEST(NasPacketService, IsRefusedWithACause) {
  for (const std::uint8_t type : Bytes{0x04, 0x0B, 0x0E}) {
    Heart heart;
    heart.take(kLog, toPhone(Bytes{0x08, type, 14, 0}));
    EXPECT_EQ(gmmOf(heart).regStatus(), 1);
    EXPECT_EQ(gmmOf(heart).rejectCause(), 14);
    EXPECT_EQ(gmmOf(heart).updateStatus(), 2);
    EXPECT_EQ(gmmOf(heart).procFailureCause(), 11);
  }
}

TEST(NasPacketService, IsAskedForAndGranted) {
  Heart heart;
  heart.take(kLog, fromPhone(Bytes{0x08, 0x0C, 0x10, 5, 0xF4, 0, 0, 0, 8}));
  EXPECT_EQ(gmmOf(heart).regProc(), 6);
  heart.take(kLog, toPhone(Bytes{0x08, 0x0D}));
  EXPECT_EQ(gmmOf(heart).regStatus(), 0);
}

TEST(NasDetach, IsOfTheDomainsThatAreNamed) {
  Heart heart;
  heart.take(kLog, fromPhone(Bytes{0x08, 0x05, 0x01}));
  EXPECT_EQ(gmmOf(heart).regStatus(), 6);
  EXPECT_FALSE(heart.knows(metric::kMmContext));
  heart.take(kLog, fromPhone(Bytes{0x05, 0x01, 0x30, 0}));
  EXPECT_EQ(mmOf(heart).regStatus(), 6);
  Heart other;
  other.take(kLog, toPhone(Bytes{0x08, 0x05, 0x03}));
  EXPECT_FALSE(other.knows(metric::kGmmContext));
  other.take(kLog, toPhone(Bytes{0x08, 0x05, 0x02}));
  EXPECT_EQ(gmmOf(other).regStatus(), 6);
  EXPECT_EQ(gmmOf(other).regProc(), 5);
}

TEST(NasMessages, AreNotReadWhenTheyAreOfAnotherKind) {
  Heart heart;
  for (const Bytes& message : {Bytes{0x05, 0x12, 1, 2, 3}, Bytes{0x08, 0x12, 1, 2},
                               Bytes{0x03, 0x45, 4}, Bytes{0x15, 0x04, 12}}) {
    EXPECT_THAT(heart.take(kLog, toPhone(message)), IsEmpty());
  }
  EXPECT_THAT(heart.take(kLog, fromPhone(Bytes{0x05, 0x04, 12})), IsEmpty());
  EXPECT_EQ(heart.counts().notOurs, 5U);
}

TEST(NasMessages, StandEveryDamage) {
  const std::vector<std::uint32_t> metrics = {metric::kMmContext, metric::kGmmContext,
                                              metric::kMmCommonInfo};
  test::mistreat(kLog, toPhone(locationAccept()), metrics);
  test::mistreat(kLog, toPhone(packetAccept(0x02, 3)), metrics);
  test::mistreat(kLog, toPhone(packetAccept(0x09, 0x10)), metrics);
}

}  // namespace
}  // namespace qel::diagnostics
