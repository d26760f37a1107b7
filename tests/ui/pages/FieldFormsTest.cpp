#include "ui/pages/FieldForms.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

// "label: text; label: text" of the value under the key, as a report of that class has it.
std::string partsIn(const char* message, const char* key, const Dictionary& record) {
  const MessageFacts& facts = *findMessageFacts(message);
  std::string text;
  for (const auto& [label, value] : partsOf({*facts.find(key), *record.find(key), facts, record})) {
    text += (text.empty() ? "" : "; ") + label + ": " + value;
  }
  return text;
}

TEST(FieldForms, splitCellIdentities) {
  EXPECT_EQ(partsIn("KCellularLteScellInfo", "cell_id", {{"cell_id", 0x1234504U}}),
            "eNodeB: 74565; Sector: 4");
  EXPECT_EQ(partsIn("KCellularWcdmaCellInfo", "cell_id", {{"cell_id", 0x0C90011U}}),
            "RNC: 201; Cell: 17");
  EXPECT_EQ(partsIn("KCellularGsmScellInfo", "bsic", {{"bsic", 42U}}),
            "Colour of the network: 5; Colour of the station: 2");
}

TEST(FieldForms, turnChannelsIntoFrequencies) {
  EXPECT_EQ(partsIn("KCellularLteScellInfo", "dl_freq", {{"dl_freq", 1575U}}),
            "Frequencies: 1842.5 MHz down, 1747.5 MHz up; Lies in: band 3");
  EXPECT_EQ(partsIn("KCellularLteScellInfo", "freq_band_ind", {{"freq_band_ind", 38U}}),
            "Spans: 2570.0 to 2620.0 MHz");
  EXPECT_EQ(partsIn("KCellularLteScellInfo", "ul_freq", {{"ul_freq", 19575U}}),
            "Frequency: 1747.5 MHz up");
  EXPECT_EQ(partsIn("KCellularWcdmaCellInfo", "dl_uarfcn", {{"dl_uarfcn", 10562U}}),
            "Frequencies: 2112.4 MHz down, 1922.4 MHz up; Lies in: band I");
  EXPECT_EQ(partsIn("KCellularLteScellInfo", "dl_freq", {{"dl_freq", 5000U}}), "");
}

TEST(FieldForms, tellBothCarriersOfAnArfcnThatNothingDecides) {
  EXPECT_EQ(partsIn("KCellularGsmScellInfo", "arfcn", {{"mcc", 262U}, {"arfcn", 661U}}),
            "Frequencies: 1835.0 MHz down, 1740.0 MHz up; Lies in: DCS 1800");
  EXPECT_EQ(partsIn("GsmCellMeasResult", "arfcn", {{"arfcn", 661U}}),
            "If DCS 1800: 1835.0 MHz down, 1740.0 MHz up; "
            "If PCS 1900: 1960.0 MHz down, 1880.0 MHz up");
  EXPECT_EQ(partsIn("GsmCellMeasResult", "arfcn", {{"arfcn", 900U}}), "");
}

TEST(FieldForms, nameNetworksWithAllTheirDigits) {
  const Dictionary record = {{"num_mnc_digits", 3U}, {"sel_plmn_mcc", 310U}, {"sel_plmn_mnc", 26U}};
  EXPECT_EQ(partsIn("KCellularLteScellInfo", "sel_plmn_mcc", record), "Network: 310-026");
  EXPECT_EQ(partsIn("KCellularLteScellInfo", "sel_plmn_mnc", record), "Network: 310-026");
  EXPECT_EQ(partsIn("GsmNcellMeas", "mcc", {{"mcc", 460U}, {"mnc", 0U}}), "Network: 460-00");
  EXPECT_EQ(partsIn("GsmNcellMeas", "mcc", {{"mcc", 460U}}), "") << "half of it";
  EXPECT_EQ(partsIn("Plmn", "encoded_plmn", {{"encoded_plmn", Bytes{0x62, 0xF2, 0x10}}}),
            "MCC-MNC: 262-01");
}

TEST(FieldForms, openAreasAndTemporaryIdentities) {
  const Dictionary area = {{"encoded_plmn", Bytes{0x62, 0xF2, 0x10}}, {"tac", 4097U}};
  EXPECT_EQ(partsIn("KCellularEmmContext", "tai_list", {{"tai_list", List{area, area}}}),
            "0: Network 262-01, Tracking area code 4097 (0x1001); "
            "1: Network 262-01, Tracking area code 4097 (0x1001)");
  const Dictionary guti = {{"mmegi", 32769U}, {"mmec", 1U}, {"m_tmsi", 0xC0000002U}};
  EXPECT_EQ(partsIn("KCellularEmmContext", "guti", {{"guti", guti}}),
            "MME group: 32769 (0x8001); MME code: 1 (0x01); M-TMSI: 3221225474 (0xc0000002)");
}

TEST(FieldForms, sayHowManyEntriesOfALongListAreLeftOut) {
  List areas;
  for (std::uint32_t code = 0; code < 100; ++code) areas.emplace_back(Dictionary{{"tac", code}});
  areas[1] = Dictionary();
  const MessageFacts& message = *findMessageFacts("KCellularEmmContext");
  const Dictionary record = {{"tai_list", areas}};
  const auto parts =
      partsOf({*message.find("tai_list"), *record.find("tai_list"), message, record});
  ASSERT_EQ(parts.size(), kMostFieldParts + 1);
  EXPECT_EQ(parts[1], (FieldPart{"1", "empty"}));
  EXPECT_EQ(parts[63], (FieldPart{"63", "Tracking area code 63 (0x3f)"}));
  EXPECT_EQ(parts[64], (FieldPart{"And", "36 more"}));
}

TEST(FieldForms, readIdentitiesAddressesAndFiles) {
  const Bytes imsi = {8, 0x09, 0x10, 0x10, 0x32, 0x54, 0x76, 0x98, 0x00};
  EXPECT_EQ(partsIn("KCellularMmCommonInfo", "imsi", {{"imsi", imsi}}), "Digits: 001012345678900");
  EXPECT_EQ(partsIn("BearerContext", "pdp_addr", {{"pdp_addr", Bytes{192, 0, 2, 118}}}),
            "IPv4: 192.0.2.118");
  const Dictionary file = {{"ef_id", 0x6F07U}, {"content", imsi}};
  EXPECT_EQ(partsIn("ElementaryFile", "ef_id", file), "File: EF_IMSI; Holds: subscriber identity");
  EXPECT_EQ(partsIn("ElementaryFile", "content", file), "Digits: 001012345678900");
  EXPECT_EQ(partsIn("ElementaryFile", "content", {{"content", imsi}}), "") << "of no file";
}

TEST(FieldForms, tellWhatCodesStandFor) {
  EXPECT_EQ(partsIn("KCellularLteScellInfo", "ul_bw", {{"ul_bw", 3U}}), "Stands for: 10.0 MHz");
  EXPECT_EQ(partsIn("KCellularLteScellInfo", "ul_bw", {{"ul_bw", 6U}}), "");
  EXPECT_EQ(partsIn("RxInfo", "rsrp_range", {{"rsrp_range", 54U}}), "Stands for: -86.0 dBm");
  EXPECT_EQ(partsIn("RxInfo", "rsrq_range", {{"rsrq_range", 20U}}), "Stands for: -9.5 dB");
  EXPECT_EQ(partsIn("UmtsNcellMeas", "cpich_ecn0", {{"cpich_ecn0", 49U}}), "Stands for: 0.0 dB");
  EXPECT_EQ(partsIn("KCellularGsmIdleConfig", "emerg_call_allowed", {{"emerg_call_allowed", 1U}}),
            "Means: yes");
  EXPECT_EQ(partsIn("KCellularGsmIdleConfig", "acc", {{"acc", 0x0401U}}), "Classes: 0, 10");
  EXPECT_EQ(partsIn("KCellularLteRrcState", "state", {{"state", "KLTE_RRC_STATE_CONNECTED"}}),
            "Means: connected");
}

TEST(FieldForms, tellTimesAndDurations) {
  EXPECT_EQ(partsIn("KCellularEmmContext", "timestamp", {{"timestamp", 1'500'000'000'000U}}),
            "UTC: 2017-07-14T02:40:00.000Z");
  EXPECT_EQ(partsIn("KCellularEmmContext", "t3412_dur_s", {{"t3412_dur_s", 5405U}}),
            "Lasts: 1 h 30 min 5 s");
  EXPECT_EQ(partsIn("KCellularEmmContext", "t3412_dur_s", {{"t3412_dur_s", 59U}}), "");
  EXPECT_EQ(partsIn("KCellularGsmIdleConfig", "t3212", {{"t3212", 9U}}), "Lasts: 54 min");
  EXPECT_EQ(partsIn("KCellularGsmIdleConfig", "t3212", {{"t3212", 0U}}), "Lasts: never");
}

// A value of a kind that the field cannot have is told as nothing.
TEST(FieldForms, tellNothingOfValuesThatAreNone) {
  for (const MessageFacts& message : messageFacts()) {
    for (const FieldFacts& field : message.fields) {
      for (const Value& value :
           {Value(), Value(true), Value(-1), Value(0.5F), Value("text"), Value(Bytes{}),
            Value(List{}), Value(Dictionary{}), Value(UINT64_MAX)}) {
        const Dictionary record = {{Text(field.key), value}};
        for (const FieldPart& part : partsOf({field, value, message, record})) {
          EXPECT_FALSE(part.label.empty() || part.text.empty()) << message.name << field.key;
        }
      }
    }
  }
}

}  // namespace
}  // namespace qel
