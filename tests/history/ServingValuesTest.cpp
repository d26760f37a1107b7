#include <gtest/gtest.h>

#include "history/Followed.h"
#include "messages/gsm.h"
#include "messages/wcdma.h"

namespace qel {
namespace {

using testing::Followed;
using V = MetricValidator;

constexpr std::uint64_t kStart = 1'500'000'000'000;

std::optional<float> newest(const Followed& followed, Quantity quantity) {
  const auto point = followed.history.series(quantity).last(kStart);
  return point ? std::optional(point->value) : std::nullopt;
}

template <class Message>
Message withReceivers(std::initializer_list<std::array<std::int32_t, 3>> receivers) {
  Message message;
  for (const auto& [level, quality, snr] : receivers) {
    auto receiver = std::make_shared<RxInfo>();
    receiver->setRsrpRange(static_cast<std::uint32_t>(level));
    receiver->setRsrqRange(static_cast<std::uint32_t>(quality));
    receiver->setSnr(snr);
    message.addRxInfo(receiver);
  }
  return message;
}

TEST(ServingValues, takeTheBetterAntennaOfTheAverage) {
  Followed followed;
  KCellularLteRsrpRsrqSinr report;
  auto values = std::make_shared<RsrpRsrqSinr>();
  values->setRsrp0(-101);
  values->setRsrp1(-98);
  values->setRsrq0(-11);
  values->setSinr0(25);
  values->setSinr1(-4);
  report.setAvgValues(values);
  followed.feed(kStart, V::K_LTE_RSRP_RSRQ_SINR, report);
  EXPECT_EQ(newest(followed, Quantity::lteRsrp), -98.0F);
  EXPECT_EQ(newest(followed, Quantity::lteRsrq), -11.0F);
  EXPECT_EQ(newest(followed, Quantity::lteSinr), 12.5F);
  EXPECT_FALSE(newest(followed, Quantity::umtsRscp));
}

// No handler takes this one; its values are the most frequent there are.
TEST(ServingValues, takeTheReceiversOfAMeasurementThatNobodyHandles) {
  Followed followed;
  followed.feed(kStart, V::K_LTE_SCELL_MEAS,
                withReceivers<KCellularLteServingCellMeasurement>({{27, 20, 4}, {31, 255, -2}}));
  EXPECT_EQ(newest(followed, Quantity::lteRsrp), -109.0F);
  EXPECT_EQ(newest(followed, Quantity::lteRsrq), -9.5F) << "255 stands for no quality";
  EXPECT_EQ(newest(followed, Quantity::lteSinr), 4.0F);
  EXPECT_TRUE(followed.history.lastReport(V::K_LTE_SCELL_MEAS, kStart));
  EXPECT_EQ(followed.history.lastReceivedMs(kStart), kStart);
}

TEST(ServingValues, takeReceiversThatComeInAnyOrderAndWithMoreThanIsKnown) {
  const Bytes weak = {0x1A, 0x06, 0x20, 0x03, 0x18, 0x08, 0x10, 0x14};
  const Bytes later = {0xA0, 0x06, 0x01};
  const Bytes strong = {0x1A, 0x09, 0x10, 0x63, 0x10, 0x19, 0xA0, 0x06, 0x01, 0x18, 0x06};
  Bytes payload = weak;
  payload.insert(payload.end(), later.begin(), later.end());
  payload.insert(payload.end(), strong.begin(), strong.end());
  payload.insert(payload.end(), {0x10, 0x01, 0x08, 0x05});
  Followed followed;
  followed.feed(kStart, V::K_LTE_SCELL_MEAS, payload);
  EXPECT_EQ(newest(followed, Quantity::lteRsrp), -115.0F) << "what comes twice is the last";
  EXPECT_EQ(newest(followed, Quantity::lteRsrq), -15.5F);
  EXPECT_EQ(newest(followed, Quantity::lteSinr), -2.0F);
}

TEST(ServingValues, takeNothingFromDamagedBytesThatNobodyHandles) {
  Followed followed;
  followed.feed(kStart, V::K_LTE_SCELL_MEAS, Bytes{0x1A, 0x05, 0x10});
  EXPECT_FALSE(newest(followed, Quantity::lteRsrp));
  EXPECT_TRUE(followed.history.happenings().empty());
}

TEST(ServingValues, readTheIndexesOfUmtsByItsOwnScale) {
  Followed followed;
  followed.feed(kStart, V::K_UMTS_SCELL_MEAS,
                withReceivers<KCellularWcdmaScellMeasurement>({{30, 20, 0}}));
  EXPECT_EQ(newest(followed, Quantity::umtsRscp), -86.0F);
  EXPECT_EQ(newest(followed, Quantity::umtsEcno), -14.5F);
  EXPECT_FALSE(newest(followed, Quantity::lteRsrp));
}

TEST(ServingValues, readGsmIdleAndInACall) {
  Followed idle;
  KCellularGsmIdleScellMeasurement measurement;
  measurement.setIdleRxlevDBm(-77);
  idle.feed(kStart, V::K_GSM_IDLE_SCELL_MEAS, measurement);
  EXPECT_EQ(newest(idle, Quantity::gsmRxlev), -77.0F);
  Followed call;
  KCellularGsmCsRfMeasurement inCall;
  inCall.setCsRxlevSub(30);
  call.feed(kStart, V::K_GSM_CS_RF_MEAS, inCall);
  EXPECT_EQ(newest(call, Quantity::gsmRxlev), -80.0F);
}

TEST(ServingValues, leaveOutWhatNoPhoneCanReport) {
  Followed followed;
  KCellularLteRsrpRsrqSinr report;
  auto values = std::make_shared<RsrpRsrqSinr>();
  values->setRsrp0(0);
  values->setRsrq0(100);
  values->setSinr0(-2147483647);
  report.setAvgValues(values);
  followed.feed(kStart, V::K_LTE_RSRP_RSRQ_SINR, report);
  for (const Quantity quantity : kQuantities) EXPECT_FALSE(newest(followed, quantity));
}

}  // namespace
}  // namespace qel
