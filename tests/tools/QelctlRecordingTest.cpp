#include <csignal>
#include <nlohmann/json.hpp>

#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "metrics/MetricValidator.h"
#include "tools/Qelctl.h"
#include "ui/screens/QelViewItems.h"

namespace qel::testing {
namespace {

using V = MetricValidator;
using Lines = std::vector<std::string>;

std::string rrcState(std::int32_t state) {
  KCellularLteRrcState message;
  message.setTimestamp(1500000000000);
  message.setState(state);
  return metricLine(V::K_LTE_RRC_STATE, message);
}

std::string txPower(int entries) {
  KCellularLteTxPower message;
  for (int i = 0; i < entries; ++i) {
    auto info = std::make_shared<TxPowerInfo>();
    info->setPucchTxPower(12 + i);
    message.addTxPowerInfo(info);
  }
  return metricLine(V::K_LTE_TX_POWER, message);
}

TEST(QelctlReplay, printsTheLinesOfTheDispatcher) {
  const TemporaryRecording recording(rrcState(3) + kTriggerLine +
                                     metricLine(V::K_LTE_RLF, Bytes{}));
  const Outcome outcome = qelctl({"replay", recording.path()});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_EQ(outcome.err, "");
  EXPECT_EQ(linesOf(outcome.out),
            (Lines{"Metric ID in Hex = 3C4E04",
                   "Current RRC state is {\"timestamp\": \"2017-07-14 02:40:00 UTC\", "
                   "\"state\": \"KLTE_RRC_STATE_CONNECTED\"}",
                   "Received Valid Metric", "I dont care for events", "Metric ID in Hex = 3C4E25",
                   "I dont care for this Metric"}));
}

TEST(QelctlReplay, keepsWhatCameBeforeABadLineAndNamesIt) {
  const TemporaryRecording recording(rrcState(3) + "nonsense\n" + rrcState(1));
  const Outcome outcome = qelctl({"replay", recording.path()});
  EXPECT_EQ(outcome.exitCode, 65);
  EXPECT_EQ(linesOf(outcome.out).size(), 3U);
  EXPECT_TRUE(outcome.err.starts_with("qelctl: " + recording.path() + ":2: ")) << outcome.err;
  EXPECT_EQ(linesOf(outcome.err).size(), 1U);
}

TEST(QelctlReplay, skipsBadLinesWhenItIsToldTo) {
  const TemporaryRecording recording("nonsense\n" + rrcState(3) + "{}\n" + rrcState(1));
  const Outcome outcome = qelctl({"replay", "--skip-bad", recording.path()});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_EQ(linesOf(outcome.out).size(), 6U);
  EXPECT_EQ(outcome.err, "qelctl: " + recording.path() + ": bad lines skipped: 2\n");
}

TEST(QelctlReplay, reportsAndIgnoresALastLineCutOff) {
  const TemporaryRecording recording(rrcState(3) + rrcState(1).substr(0, 30));
  const Outcome outcome = qelctl({"replay", recording.path()});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_EQ(linesOf(outcome.out).size(), 3U);
  EXPECT_EQ(linesOf(outcome.err).size(), 1U);
}

TEST(QelctlReplay, takesAMetricWithoutAPayloadAsAnEmptyMessage) {
  const TemporaryRecording recording(
      "{\"time_ms\": 1, \"event\": \"metric\", \"kKeyMetricID\": 3952132}\n");
  const Outcome outcome = qelctl({"replay", recording.path()});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_EQ(linesOf(outcome.out).at(1), "Current RRC state is {}");
}

TEST(QelctlReplay, endsAsTheViewerDoesOnAnUndecodablePayload) {
  const TemporaryRecording recording(rrcState(3) + metricLine(V::K_LTE_RRC_STATE, Bytes{0x08}));
  const Outcome outcome = qelctl({"replay", recording.path()});
  EXPECT_EQ(outcome.signal, SIGABRT);
  EXPECT_EQ(outcome.err, "fatal error: metric 3C4E04 has an undecodable payload\n");
  EXPECT_EQ(linesOf(outcome.out).back(), "Metric ID in Hex = 3C4E04");
  EXPECT_EQ(linesOf(outcome.out).size(), 4U);
}

TEST(QelctlStore, printsEverySlotAndRecordInOrder) {
  const TemporaryRecording recording(rrcState(3) + txPower(2));
  const Outcome outcome = qelctl({"store", recording.path()});
  ASSERT_EQ(linesOf(outcome.out).size(), 1U);
  const auto json = nlohmann::ordered_json::parse(outcome.out);
  const auto keys = [](const nlohmann::ordered_json& object) {
    Lines names;
    for (const auto& item : object.items()) names.push_back(item.key());
    return names;
  };
  EXPECT_EQ(keys(json), (Lines{"slots", "myLTE", "myUMTS", "myGSM", "myCommon"}));
  EXPECT_EQ(json["slots"].size(), 30U);
  EXPECT_EQ(json["slots"]["myLTERRCStateDict"]["state"], "KLTE_RRC_STATE_CONNECTED");
  EXPECT_TRUE(json["slots"]["myLTESCellMeasDict"].is_null());
  EXPECT_EQ(keys(json["myLTE"]),
            (Lines{"SelReselCellInfo", "EutraNbrs", "RsrpRsrqSinr", "TxPower", "EutraNbrsMeas",
                   "UtraNbrsMeas", "GeraNbrsMeas", "CAStatusList", "MMCommonInfo", "IMSI"}));
  EXPECT_EQ(json["myLTE"]["TxPower"][1]["pucch_tx_power"], 13);
  EXPECT_EQ(json["myLTE"]["IMSI"], "Come Back Later");
  EXPECT_EQ(keys(json["myUMTS"]),
            (Lines{"rXInfo", "TxPower", "SelReselCellInfo", "eUtraNbrs", "utraNbrs", "geraNbrs",
                   "eUtraNbrMeas", "utraNbrMeas", "geraNbrMeas"}));
  EXPECT_EQ(keys(json["myGSM"]), (Lines{"eUtraNbrMeas", "utraNbrMeas", "geraNbrMeas"}));
  EXPECT_EQ(keys(json["myCommon"]), (Lines{"activeBearer", "simContents"}));
}

TEST(QelctlScreen, drawsACategoryAsJson) {
  const TemporaryRecording recording(txPower(2));
  EXPECT_EQ(qelctl({"screen", "--json", recording.path(), "LTE", "Tx Power"}).out,
            "{\"key\": \"LTE Tx Power\", \"sections\": ["
            "{\"title\": \"TxPowerInfo 0\", \"rows\": [[\"pucch_tx_power\", \"12\"]]}, "
            "{\"title\": \"TxPowerInfo 1\", \"rows\": [[\"pucch_tx_power\", \"13\"]]}]}\n");
}

TEST(QelctlScreen, drawsALabelWithoutTextAsNull) {
  const TemporaryRecording recording(kTriggerLine);
  const Outcome outcome =
      qelctl({"screen", "--json", recording.path(), "LTE", "Serving Cell Info"});
  EXPECT_EQ(outcome.out,
            "{\"key\": \"LTE Serving Cell Info\", \"sections\": [{\"title\": null, \"rows\": "
            "[[null, null]]}]}\n");
}

TEST(QelctlScreen, drawsATableForPeople) {
  const TemporaryRecording recording(txPower(1));
  EXPECT_EQ(qelctl({"screen", recording.path(), "LTE", "Tx Power"}).out,
            "LTE Tx Power\n\nTxPowerInfo 0\n  pucch_tx_power  12\n");
}

TEST(QelctlScreen, letsNoTextCommandTheTerminal) {
  BearerContext bearer;
  bearer.setApn("a\x1B[2J\xC2\x9Bz");
  KCellularActivatedBearerContexts contexts;
  contexts.addBearerContexts(std::make_shared<BearerContext>(bearer));
  const TemporaryRecording recording(metricLine(V::K_CELLULAR_ACTIVE_BEARER, contexts));
  EXPECT_EQ(qelctl({"screen", recording.path(), "LTE", "Active Bearers"}).out,
            "LTE Active Bearers\n\nPDP 0\n  apn  a [2J z\n");
}

// Text that runs from right to left hid what stood beside it.
TEST(QelctlScreen, letsNoTextTurnTheLine) {
  BearerContext bearer;
  bearer.setApn("a\xE2\x80\xAE\xE2\x81\xA7z");
  KCellularActivatedBearerContexts contexts;
  contexts.addBearerContexts(std::make_shared<BearerContext>(bearer));
  const TemporaryRecording recording(metricLine(V::K_CELLULAR_ACTIVE_BEARER, contexts));
  EXPECT_EQ(qelctl({"screen", recording.path(), "LTE", "Active Bearers"}).out,
            "LTE Active Bearers\n\nPDP 0\n  apn  a  z\n");
}

TEST(QelctlScreen, asksToComeBackLaterForAKeyThatNoRoutineKnows) {
  const TemporaryRecording recording("");
  EXPECT_EQ(qelctl({"screen", "--json", recording.path(), "Device Info", "IMSI"}).out,
            "{\"key\": \"Device Info IMSI\", \"sections\": [{\"title\": null, \"rows\": "
            "[[\"Come back later\", \"Come back later\"]]}]}\n");
}

// A name that no table has was answered like a table without values, and nothing else was said.
TEST(QelctlScreen, saysWhenNoTableHasThatName) {
  const TemporaryRecording recording(kTriggerLine);
  const Outcome unknown = qelctl({"screen", "--json", recording.path(), "LTE", "TX Power"});
  EXPECT_EQ(unknown.exitCode, 0);
  EXPECT_NE(unknown.out.find("[[\"Come back later\", \"Come back later\"]]"), std::string::npos);
  EXPECT_EQ(
      unknown.err,
      "qelctl: no table is named \"LTE TX Power\"; qelctl screens FILE draws all there are\n");
  EXPECT_EQ(qelctl({"screen", recording.path(), "LTE", "Tx Power"}).err, "");
  EXPECT_EQ(qelctl({"screen", recording.path(), "Device Info", "IMSI"}).err, "");
}

TEST(QelctlScreens, drawsEveryCategoryOfTheMenuInItsOrder) {
  for (const std::string& content : {std::string(), rrcState(3) + txPower(3)}) {
    const TemporaryRecording recording(content);
    const auto lines = linesOf(qelctl({"screens", recording.path()}).out);
    Lines keys;
    const QelViewItems items;
    for (const std::string& technology : items.launchViewItemNames) {
      for (const std::string& category : items.firstLevelViewItems.at(technology)) {
        keys.push_back(technology + " " + category);
      }
    }
    ASSERT_EQ(keys.size(), 42U);
    ASSERT_EQ(lines.size(), keys.size());
    for (std::size_t i = 0; i < lines.size(); ++i) {
      EXPECT_EQ(nlohmann::json::parse(lines[i])["key"], keys[i]);
    }
  }
}

}  // namespace
}  // namespace qel::testing
