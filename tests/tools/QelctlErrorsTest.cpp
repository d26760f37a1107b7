#include <nlohmann/json.hpp>

#include "messages/catalogue/KBBMetricUtility.h"
#include "tools/Qelctl.h"

namespace qel::testing {
namespace {

void expectError(const std::vector<std::string>& arguments, int code, const std::string& why) {
  const Outcome outcome = qelctl(arguments);
  EXPECT_EQ(outcome.exitCode, code);
  EXPECT_EQ(outcome.out, "");
  EXPECT_EQ(linesOf(outcome.err).size(), 1U) << outcome.err;
  EXPECT_TRUE(outcome.err.starts_with("qelctl: ")) << outcome.err;
  EXPECT_NE(outcome.err.find(why), std::string::npos) << outcome.err;
}

TEST(Qelctl, refusesWrongUsage) {
  expectError({}, 64, "subcommand");
  expectError({"bogus"}, 64, "bogus");
  expectError({"decode"}, 64, "METRIC");
  expectError({"decode", "19972", "00", "00"}, 64, "usage");
  expectError({"decode", "NoSuchMetric", "00"}, 64, "NoSuchMetric: no such metric");
  expectError({"decode", "99999999", "00"}, 64, "no such metric");
  expectError({"decode", "20005", "00"}, 64, "no message class");
  expectError({"replay"}, 64, "FILE");
  expectError({"replay", "--nonsense", "x"}, 64, "usage");
  expectError({"screen", "x", "LTE"}, 64, "CATEGORY");
  expectError({"live", "--screen", "LTE"}, 64, "--screen");
  expectError({"live", "--source", "simulated"}, 64, "usage");
  expectError({"record"}, 64, "FILE");
  expectError({"record", "x", "--duration", "0"}, 64, "--duration");
  expectError({"record", "x", "--max-age", "-1"}, 64, "--max-age");
  expectError({"record", "x", "--max-size", "10X"}, 64, "--max-size");
  expectError({"record", "x", "--max-size", "0"}, 64, "--max-size");
  expectError({"record", "x", "--min-free", "much"}, 64, "--min-free");
  expectError({"record", "x", "--keep", "0"}, 64, "--keep");
  expectError({"record", "-", "--max-size", "1M"}, 64, "standard output");
  expectError({"record", "-", "--max-age", "60"}, 64, "standard output");
}

TEST(Qelctl, refusesBadData) {
  expectError({"decode", "19972", "0"}, 65, "0: not hexadecimal bytes");
  expectError({"decode", "19972", "08"}, 65, "KCellularLteRrcState: the payload cannot be decoded");
}

// Ended with an internal error, with --skip-bad too.
TEST(Qelctl, namesTheLineOfANumberOutOfRange) {
  const TemporaryRecording recording(std::string("{\"time_ms\": 1e400}\n") + kTriggerLine);
  expectError({"replay", recording.path()}, 65, recording.path() + ":1: \"time_ms\" is");
  const Outcome skipped = qelctl({"replay", recording.path(), "--skip-bad"});
  EXPECT_EQ(skipped.exitCode, 0);
  EXPECT_EQ(skipped.err, "qelctl: " + recording.path() + ": bad lines skipped: 1\n");
  const Outcome batch = qelctl({"decode", "--batch"}, R"({"metric": 1e400, "payload": ""})");
  EXPECT_EQ(batch.exitCode, 65);
  EXPECT_EQ(batch.err,
            "qelctl: standard input, line 1: \"metric\" is nested too deep or out of range\n");
}

TEST(Qelctl, readsNoEndlessInput) {
  const std::string zeros = " < /dev/zero; echo $? >&2";
  for (const char* arguments : {" decode 19972", " decode --batch"}) {
    const Outcome outcome = run("/bin/sh", {"-c", std::string(QEL_QELCTL) + arguments + zeros});
    const auto lines = linesOf(outcome.err);
    ASSERT_EQ(lines.size(), 2U) << outcome.err;
    EXPECT_TRUE(lines[0].ends_with(": longer than 16 MB")) << lines[0];
    EXPECT_EQ(lines[1], "65");
  }
}

TEST(Qelctl, saysThatAFileIsNotThere) {
  for (const char* command : {"replay", "store", "screens"}) {
    expectError({command, "/nonexistent.jsonl"}, 66, "/nonexistent.jsonl");
  }
  expectError({"screen", "/nonexistent.jsonl", "LTE", "NAS"}, 66, "/nonexistent.jsonl");
}

TEST(Qelctl, saysThatItCannotWrite) {
  const Outcome outcome =
      run("/bin/sh", {"-c", std::string(QEL_QELCTL) + " metrics > /dev/full; echo $? >&2"});
  const auto lines = linesOf(outcome.err);
  ASSERT_EQ(lines.size(), 2U);
  EXPECT_EQ(lines[0], "qelctl: standard output: No space left on device");
  EXPECT_EQ(lines[1], "74");
}

TEST(Qelctl, endsQuietlyWhenNobodyReads) {
  const Outcome outcome = run(
      "/bin/sh", {"-c", "(sleep 0.1; " + std::string(QEL_QELCTL) + " metrics; echo $? >&2) | :"});
  EXPECT_EQ(outcome.err, "0\n");
}

TEST(Qelctl, explainsItselfAndEverySubcommand) {
  EXPECT_TRUE(qelctl({"--version"}).out.starts_with("qelctl "));
  const Outcome help = qelctl({"--help"});
  EXPECT_EQ(help.exitCode, 0);
  for (const char* command : {"decode", "replay", "store", "screen", "screens", "metrics", "status",
                              "live", "record", "import", "diag-report"}) {
    EXPECT_NE(help.out.find(command), std::string::npos);
    const Outcome detail = qelctl({command, "--help"});
    EXPECT_EQ(detail.exitCode, 0);
    EXPECT_NE(detail.out.find(command), std::string::npos);
    EXPECT_EQ(detail.err, "");
  }
}

TEST(QelctlMetrics, listsTheCatalogueInItsOrder) {
  const auto json = nlohmann::json::parse(qelctl({"metrics", "--json"}).out);
  const auto catalogue = KBBMetricUtility::catalogue();
  ASSERT_EQ(json.size(), catalogue.size());
  for (std::size_t i = 0; i < json.size(); ++i) {
    EXPECT_EQ(json[i]["identifier"], catalogue[i].identifier);
    EXPECT_EQ(json[i]["name"], std::string(catalogue[i].name));
  }
  const auto& failure = json[2];
  EXPECT_EQ(failure["hex"], "0x4E25");
  EXPECT_TRUE(failure["class"].is_null());
  EXPECT_EQ(failure["handler"], false);
  EXPECT_EQ(json[7]["class"], "KCellularLteRsrpRsrqSinr");
  EXPECT_EQ(linesOf(qelctl({"metrics"}).out).size(), catalogue.size() + 1);
}

// It went to the terminal as it was.
TEST(QelctlErrors, areOneLineThatNoFileNameCanBreakOut) {
  const Outcome outcome = qelctl({"replay", "no\nsuch\xC2\x9B\xE2\x80\xAE.jsonl"});
  EXPECT_EQ(outcome.exitCode, 66);
  EXPECT_EQ(outcome.err.find("qelctl: no\\u000asuch\\u009b\\u202e.jsonl: "), 0U) << outcome.err;
  EXPECT_EQ(linesOf(outcome.err).size(), 1U);
}

}  // namespace
}  // namespace qel::testing
