// How a message is read from its bytes: what counts, what is ignored, what ends it.
#include <gtest/gtest.h>

#include "Wire.h"
#include "base/Rendering.h"
#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"

namespace qel {
namespace {

using testing::decoded;
using testing::delimitedField;
using testing::ExactBuffer;
using testing::hex;
using testing::joined;
using testing::tag;
using testing::varint;
using testing::varintField;
using testing::WireType;

// The dictionary form of what the bytes decode to, or "nothing".
template <class Message>
std::string shown(const Bytes& bytes) {
  const auto message = decoded<Message>(bytes);
  return message ? jsonText(message->dictionaryRepresentation()) : "nothing";
}

TEST(Reading, followsTheWorkedExample) {
  const Bytes bytes = hex("08e807100320fa01");
  const auto message = decoded<KCellularLteRrcState>(bytes);
  ASSERT_TRUE(message);
  EXPECT_TRUE(message->hasTimestamp());
  EXPECT_TRUE(message->hasState());
  EXPECT_FALSE(message->hasPrevState());
  EXPECT_TRUE(message->hasPrevStateDurMs());
  EXPECT_FALSE(message->hasCause());
  EXPECT_EQ(
      jsonText(message->dictionaryRepresentation()),
      R"({"timestamp": 1000, "state": "KLTE_RRC_STATE_CONNECTED", "prev_state_dur_ms": 250})");
  EXPECT_EQ(message->data(), bytes);

  KCellularLteRrcState made;
  made.setTimestamp(1000);
  made.setState(3);
  made.setPrevStateDurMs(250);
  EXPECT_EQ(made.data(), bytes);
}

TEST(Reading, givesNothingForAVarintThatIsCutOff) {
  EXPECT_EQ(shown<KCellularLteRrcState>(hex("08e807100320fa")), "nothing");
  EXPECT_EQ(shown<KCellularLteRrcState>(hex("08")), "nothing");
}

TEST(Reading, takesNoBytesForAMessageWithoutFields) {
  EXPECT_EQ(shown<KCellularLteRrcState>({}), "{}");
  EXPECT_EQ(shown<KCellularLteSelReselCellInfo>({}), R"({"multi_band_info": []})");
  EXPECT_EQ(shown<KCellularGsmCsRfMeasurement>({}), R"({"cs_tx_pwr": []})");
}

TEST(Reading, failsOnAReaderWhoseErrorFlagIsSetAlready) {
  PBDataReader reader({});
  reader._error = true;
  KCellularLteRrcState message;
  EXPECT_FALSE(message.readFrom(reader));
}

TEST(Reading, addsToWhatIsThere) {
  KCellularLteRrcState message;
  message.setCause(7);
  const ExactBuffer input(hex("0805"));
  PBDataReader reader(input.view());
  EXPECT_TRUE(message.readFrom(reader));
  EXPECT_EQ(message.cause(), 7);
  EXPECT_EQ(message.timestamp(), 5U);
}

TEST(Reading, endsAtAnEndOfGroupWithoutError) {
  for (const std::uint64_t number : {0U, 1U, 100U, 19972U}) {
    EXPECT_EQ(shown<KCellularLteRrcState>(
                  joined(varintField(1, 5), tag(number, WireType::groupEnd), varintField(2, 3))),
              R"({"timestamp": 5})")
        << number;
  }
  EXPECT_EQ(shown<KCellularLteRrcState>(joined(tag(1, WireType::groupEnd), hex("ffff"))), "{}");
}

TEST(Reading, goesOnInTheOuterMessageBehindAnEndOfGroupInANestedOne) {
  // The nested message ends early; its remaining bytes are read as fields of the outer one.
  const Bytes nested = joined(varintField(1, 40), tag(1, WireType::groupEnd), varintField(2, 1));
  EXPECT_EQ(shown<KCellularLteServingCellMeasurement>(
                joined(delimitedField(3, nested), varintField(1, 5))),
            R"({"timestamp": 5, "is_connected_mode": true, "rx_info": [{"rssi": 20}]})");
}

TEST(Reading, ignoresTheWireTypeOfAKnownField) {
  for (const auto type : {WireType::fixed64, WireType::delimited, WireType::groupStart,
                          WireType::fixed32, static_cast<WireType>(6), static_cast<WireType>(7)}) {
    SCOPED_TRACE(static_cast<int>(type));
    EXPECT_EQ(shown<KCellularLteRrcState>(joined(tag(1, type), varint(300), varintField(2, 1))),
              R"({"timestamp": 300, "state": "KLTE_RRC_STATE_IDLE"})");
  }
  for (const auto type : {WireType::varint, WireType::fixed64, WireType::groupStart,
                          WireType::fixed32, static_cast<WireType>(6)}) {
    SCOPED_TRACE(static_cast<int>(type));
    EXPECT_EQ(shown<KCellularMmCommonInfo>(joined(tag(2, type), hex("02aabb"))),
              R"({"imsi": "<aabb>"})");
    EXPECT_EQ(shown<BearerContext>(joined(tag(3, type), hex("026162"))), R"({"apn": "ab"})");
    EXPECT_EQ(shown<KCellularLteSelReselCellInfo>(joined(tag(2, type), hex("020103"))),
              R"({"multi_band_info": [1, 3]})");
    EXPECT_EQ(shown<KCellularEmmContext>(joined(tag(6, type), hex("020801"))),
              R"({"guti": {"mmegi": 1}})");
  }
}

TEST(Reading, takesOnlyTheLow16BitsOfAFieldNumber) {
  EXPECT_EQ(shown<KCellularLteRrcState>(varintField(0x10001, 5)), R"({"timestamp": 5})");
  EXPECT_EQ(shown<KCellularLteRrcState>(varintField(0x10000, 5)), "{}");
}

TEST(Reading, skipsUnknownFieldsOfEveryWireTypeAndFieldZero) {
  EXPECT_EQ(shown<KCellularLteRrcState>(
                joined(varintField(0, 1), varintField(60, 1), tag(61, WireType::fixed64),
                       Bytes(8, 0xFF), delimitedField(62, Bytes(3, 0xFF)),
                       tag(63, WireType::fixed32), Bytes(4, 0xFF), varintField(1, 5))),
            R"({"timestamp": 5})");
}

TEST(Reading, failsOnAnUnknownFieldThatCannotBeSkipped) {
  EXPECT_EQ(shown<KCellularLteRrcState>(joined(varintField(1, 5), hex("e603"))), "nothing");
  EXPECT_EQ(shown<KCellularLteRrcState>(joined(varintField(1, 5), hex("e703"))), "nothing");
  EXPECT_EQ(shown<KCellularLteRrcState>(joined(varintField(1, 5), hex("e20305aabb"))), "nothing");
}

TEST(Reading, keepsTheLastValueOfAFieldThatComesTwice) {
  EXPECT_EQ(shown<KCellularLteRrcState>(joined(varintField(1, 5), varintField(1, 6))),
            R"({"timestamp": 6})");
  EXPECT_EQ(
      shown<BearerContext>(joined(delimitedField(3, hex("61")), delimitedField(3, hex("62")))),
      R"({"apn": "b"})");
  EXPECT_EQ(shown<Plmn>(joined(delimitedField(1, hex("61")), delimitedField(1, {}))),
            R"({"encoded_plmn": "<>"})");
}

TEST(Reading, replacesASingleNestedMessageInsteadOfMergingIt) {
  EXPECT_EQ(shown<KCellularEmmContext>(
                joined(delimitedField(6, varintField(1, 5)), delimitedField(6, varintField(2, 6)))),
            R"({"guti": {"mmec": 6}})");
}

TEST(Reading, collectsRepeatedFields) {
  EXPECT_EQ(shown<KCellularMmCommonInfo>(joined(delimitedField(3, {}), varintField(1, 5),
                                                delimitedField(3, delimitedField(1, hex("aa"))))),
            R"({"timestamp": 5, "eplmn_list": [{}, {"encoded_plmn": "<aa>"}]})");
  EXPECT_EQ(shown<KCellularLteSelReselCellInfo>(
                joined(delimitedField(2, hex("01")), delimitedField(2, hex("0307")))),
            R"({"multi_band_info": [1, 3, 7]})");
}

TEST(Reading, takesAZeroLengthPackedRunForNoValues) {
  const auto message = decoded<KCellularLteSelReselCellInfo>(delimitedField(2, {}));
  ASSERT_TRUE(message);
  EXPECT_EQ(message->multiBandInfosCount(), 0U);
  EXPECT_TRUE(message->data().empty());
}

TEST(Reading, unfoldsTheValuesOfASignedPackedRun) {
  EXPECT_EQ(shown<KCellularGsmCsRfMeasurement>(delimitedField(5, hex("000102ffffffff0f"))),
            R"({"cs_tx_pwr": [0, -1, 1, -2147483648]})");
}

TEST(Reading, failsOnAPackedRunThatCutsAValueOrPassesTheEnd) {
  EXPECT_EQ(shown<KCellularLteSelReselCellInfo>(delimitedField(2, hex("0180"))), "nothing");
  EXPECT_EQ(shown<KCellularLteSelReselCellInfo>(hex("120301")), "nothing");
  EXPECT_EQ(shown<KCellularLteSelReselCellInfo>(hex("12ffffffffffffffffff01")), "nothing");
}

TEST(Reading, failsOnANestedMessageThatFailsAndLeavesItAttached) {
  KCellularLteServingCellMeasurement message;
  const ExactBuffer input(delimitedField(3, joined(varintField(2, 97), hex("0880"))));
  PBDataReader reader(input.view());
  EXPECT_FALSE(message.readFrom(reader));
  ASSERT_EQ(message.rxInfosCount(), 1U);
  EXPECT_EQ(message.rxInfoAtIndex(0)->rsrpRange(), 97U);
}

TEST(Reading, setsThePresenceBitBeforeTheValueIsRead) {
  KCellularLteRrcState message;
  message.setTimestamp(7);
  const ExactBuffer input(hex("0880"));
  PBDataReader reader(input.view());
  EXPECT_FALSE(message.readFrom(reader));
  EXPECT_TRUE(message.hasTimestamp());
  EXPECT_EQ(message.timestamp(), 0U);
}

TEST(Reading, takesATenByteVarintWithoutAnEndForZeroAndGoesOn) {
  EXPECT_EQ(shown<KCellularLteRrcState>(joined(hex("08"), Bytes(10, 0xFF), varintField(2, 1))),
            R"({"timestamp": 0, "state": "KLTE_RRC_STATE_IDLE"})");
  // The eleventh byte begins the next tag: here field 0, which no message has.
  EXPECT_EQ(shown<KCellularLteRrcState>(
                joined(hex("08"), Bytes(10, 0xFF), hex("0001"), varintField(2, 1))),
            R"({"timestamp": 0, "state": "KLTE_RRC_STATE_IDLE"})");
}

TEST(Reading, takesATagOfTenBytesWithoutAnEndForFieldZero) {
  EXPECT_EQ(shown<KCellularLteRrcState>(joined(Bytes(10, 0xFF), hex("7f"), varintField(1, 5))),
            R"({"timestamp": 5})");
}

TEST(Reading, takesALengthOfTenBytesWithoutAnEndForNothing) {
  EXPECT_EQ(shown<KCellularLteServingCellMeasurement>(
                joined(hex("1a"), Bytes(10, 0xFF), varintField(1, 5))),
            R"({"timestamp": 5, "rx_info": [{}]})");
}

TEST(Reading, cutsWideVarintsTo32Bits) {
  EXPECT_EQ(shown<KCellularLteRrcState>(varintField(4, 0x1'0000'0007)),
            R"({"prev_state_dur_ms": 7})");
  EXPECT_EQ(shown<KCellularLteRrcState>(varintField(2, 0x1'0000'0001)),
            R"({"state": "KLTE_RRC_STATE_IDLE"})");
  EXPECT_EQ(shown<RxInfo>(varintField(1, 0x1'0000'0001)), R"({"rssi": -1})");
  EXPECT_EQ(shown<KCellularLteServingCellMeasurement>(varintField(2, 0x1'0000'0000)),
            R"({"is_connected_mode": true})");
}

}  // namespace
}  // namespace qel
