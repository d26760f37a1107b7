// The dictionary form and the description.
#include <gtest/gtest.h>

#include <limits>

#include "Wire.h"
#include "base/Rendering.h"
#include "messages/gsm.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"

namespace qel {
namespace {

using Kind = Value::Kind;

Kind kindOf(const PBCodable& message, std::string_view key) {
  const Dictionary dictionary = message.dictionaryRepresentation();
  const Value* value = dictionary.find(key);
  return value ? value->kind() : Kind::null;
}

TEST(DictionaryForm, holdsEveryKindOfScalarAsItsOwnKind) {
  KCellularLteServingCellMeasurement measurement;
  measurement.setTimestamp(std::numeric_limits<std::uint64_t>::max());
  measurement.setIsConnectedMode(false);
  EXPECT_EQ(kindOf(measurement, "timestamp"), Kind::unsignedInteger);
  EXPECT_EQ(kindOf(measurement, "is_connected_mode"), Kind::boolean);
  EXPECT_EQ(jsonText(measurement.dictionaryRepresentation()),
            R"({"timestamp": 18446744073709551615, "is_connected_mode": false})");
  RxInfo info;
  info.setRssi(-95);
  info.setRsrpRange(50);
  EXPECT_EQ(kindOf(info, "rssi"), Kind::signedInteger);
  EXPECT_EQ(kindOf(info, "rsrp_range"), Kind::unsignedInteger);
}

TEST(DictionaryForm, namesEnumerationsAndShowsUnknownValuesByNumber) {
  KCellularLteRrcState message;
  message.setState(9);
  message.setPrevState(-1);
  message.setCause(255);
  EXPECT_EQ(jsonText(message.dictionaryRepresentation()),
            R"x({"state": "(unknown: 9)", "prev_state": "(unknown: -1)", )x"
            R"("cause": "KLTE_RRC_CAUSE_NA"})");
  message.setState(std::numeric_limits<std::int32_t>::min());
  EXPECT_EQ(message.dictionaryRepresentation().find("state")->asText(), "(unknown: -2147483648)");
}

TEST(DictionaryForm, keepsAnUnknownEnumerationValueThroughReadingAndWriting) {
  const Bytes bytes = testing::varintField(2, static_cast<std::uint64_t>(-77));
  const auto message = testing::decoded<KCellularLteRrcState>(bytes);
  ASSERT_TRUE(message);
  EXPECT_EQ(message->state(), -77);
  EXPECT_EQ(message->data(), bytes);
}

TEST(DictionaryForm, showsDataTextAndNestedMessagesThatArePresent) {
  BearerContext bearer;
  bearer.setApn("internet");
  bearer.setPdpAddr(testing::hex("0a000001"));
  EXPECT_EQ(jsonText(bearer.dictionaryRepresentation()),
            R"({"apn": "internet", "pdp_addr": "<0a000001>"})");
  EXPECT_EQ(kindOf(bearer, "pdp_addr"), Kind::bytes);

  KCellularEmmContext context;
  context.setGuti(std::make_shared<Guti>());
  EXPECT_EQ(jsonText(context.dictionaryRepresentation()), R"({"guti": {}})");
}

TEST(DictionaryForm, leavesEmptyListsOfMessagesOutButKeepsPackedLists) {
  KCellularLteSelReselCellInfo info;
  EXPECT_EQ(jsonText(info.dictionaryRepresentation()), R"({"multi_band_info": []})");
  info.addMultiBandInfo(7);
  info.addNbrEutra(std::make_shared<NbrEutra>());
  EXPECT_EQ(jsonText(info.dictionaryRepresentation()),
            R"({"multi_band_info": [7], "nbr_eutra": [{}]})");
}

TEST(DictionaryForm, keepsTheOrderOfTheFieldsAndTheCapitalsOfTheKeys) {
  KCellularLteSelReselCellInfo info;
  info.setPriorityOperatingFreq(5);
  info.setThreshServingLowP(4);
  info.setQHyst(3);
  info.setQRxLevMin(-60);
  EXPECT_EQ(jsonText(info.dictionaryRepresentation()),
            R"({"multi_band_info": [], "QRxLevMin": -60, "Q_hyst": 3, )"
            R"("Thresh_serving_lowP": 4, "priority_operating_freq": 5})");
}

TEST(Description, isTheClassAndTheDictionaryForm) {
  KCellularLteRrcState message;
  message.setState(3);
  EXPECT_EQ(message.description(),
            R"(<KCellularLteRrcState> {"state": "KLTE_RRC_STATE_CONNECTED"})");
}

}  // namespace
}  // namespace qel
