// qelctl now and signals, on recordings of known content and live.

#include <csignal>
#include <map>
#include <nlohmann/json.hpp>
#include <set>

#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "metrics/MetricValidator.h"
#include "tools/WithService.h"

namespace qel::testing {
namespace {

using Json = nlohmann::json;
using V = MetricValidator;
using Texts = std::vector<std::string>;

std::string at(std::uint64_t timeMs, std::string line) {
  return line.replace(line.find("\"time_ms\": 1,"), 13,
                      "\"time_ms\": " + std::to_string(timeMs) + ",");
}

std::string cellLine() {
  KCellularLteScellInfo cell;
  cell.setPhyCellId(123);
  cell.setDlFreq(1300);
  cell.setCellId((4660U << 8U) + 1);
  cell.setTrackingAreaCode(4711);
  cell.setFreqBandInd(3);
  cell.setNumMncDigits(3);
  cell.setSelPlmnMcc(1);
  cell.setSelPlmnMnc(1);
  return metricLine(V::K_LTE_SCELL_INFO, cell);
}

std::string signalLine(std::int32_t rsrp) {
  auto average = std::make_shared<RsrpRsrqSinr>();
  average->setRsrp0(rsrp);
  average->setRsrq0(-9);
  average->setSinr0(25);
  KCellularLteRsrpRsrqSinr report;
  report.setAvgValues(average);
  return metricLine(V::K_LTE_RSRP_RSRQ_SINR, report);
}

std::string neighbourLine(std::uint32_t pci, std::int32_t rsrpDbm) {
  auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
  cell->setNbrEarfcn(1300);
  cell->setNbrPhysCellId(pci);
  cell->setNbrRsrp(rsrpDbm + 140);
  KCellularLteNbrEutraCellMeas report;
  report.addMeasNbrEutra(cell);
  return metricLine(V::K_LTE_INTRARAT_MEAS, report);
}

constexpr std::uint64_t kStart = 1'800'000'000'000;

std::string drive() {
  return at(kStart, cellLine()) + at(kStart, signalLine(-90)) + at(kStart + 1000, signalLine(-92)) +
         at(kStart + 1500, neighbourLine(200, -99)) + at(kStart + 60'000, signalLine(-101));
}

TEST(QelctlNow, tellsTheCellAndTheLevelToScripts) {
  const TemporaryRecording recording(drive());
  const Outcome outcome = qelctl({"now", recording.path(), "--json"});
  EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
  const Json now = Json::parse(outcome.out);
  EXPECT_EQ(now["technology"], "LTE");
  EXPECT_EQ(now["band"], 3);
  const Json cell = {{"technology", "LTE"}, {"channel", 1300}, {"code", 123}, {"cell_id", 1192961},
                     {"area", 4711},        {"mcc", "001"},    {"mnc", "001"}};
  EXPECT_EQ(now["cell"], cell);
  for (const auto& [key, value] : cell.items()) EXPECT_EQ(now[key], value) << key;
  EXPECT_EQ(now["level_dbm"], -101.0);
  EXPECT_EQ(now["quality_db"], -9.0);
  EXPECT_EQ(now["sinr_db"], 12.5);
  EXPECT_EQ(now["age_ms"], 0);
  EXPECT_TRUE(now["rrc"].is_null());
  EXPECT_TRUE(now["carriers"].is_null());
}

TEST(QelctlNow, readsAsAPageToPeople) {
  const TemporaryRecording recording(drive());
  Texts lines = linesOf(qelctl({"now", recording.path()}).out);
  ASSERT_EQ(lines.size(), 9U);
  lines.pop_back();  // the curve
  EXPECT_EQ(lines, (Texts{"LTE band 3, 1815.0 MHz", "Operator 001-001", "PCI 123, EARFCN 1300",
                          "TAC 4711, cell 4660·1", "Connection not reported", "RSRP -101 dBm, fair",
                          "RSRQ -9 dB, good", "SINR 12.5 dB, fair"}));
}

TEST(QelctlNow, saysWhyNothingIsKnown) {
  const TemporaryRecording recording("");
  EXPECT_EQ(qelctl({"now", recording.path()}).out, "No cell was reported up to this moment.\n");
  const Json now = Json::parse(qelctl({"now", recording.path(), "--json"}).out);
  EXPECT_TRUE(now["technology"].is_null());
  EXPECT_TRUE(now["cell"].is_null());
  EXPECT_EQ(now["reason"], "No cell was reported up to this moment.");
}

TEST(QelctlNow, endsWithOneLineOnABadRecording) {
  const TemporaryRecording recording(drive() + "nonsense\n" + drive());
  const Outcome outcome = qelctl({"now", recording.path()});
  EXPECT_EQ(outcome.exitCode, 65);
  EXPECT_EQ(outcome.out, "");
  EXPECT_EQ(linesOf(outcome.err).size(), 1U);
}

TEST(QelctlNow, takesAFileOrABus) {
  EXPECT_EQ(qelctl({"now", "x.jsonl", "--bus", "session"}).exitCode, 64);
  EXPECT_EQ(qelctl({"now", "/nowhere.jsonl"}).exitCode, 66);
}

TEST(QelctlSignals, givesCurvesInRunsAndNeighboursWithTheirDifference) {
  const TemporaryRecording recording(drive());
  const Json signals = Json::parse(qelctl({"signals", recording.path(), "--json"}).out);
  EXPECT_EQ(signals["to_ms"], kStart + 60'000);
  const Json& level = signals["charts"][0];
  EXPECT_EQ(level["quantity"], "RSRP");
  const Json& serving = level["curves"].back();
  EXPECT_EQ(serving["serving"], true);
  EXPECT_EQ(serving["runs"], Json::parse("[[[1800000000000, -90.0], [1800000001000, -92.0]], "
                                         "[[1800000060000, -101.0]]]"));
  ASSERT_EQ(signals["neighbours"].size(), 1U);
  EXPECT_EQ(signals["neighbours"][0]["code"], 200);
  EXPECT_EQ(signals["neighbours"][0]["difference_db"], 2.0);
}

TEST(QelctlSignals, looksBackAsFarAsItIsTold) {
  const TemporaryRecording recording(drive());
  const Json signals =
      Json::parse(qelctl({"signals", recording.path(), "--json", "--span", "10"}).out);
  EXPECT_EQ(signals["from_ms"], kStart + 50'000);
  EXPECT_EQ(signals["charts"][0]["curves"].back()["runs"].size(), 1U);
  EXPECT_EQ(qelctl({"signals", recording.path(), "--span", "1"}).exitCode, 64);
}

TEST(QelctlSignals, listsNeighboursForPeople) {
  const TemporaryRecording recording(drive());
  const std::string text = qelctl({"signals", recording.path()}).out;
  EXPECT_NE(text.find("10 minutes to 08:01:00"), std::string::npos) << text;
  EXPECT_NE(text.find("  LTE PCI 200     EARFCN 1300    -99 dBm"), std::string::npos) << text;
}

// Times of the changes of cell within a technology, of a whole drive.
std::multiset<std::uint64_t> cellChanges(const std::string& drive) {
  std::multiset<std::uint64_t> times;
  for (const auto& line : linesOf(qelctl({"happenings", drive, "--json", "--kind", "cell"}).out)) {
    const Json change = Json::parse(line);
    const bool isMove = !change["from"].is_null() && !change["to"].is_null() &&
                        change["from"]["technology"] == change["to"]["technology"];
    if (isMove) times.insert(change["time_ms"].get<std::uint64_t>());
  }
  return times;
}

TEST(QelctlSignals, marksEveryChangeOfCellOfADriveAndNoOther) {
  const std::string drive = QEL_RAW_LOGS "/../simulated_drive.jsonl.gz";
  const Json signals = Json::parse(qelctl({"signals", drive, "--json", "--span", "86400"}).out);
  std::multiset<std::uint64_t> marked;
  std::map<std::string, int> letters;
  for (const Json& mark : signals["marks"]) {
    const std::string letter = mark["letter"];
    ++letters[letter];
    if (letter == "H" || letter == "R") marked.insert(mark["time_ms"].get<std::uint64_t>());
  }
  EXPECT_EQ(marked, cellChanges(drive));
  EXPECT_GT(letters["H"], 10);
  EXPECT_GT(letters["R"], 5);
  EXPECT_GT(letters["C"], 50);
  EXPECT_EQ(letters["T"], 4);  // to UMTS, to GSM, and both ways back
}

class QelctlLivePages : public WithService {
 protected:
  void SetUp() override { ASSERT_TRUE(Client(bus, "first").waitForReachable(true)); }
};

TEST_F(QelctlLivePages, followTheService) {
  RunningQelctl now(words({"now", "--json"}));
  ASSERT_TRUE(eventually([&] {
    const auto lines = linesOf(now.out());
    return lines.size() > 1 && !Json::parse(lines.back())["level_dbm"].is_null();
  })) << now.out()
      << now.err();
  EXPECT_EQ(Json::parse(linesOf(now.out()).back())["technology"], "LTE");
  now.signal(SIGTERM);
  EXPECT_EQ(now.waitForEnd(), 0);
  EXPECT_EQ(now.err(), "");
}

TEST_F(QelctlLivePages, drawCurvesOfWhatComes) {
  RunningQelctl signals(words({"signals", "--json"}));
  const auto newest = [&] {
    const auto lines = linesOf(signals.out());
    return lines.empty() ? Json::object() : Json::parse(lines.back());
  };
  ASSERT_TRUE(eventually([&] {
    return newest().contains("charts") && !newest()["charts"].empty();
  })) << signals.err();
  const Json page = newest();
  const Json curve = page["charts"][0]["curves"].back();
  EXPECT_EQ(curve["serving"], true);
  ASSERT_FALSE(curve["runs"].empty());
  EXPECT_LE(curve["runs"].back().back()[0], page["to_ms"]);
  signals.signal(SIGTERM);
  EXPECT_EQ(signals.waitForEnd(), 0);
}

TEST_F(QelctlLivePages, tellWhatHappensWhenItHappens) {
  RunningQelctl happenings(words({"happenings"}));
  const auto tells = [&](const char* text) {
    return eventually([&] { return happenings.out().find(text) != std::string::npos; });
  };
  EXPECT_TRUE(tells("Service found"));
  EXPECT_TRUE(tells("LTE RRC: connected")) << happenings.out();
  service.signal(SIGTERM);
  ASSERT_EQ(service.waitForEnd(), 0);
  EXPECT_TRUE(tells("Service lost")) << happenings.out();
  service.start();
  EXPECT_TRUE(tells("Service found again")) << happenings.out();
  happenings.signal(SIGINT);
  EXPECT_EQ(happenings.waitForEnd(), 0);
}

TEST_F(QelctlLivePages, sayThatTheServiceIsNotThere) {
  service.signal(SIGTERM);
  ASSERT_EQ(service.waitForEnd(), 0);
  const Outcome outcome = qelctl(words({"now"}));
  EXPECT_EQ(outcome.exitCode, 69);
  EXPECT_EQ(linesOf(outcome.err).size(), 1U);
}

}  // namespace
}  // namespace qel::testing
