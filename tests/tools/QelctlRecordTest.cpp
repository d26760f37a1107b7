#include <csignal>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <random>

#include "tools/WithService.h"

namespace qel::testing {
namespace {

namespace fs = std::filesystem;

class QelctlRecord : public WithService {
 protected:
  void SetUp() override { ASSERT_TRUE(Client(bus, "first").waitForReachable(true)); }

  static std::string contentOf(const std::string& path) {
    std::ifstream stream(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
  }
  static std::size_t eventsIn(const std::string& path) { return linesOf(contentOf(path)).size(); }
};

TEST_F(QelctlRecord, recordsUntilItIsInterrupted) {
  for (const int signal : {SIGINT, SIGTERM}) {
    const std::string path = file("drive" + std::to_string(signal) + ".jsonl");
    RunningQelctl record(words({"record", path}));
    ASSERT_TRUE(eventually([&] { return eventsIn(path) > 100; })) << record.err();
    record.signal(signal);
    EXPECT_EQ(record.waitForEnd(), 0);
    EXPECT_EQ(record.out(), "");
    const std::string summary =
        "qelctl: " + path + ": " + std::to_string(eventsIn(path)) + " events, ";
    EXPECT_TRUE(record.err().starts_with(summary)) << record.err();
    EXPECT_TRUE(record.err().ends_with(", identities hidden\n")) << record.err();
    EXPECT_EQ(linesOf(record.err()).size(), 1U);
    EXPECT_EQ(qelctl({"replay", path}).exitCode, 0);
  }
}

TEST_F(QelctlRecord, recordsForAsLongAsItIsAsked) {
  const Outcome outcome =
      ask({"record", file("short.jsonl.gz"), "--duration", "1", "--keep-identities"});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_TRUE(outcome.err.ends_with(", identities kept\n")) << outcome.err;
  const Outcome replayed = qelctl({"replay", file("short.jsonl.gz")});
  EXPECT_EQ(replayed.exitCode, 0);
  EXPECT_EQ(replayed.err, "");
  EXPECT_NE(replayed.out.find("Received Valid Metric"), std::string::npos);
}

TEST_F(QelctlRecord, notesWhenAnEventWasReceived) {
  const auto now = [] {
    return std::chrono::duration_cast<std::chrono::milliseconds>(
               std::chrono::system_clock::now().time_since_epoch())
        .count();
  };
  const auto before = now();
  ASSERT_EQ(ask({"record", file("a.jsonl"), "--duration", "0.5"}).exitCode, 0);
  const auto after = now();
  const auto lines = linesOf(contentOf(file("a.jsonl")));
  ASSERT_FALSE(lines.empty());
  auto last = before;
  for (const std::string& line : lines) {
    const auto time = nlohmann::json::parse(line)["time_ms"].get<std::int64_t>();
    EXPECT_LE(last, time);
    last = time;
  }
  EXPECT_LE(last, after);
}

TEST_F(QelctlRecord, writesToStandardOutputToo) {
  const Outcome outcome = ask({"record", "-", "--duration", "0.5"});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_TRUE(outcome.err.starts_with("qelctl: standard output: ")) << outcome.err;
  for (const std::string& line : linesOf(outcome.out)) {
    EXPECT_TRUE(nlohmann::json::parse(line).contains("event"));
  }
  const std::string command = std::string(QEL_QELCTL) + " record - --bus '" + bus.address() + "'";
  const Outcome cut = run("/bin/sh", {"-c", "(" + command + "; echo $? >&2) | head -n 3"});
  EXPECT_EQ(linesOf(cut.out).size(), 3U);
  EXPECT_EQ(linesOf(cut.err).back(), "0") << cut.err;
}

TEST_F(QelctlRecord, leavesAReadableRecordingWhereverItIsKilled) {
  std::mt19937 random(std::random_device{}());
  for (const char* name : {"killed.jsonl", "killed.jsonl.gz"}) {
    const std::string path = file(name);
    const std::size_t enough = std::uniform_int_distribution<std::size_t>(2000, 30000)(random);
    SCOPED_TRACE(std::string(name) + " killed at " + std::to_string(enough) + " bytes");
    RunningQelctl record(words({"record", path}));
    const std::size_t bytes = path.ends_with(".gz") ? enough / 5 : enough;
    ASSERT_TRUE(eventually([&] { return contentOf(path).size() >= bytes; }));
    record.signal(SIGKILL);
    EXPECT_EQ(record.waitForEnd(), -SIGKILL);
    const Outcome replayed = qelctl({"replay", path});
    EXPECT_EQ(replayed.exitCode, 0) << replayed.err;
    EXPECT_NE(replayed.out.find("Received Valid Metric"), std::string::npos);
    if (path.ends_with(".gz")) continue;
    std::string whole = contentOf(path);
    whole.resize(whole.rfind('\n') + 1);
    const TemporaryRecording upToLastWholeLine(whole);
    EXPECT_EQ(qelctl({"replay", upToLastWholeLine.path()}).out, replayed.out);
  }
}

TEST_F(QelctlRecord, goesOnWhenTheServiceIsBack) {
  const std::string path = file("gap.jsonl");
  RunningQelctl record(words({"record", path}));
  ASSERT_TRUE(eventually([&] { return eventsIn(path) > 20; }));
  service.signal(SIGTERM);
  ASSERT_EQ(service.waitForEnd(), 0);
  ASSERT_TRUE(eventually([&] { return record.hasSaid("lost, waiting for it"); }));
  const std::size_t before = eventsIn(path);
  service.start();
  ASSERT_TRUE(eventually([&] { return record.hasSaid("back"); }));
  EXPECT_TRUE(eventually([&] { return eventsIn(path) > before + 50; }));
  record.signal(SIGTERM);
  EXPECT_EQ(record.waitForEnd(), 0);
}

TEST_F(QelctlRecord, disturbsNobodyAndLeavesNothingBehind) {
  Client viewer(bus, "qelwatch");
  ASSERT_TRUE(viewer.waitForReachable(true));
  ASSERT_EQ(viewer.install(2, {20330}).code, 0);
  RunningQelctl first(words({"record", file("first.jsonl")}));
  ASSERT_TRUE(eventually([&] { return eventsIn(file("first.jsonl")) > 0; }));
  EXPECT_EQ(ask({"record", file("second.jsonl"), "--duration", "0.3"}).exitCode, 0);
  // The end of one recorder does not end the other.
  const std::size_t before = eventsIn(file("first.jsonl"));
  EXPECT_TRUE(eventually([&] { return eventsIn(file("first.jsonl")) > before + 50; }));
  first.signal(SIGTERM);
  EXPECT_EQ(first.waitForEnd(), 0);
  const auto status = nlohmann::json::parse(ask({"status", "--json"}).out);
  EXPECT_EQ(status["configurations"],
            nlohmann::json::parse(R"([{"application": 2, "metrics": 1}])"));
}

TEST_F(QelctlRecord, keepsTheNewestFilesOfARow) {
  const std::string path = file("row.jsonl");
  RunningQelctl record(words({"record", path, "--max-size", "4K", "--keep", "2"}));
  ASSERT_TRUE(eventually([&] { return fs::exists(path + ".2"); }));
  const auto oldest = fs::file_time_type(fs::last_write_time(path + ".2"));
  ASSERT_TRUE(eventually([&] {
    std::error_code gone;  // while the files are renamed
    const auto time = fs::last_write_time(path + ".2", gone);
    return !gone && time > oldest;
  }));
  record.signal(SIGTERM);
  EXPECT_EQ(record.waitForEnd(), 0);
  EXPECT_TRUE(record.hasSaid(" files finished before it"));
  EXPECT_FALSE(fs::exists(path + ".3"));
  std::int64_t last = 0;
  for (const char* suffix : {".2", ".1", ""}) {
    EXPECT_LT(fs::file_size(path + suffix), 12000U);
    for (const std::string& line : linesOf(contentOf(path + suffix))) {
      const auto time = nlohmann::json::parse(line)["time_ms"].get<std::int64_t>();
      EXPECT_LE(last, time);
      last = time;
    }
  }
}

TEST_F(QelctlRecord, finishesAFileThatIsOldEnough) {
  const std::string path = file("old.jsonl");
  RunningQelctl record(words({"record", path, "--max-age", "0.2"}));
  EXPECT_TRUE(eventually([&] { return fs::exists(path + ".1"); }));
}

TEST_F(QelctlRecord, overwritesNothingUnlessItIsForced) {
  const std::string path = file("there.jsonl");
  std::ofstream(path) << "precious\n";
  const Outcome refused = ask({"record", path, "--duration", "0.1"});
  EXPECT_EQ(refused.exitCode, 74);
  EXPECT_EQ(refused.err, "qelctl: " + path + ": File exists (--force replaces it)\n");
  EXPECT_EQ(contentOf(path), "precious\n");
  EXPECT_EQ(ask({"record", path, "--duration", "0.3", "--force"}).exitCode, 0);
  EXPECT_EQ(contentOf(path).find("precious"), std::string::npos);
  std::ofstream(file("row.jsonl.1")) << "precious\n";
  const Outcome row = ask({"record", file("row.jsonl"), "--max-size", "1M", "--duration", "0.1"});
  EXPECT_EQ(row.exitCode, 74);
  EXPECT_EQ(row.err, "qelctl: " + file("row.jsonl.1") + ": File exists (--force replaces it)\n");
}

TEST_F(QelctlRecord, stopsBeforeTheDiskIsFull) {
  const std::string path = file("full.jsonl");
  const Outcome outcome = ask({"record", path, "--min-free", "1000000G"});
  EXPECT_EQ(outcome.exitCode, 74);
  EXPECT_EQ(linesOf(outcome.err).size(), 1U);
  EXPECT_TRUE(outcome.err.starts_with("qelctl: " + path + ": ")) << outcome.err;
  EXPECT_NE(outcome.err.find(" MB must stay free"), std::string::npos) << outcome.err;
  EXPECT_FALSE(fs::exists(path));
}

TEST_F(QelctlRecord, stopsWhenTheDiskIsFull) {
  const Outcome outcome = ask({"record", "/dev/full", "--force"});
  EXPECT_EQ(outcome.exitCode, 74);
  EXPECT_EQ(linesOf(outcome.err).back(), "qelctl: /dev/full: No space left on device");
  const std::string command = std::string(QEL_QELCTL) + " record - --bus '" + bus.address() + "'";
  const Outcome piped = run("/bin/sh", {"-c", command + " > /dev/full; echo $? >&2"});
  const auto lines = linesOf(piped.err);
  ASSERT_GE(lines.size(), 2U);
  EXPECT_EQ(lines[lines.size() - 2], "qelctl: standard output: No space left on device");
  EXPECT_EQ(lines.back(), "74");
}

// The signal for it killed the program.
TEST_F(QelctlRecord, endsWholeWhenAFileMayNotGrow) {
  for (const char* name : {"limit.jsonl", "limit.jsonl.gz"}) {
    const std::string path = file(name);
    const std::string command =
        std::string(QEL_QELCTL) + " record '" + path + "' --bus '" + bus.address() + "'";
    const Outcome outcome = run("/bin/sh", {"-c", "ulimit -f 16; " + command + "; echo $? >&2"});
    const auto lines = linesOf(outcome.err);
    ASSERT_GE(lines.size(), 2U) << outcome.err;
    EXPECT_EQ(lines[lines.size() - 2], "qelctl: " + path + ": File too large");
    EXPECT_EQ(lines.back(), "74");
    EXPECT_EQ(fs::file_size(path), 16U * 512);
    const Outcome replayed = qelctl({"replay", path});
    EXPECT_EQ(replayed.exitCode, 0) << replayed.err;
    EXPECT_NE(replayed.out.find("Received Valid Metric"), std::string::npos);
  }
}

// A file that everybody could read stayed so.
TEST_F(QelctlRecord, letsNobodyElseReadWhatItReplaces) {
  const std::string path = file("open.jsonl");
  std::ofstream(path) << "old\n";
  fs::permissions(path, fs::perms(0666));
  EXPECT_EQ(ask({"record", path, "--duration", "0.1", "--force"}).exitCode, 0);
  EXPECT_EQ(fs::status(path).permissions(), fs::perms(0600));
}

TEST_F(QelctlRecord, saysWhatItCannotWrite) {
  const Outcome outcome = ask({"record", "/nonexistent/a.jsonl"});
  EXPECT_EQ(outcome.exitCode, 74);
  EXPECT_EQ(outcome.err, "qelctl: /nonexistent/a.jsonl: No such file or directory\n");
}

TEST_F(QelctlRecord, showsItsProgressOnATerminal) {
  RunningQelctl record(words({"record", file("seen.jsonl")}), RunningQelctl::Streams::terminal);
  const std::string bytesShown = "B, 0:00:0";
  EXPECT_TRUE(eventually([&] { return record.out().find(bytesShown) != std::string::npos; }))
      << record.out();
  record.signal(SIGTERM);
  EXPECT_EQ(record.waitForEnd(), 0);
  EXPECT_NE(record.out().find("\r\x1B[Kqelctl: "), std::string::npos) << record.out();
}

}  // namespace
}  // namespace qel::testing
