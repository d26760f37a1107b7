// The accessors of the message classes.
#include <gtest/gtest.h>

#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/runtime/Fields.h"

namespace qel {
namespace {

TEST(ScalarAccessors, yieldZeroUntilSet) {
  const KCellularLteRrcState message;
  EXPECT_FALSE(message.hasTimestamp());
  EXPECT_EQ(message.timestamp(), 0U);
  EXPECT_EQ(message.state(), 0);
  EXPECT_EQ(message.prevStateDurMs(), 0U);
}

TEST(ScalarAccessors, setTheValueAndThePresenceBitOfThisFieldOnly) {
  KCellularLteRrcState message;
  message.setPrevStateDurMs(0);
  EXPECT_TRUE(message.hasPrevStateDurMs()) << "zero is a value";
  EXPECT_FALSE(message.hasTimestamp());
  EXPECT_FALSE(message.hasState());
  EXPECT_FALSE(message.hasPrevState());
  EXPECT_FALSE(message.hasCause());
}

TEST(ScalarAccessors, keepTheValueWhenOnlyThePresenceBitIsCleared) {
  KCellularLteRrcState message;
  message.setTimestamp(7);
  message.setHasTimestamp(false);
  EXPECT_FALSE(message.hasTimestamp());
  EXPECT_EQ(message.timestamp(), 7U) << "the getter yields what is stored";
  EXPECT_TRUE(message.data().empty());
  EXPECT_TRUE(message.dictionaryRepresentation().empty());
  message.setHasTimestamp(true);
  EXPECT_EQ(message.timestamp(), 7U);
  EXPECT_EQ(hexText(message.data()), "0807");
}

TEST(ScalarAccessors, makeAnUnsetFieldPresentAsZero) {
  RxInfo info;
  info.setHasSnr(true);
  EXPECT_EQ(info.snr(), 0);
  EXPECT_EQ(hexText(info.data()), "2000");
}

TEST(EnumAccessors, yieldZeroWhileThePresenceBitIsClear) {
  KCellularLteRrcState message;
  message.setState(3);
  EXPECT_EQ(message.state(), 3);
  message.setHasState(false);
  EXPECT_EQ(message.state(), 0);
  message.setHasState(true);
  EXPECT_EQ(message.state(), 3) << "the stored value was only hidden";
}

TEST(ObjectAccessors, takeNullForAbsent) {
  BearerContext bearer;
  EXPECT_FALSE(bearer.hasApn());
  bearer.setApn("");
  EXPECT_TRUE(bearer.hasApn()) << "an empty text is present";
  bearer.setApn(std::nullopt);
  EXPECT_FALSE(bearer.hasApn());
  bearer.setPdpAddr(Bytes{});
  EXPECT_TRUE(bearer.hasPdpAddr());
  EXPECT_EQ(hexText(bearer.data()), "2a00");

  KCellularEmmContext context;
  EXPECT_FALSE(context.hasGuti());
  EXPECT_EQ(context.guti(), nullptr);
  const auto guti = std::make_shared<Guti>();
  context.setGuti(guti);
  EXPECT_TRUE(context.hasGuti());
  EXPECT_EQ(context.guti(), guti);
}

TEST(RepeatedMessageAccessors, addCountReplaceAndClear) {
  KCellularLteServingCellMeasurement message;
  EXPECT_EQ(message.rxInfosCount(), 0U);
  const auto first = std::make_shared<RxInfo>();
  const auto second = std::make_shared<RxInfo>();
  message.addRxInfo(first);
  message.addRxInfo(second);
  EXPECT_EQ(message.rxInfosCount(), 2U);
  EXPECT_EQ(message.rxInfoAtIndex(1), second);
  message.setRxInfos({second});
  EXPECT_EQ(message.rxInfos(), (MessageList<RxInfo>{second}));
  message.clearRxInfos();
  EXPECT_EQ(message.rxInfosCount(), 0U);
  EXPECT_TRUE(message.data().empty());
}

TEST(PackedAccessors, addCountReplaceAndClear) {
  KCellularLteSelReselCellInfo info;
  info.addMultiBandInfo(3);
  info.addMultiBandInfo(300);
  EXPECT_EQ(info.multiBandInfosCount(), 2U);
  EXPECT_EQ(info.multiBandInfos()[1], 300U);
  EXPECT_EQ(hexText(info.data()), "120303ac02");
  const std::uint32_t bands[] = {1, 2, 3};
  info.setMultiBandInfos(bands, 3);
  EXPECT_EQ(info.multiBandInfoAtIndex(2), 3U);
  info.clearMultiBandInfos();
  EXPECT_EQ(info.multiBandInfosCount(), 0U);
  EXPECT_TRUE(info.data().empty()) << "a packed field without values writes nothing";
}

TEST(AccessorNames, takeThePluralOnlyWhereTheKeyHasNone) {
  // "scc_list" becomes sccLists, "bearer_contexts" stays bearerContexts.
  KCellularLteCarrierAggregationStatus status;
  status.addSccList(std::make_shared<SecondaryComponentCarrier>());
  EXPECT_EQ(status.sccListsCount(), 1U);
  KCellularActivatedBearerContexts contexts;
  contexts.addBearerContexts(std::make_shared<BearerContext>());
  EXPECT_EQ(contexts.bearerContextsCount(), 1U);
  EXPECT_EQ(contexts.bearerContextsAtIndex(0)->cid(), 0U);
}

TEST(AccessorNames, keepAFieldCalledHasApartFromPresence) {
  SecondaryComponentCarrier carrier;
  carrier.setHasUplink(true);
  EXPECT_TRUE(carrier.hasUplink());
  EXPECT_TRUE(carrier.hasHasUplink());
  carrier.setHasHasUplink(false);
  EXPECT_TRUE(carrier.data().empty());
}

TEST(PresenceWord, isAsNarrowAsTheScalarsAllow) {
  EXPECT_EQ(sizeof(PresenceWord<1>), 1U);
  EXPECT_EQ(sizeof(PresenceWord<8>), 1U);
  EXPECT_EQ(sizeof(PresenceWord<9>), 2U);
  EXPECT_EQ(sizeof(PresenceWord<16>), 2U);
  EXPECT_EQ(sizeof(PresenceWord<17>), 4U);
  EXPECT_EQ(sizeof(PresenceWord<32>), 4U);
}

TEST(EnumNames, areFoundByValueOnly) {
  EXPECT_EQ(nameOf(kLteRrcCauseNames, 0), "KLTE_RRC_CAUSE_EST_EMERGENCY");
  EXPECT_EQ(nameOf(kLteRrcCauseNames, 30), "KLTE_RRC_CAUSE_REEST_OTHER_FAIL_INTEG_CHECK");
  EXPECT_EQ(nameOf(kLteRrcCauseNames, 31), "");
  EXPECT_EQ(nameOf(kLteRrcCauseNames, 255), "KLTE_RRC_CAUSE_NA");
  EXPECT_EQ(nameOf(kLteRrcCauseNames, 256), "");
  EXPECT_EQ(nameOf(kLteRrcCauseNames, -1), "");
}

}  // namespace
}  // namespace qel
