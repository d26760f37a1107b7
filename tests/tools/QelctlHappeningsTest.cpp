#include <nlohmann/json.hpp>

#include "messages/lte_rrc.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "metrics/MetricValidator.h"
#include "tools/Qelctl.h"

namespace qel::testing {
namespace {

using V = MetricValidator;
using Lines = std::vector<std::string>;

std::string at(std::uint64_t timeMs, std::string line) {
  const std::string start = "{\"time_ms\": 1,";
  return "{\"time_ms\": " + std::to_string(timeMs) + "," + line.substr(start.size());
}

std::string cellLine(std::uint64_t timeMs, std::uint32_t pci) {
  KCellularLteScellInfo cell;
  cell.setPhyCellId(pci);
  cell.setDlFreq(1300);
  cell.setSelPlmnMcc(1);
  cell.setSelPlmnMnc(1);
  cell.setNumMncDigits(3);
  return at(timeMs, metricLine(V::K_LTE_SCELL_INFO, cell));
}

std::string stateLine(std::uint64_t timeMs, std::int32_t state) {
  KCellularLteRrcState message;
  message.setState(state);
  return at(timeMs, metricLine(V::K_LTE_RRC_STATE, message));
}

const std::string kDrive = cellLine(1500000000123, 7) + cellLine(1500000000124, 7) +
                           stateLine(1500000000125, 1) + cellLine(1500000000126, 8);

TEST(QelctlHappenings, printsJsonWithEveryKeyInItsOrder) {
  const TemporaryRecording recording(kDrive);
  const Outcome outcome = qelctl({"happenings", recording.path(), "--json"});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_EQ(outcome.err, "");
  const std::string seven =
      "{\"technology\": \"LTE\", \"channel\": 1300, \"code\": 7, \"cell_id\": null, \"area\": "
      "null, "
      "\"mcc\": \"001\", \"mnc\": \"001\"}";
  const std::string eight =
      "{\"technology\": \"LTE\", \"channel\": 1300, \"code\": 8, \"cell_id\": null, \"area\": "
      "null, "
      "\"mcc\": \"001\", \"mnc\": \"001\"}";
  EXPECT_EQ(
      linesOf(outcome.out),
      (Lines{"{\"time_ms\": 1500000000123, \"kind\": \"cell\", \"technology\": \"LTE\", "
             "\"metric\": 3948738, \"text\": \"On LTE PCI 7, EARFCN 1300\", \"from\": null, "
             "\"to\": " +
                 seven + "}",
             "{\"time_ms\": 1500000000125, \"kind\": \"rrc\", \"technology\": \"LTE\", "
             "\"metric\": 3952132, \"text\": \"LTE RRC: idle\"}",
             "{\"time_ms\": 1500000000126, \"kind\": \"cell\", \"technology\": \"LTE\", "
             "\"metric\": 3948738, \"text\": \"Reselected from LTE PCI 7, EARFCN 1300 to LTE PCI "
             "8, EARFCN 1300\", \"from\": " +
                 seven + ", \"to\": " + eight + "}"}));
}

TEST(QelctlHappenings, printsALineForPeople) {
  const TemporaryRecording recording(kDrive);
  const Outcome outcome = qelctl({"happenings", recording.path(), "--kind", "rrc"});
  EXPECT_EQ(outcome.out, "2017-07-14 02:40:00.125 UTC  rrc                 LTE RRC: idle\n");
}

TEST(QelctlHappenings, printsThoseOfOneKind) {
  const TemporaryRecording recording(kDrive);
  EXPECT_EQ(
      linesOf(qelctl({"happenings", recording.path(), "--json", "--kind", "cell"}).out).size(), 2U);
  EXPECT_EQ(qelctl({"happenings", recording.path(), "--kind", "reject"}).out, "");
  const Outcome outcome = qelctl({"happenings", recording.path(), "--kind", "nonsense"});
  EXPECT_EQ(outcome.exitCode, 64);
  EXPECT_EQ(linesOf(outcome.err).size(), 1U);
}

// The history keeps ten thousand.
TEST(QelctlHappenings, printsMoreThanAreKept) {
  std::string content;
  for (std::uint32_t i = 0; i < 12'000; ++i) content += cellLine(1500000000000 + i, i % 500);
  const TemporaryRecording recording(content);
  EXPECT_EQ(linesOf(qelctl({"happenings", recording.path(), "--json"}).out).size(), 12'000U);
}

TEST(QelctlHappenings, stopsAtABadLineOrSkipsIt) {
  const TemporaryRecording recording(cellLine(1, 7) + "nonsense\n" + cellLine(2, 8));
  const Outcome stopped = qelctl({"happenings", recording.path(), "--json"});
  EXPECT_EQ(stopped.exitCode, 65);
  EXPECT_EQ(linesOf(stopped.out).size(), 1U);
  EXPECT_TRUE(stopped.err.starts_with("qelctl: " + recording.path() + ":2: ")) << stopped.err;
  const Outcome skipped = qelctl({"happenings", recording.path(), "--json", "--skip-bad"});
  EXPECT_EQ(skipped.exitCode, 0);
  EXPECT_EQ(linesOf(skipped.out).size(), 2U);
}

TEST(QelctlHappenings, takesTimesThatGoBackAsTheyCome) {
  const TemporaryRecording recording(cellLine(5000, 7) + cellLine(1000, 8) + cellLine(0, 9));
  std::vector<std::uint64_t> times;
  for (const auto& line : linesOf(qelctl({"happenings", recording.path(), "--json"}).out)) {
    times.push_back(nlohmann::json::parse(line)["time_ms"]);
  }
  EXPECT_EQ(times, (std::vector<std::uint64_t>{5000, 1000, 0}));
}

TEST(QelctlHappenings, letsNoNameCommandTheTerminal) {
  KCellularActivatedBearerContexts contexts;
  auto bearer = std::make_shared<BearerContext>();
  bearer->setApn("a\x1B[2Jz");
  contexts.addBearerContexts(bearer);
  const TemporaryRecording recording(metricLine(V::K_CELLULAR_ACTIVE_BEARER, contexts));
  const Outcome outcome = qelctl({"happenings", recording.path()});
  EXPECT_EQ(outcome.out.find('\x1B'), std::string::npos);
  EXPECT_NE(outcome.out.find("Connection up: a [2Jz"), std::string::npos) << outcome.out;
}

TEST(QelctlHappenings, saysThatThereIsNoServiceToFollow) {
  const Outcome outcome = qelctl({"happenings", "--bus", "unix:path=/nonexistent/bus"});
  EXPECT_EQ(outcome.exitCode, 69);
  EXPECT_EQ(linesOf(outcome.err).size(), 1U);
}

}  // namespace
}  // namespace qel::testing
