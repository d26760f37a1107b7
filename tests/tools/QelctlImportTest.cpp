#include <fcntl.h>
#include <sys/stat.h>

#include <map>
#include <nlohmann/json.hpp>

#include "messages/nas.h"
#include "metrics/MetricValidator.h"
#include "recording/TemporaryFile.h"
#include "support/RecordedEvents.h"
#include "support/diagnostics/Packets.h"
#include "tools/Qelctl.h"

namespace qel::testing {
namespace {

using diagnostics::test::BodyWriter;
using diagnostics::test::framed;
using diagnostics::test::kSomeTimeMs;
using diagnostics::test::logPacket;
using diagnostics::test::wrapped;
using V = MetricValidator;

constexpr std::uint16_t kServingCell = 0xB0C2;
constexpr std::uint16_t kMobilityState = 0xB0EE;
constexpr std::uint32_t kTemporaryIdentity = 0xC0FFEE42;

Bytes servingCell(unsigned cell) {
  return BodyWriter()
      .u8(3)
      .u16(cell)
      .u32(1350)
      .u32(19350)
      .u8(100)
      .u8(100)
      .u32(cell)
      .u16(4566)
      .u32(3)
      .u16(1)
      .u8(2)
      .u16(1)
      .u8(0);
}

Bytes mobilityState() {
  const Bytes network = {0x00, 0xF1, 0x10};
  return BodyWriter().u8(2).u8(3).u16(0).bytes(network).u8(1).u8(6).bytes(network).u16(1).u8(2).u32(
      kTemporaryIdentity);
}

std::string textOf(const Bytes& bytes) { return {bytes.begin(), bytes.end()}; }

std::string frame(std::uint16_t code, const Bytes& body, std::uint64_t timeMs = kSomeTimeMs) {
  return textOf(framed(logPacket(code, body, timeMs)));
}

// Imports the raw log and reads what was made of it.
std::vector<RecordedEvent> imported(const std::string& log,
                                    const std::vector<std::string>& options = {}) {
  const TemporaryFile in(".qmdl", log);
  const TemporaryFile out;
  std::vector<std::string> words = {"import", in.path(), out.path(), "--force"};
  words.insert(words.end(), options.begin(), options.end());
  const Outcome outcome = qelctl(words);
  EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
  EXPECT_EQ(outcome.out, "");
  return eventsOf(out.path());
}

std::vector<std::uint64_t> timesOf(const std::vector<RecordedEvent>& events) {
  std::vector<std::uint64_t> times;
  for (const RecordedEvent& event : events) times.push_back(event.timeMs);
  return times;
}

void expectError(const std::vector<std::string>& arguments, int code, const std::string& why) {
  const Outcome outcome = qelctl(arguments);
  EXPECT_EQ(outcome.exitCode, code) << outcome.err;
  EXPECT_EQ(outcome.out, "");
  EXPECT_TRUE(outcome.err.starts_with("qelctl: ")) << outcome.err;
  EXPECT_NE(outcome.err.find(why), std::string::npos) << outcome.err;
}

TEST(QelctlImport, givesEveryPacketAnEventWithTheModemsTime) {
  const std::string log = frame(kServingCell, servingCell(1), kSomeTimeMs) +
                          frame(kServingCell, servingCell(1), kSomeTimeMs + 7) +
                          frame(kServingCell, servingCell(2), kSomeTimeMs + 9);
  const auto events = imported(log);
  std::vector<std::uint64_t> cells;
  for (const RecordedEvent& event : events) {
    if (*event.entries.find("kKeyMetricID")->asInt64() == V::K_LTE_SCELL_INFO) {
      cells.push_back(event.timeMs);
    }
  }
  EXPECT_EQ(cells, (std::vector<std::uint64_t>{kSomeTimeMs, kSomeTimeMs + 7, kSomeTimeMs + 9}));
}

TEST(QelctlImport, readsAPipeAndWritesOne) {
  const std::string log = frame(kServingCell, servingCell(1));
  const Outcome piped = qelctl({"import", "-", "-"}, log);
  EXPECT_EQ(piped.exitCode, 0);
  const TemporaryFile out(".jsonl", piped.out);
  EXPECT_EQ(timesOf(eventsOf(out.path())), timesOf(imported(log)));
  EXPECT_TRUE(piped.err.starts_with("qelctl: standard input: 1 frames, 0 bad\n")) << piped.err;
}

TEST(QelctlImport, readsAndWritesGzip) {
  const std::string log = frame(kServingCell, servingCell(1));
  const TemporaryFile in(".qmdl.gz", gzipped(log));
  const TemporaryFile out(".jsonl.gz");
  EXPECT_EQ(qelctl({"import", in.path(), out.path(), "--force"}).exitCode, 0);
  EXPECT_TRUE(out.content().starts_with("\x1f\x8b"));
  EXPECT_EQ(timesOf(eventsOf(out.path())), timesOf(imported(log)));
}

TEST(QelctlImport, thinsEachMetricByItself) {
  std::string log;
  for (unsigned second = 0; second < 10; ++second) {
    log += frame(kServingCell, servingCell(second), kSomeTimeMs + second * 1000);
  }
  std::map<std::int64_t, std::vector<std::uint64_t>> times;
  for (const RecordedEvent& event : imported(log, {"--every", "3"})) {
    times[*event.entries.find("kKeyMetricID")->asInt64()].push_back(event.timeMs - kSomeTimeMs);
  }
  ASSERT_FALSE(times.empty());
  for (const auto& [metric, seconds] : times) {
    EXPECT_EQ(seconds, (std::vector<std::uint64_t>{0, 3000, 6000, 9000})) << metric;
  }
}

TEST(QelctlImport, readsEachRadioByItself) {
  const auto of = [](unsigned radio, unsigned cell) {
    return textOf(
        framed(wrapped(radio, logPacket(kServingCell, servingCell(cell), kSomeTimeMs + cell))));
  };
  const std::string log = of(1, 1) + of(2, 2);
  std::map<std::uint64_t, std::int64_t> profiles;
  for (const RecordedEvent& event : imported(log)) {
    profiles[event.timeMs] = *event.entries.find("kKeyProfileID")->asInt64();
  }
  EXPECT_EQ(profiles,
            (std::map<std::uint64_t, std::int64_t>{{kSomeTimeMs + 1, 0}, {kSomeTimeMs + 2, 1}}));
  const auto second = imported(log, {"--radio", "2"});
  ASSERT_FALSE(second.empty());
  for (const RecordedEvent& event : second) EXPECT_EQ(event.timeMs, kSomeTimeMs + 2);
}

// A modem that has heard no network counts from 1980.
TEST(QelctlImport, countsFromTheFilesTimeWhereTheModemsClockWasNotSet) {
  constexpr std::uint64_t kUnsetMs = 315'964'807'000;
  const TemporaryFile in(".qmdl", frame(kServingCell, servingCell(1), kUnsetMs) +
                                      frame(kServingCell, servingCell(2), kUnsetMs + 250));
  const timespec times[2] = {{1'700'000'000, 0}, {1'700'000'000, 0}};
  ASSERT_EQ(::utimensat(AT_FDCWD, in.path().c_str(), times, 0), 0);
  const TemporaryFile out;
  ASSERT_EQ(qelctl({"import", in.path(), out.path(), "--force"}).exitCode, 0);
  const auto told = timesOf(eventsOf(out.path()));
  ASSERT_FALSE(told.empty());
  EXPECT_EQ(told.front(), 1'700'000'000'000U);
  EXPECT_EQ(told.back(), 1'700'000'000'250U);
}

TEST(QelctlImport, hidesIdentitiesUnlessToldNotTo) {
  const std::string log = frame(kMobilityState, mobilityState());
  const auto identityIn = [](const std::vector<RecordedEvent>& events) {
    std::optional<std::uint32_t> identity;
    for (const RecordedEvent& event : events) {
      if (*event.entries.find("kKeyMetricID")->asInt64() != V::K_LTE_EMM_CTXT) continue;
      const Bytes payload = *event.entries.find("kKeyPayload")->asBytes();
      const auto guti = KCellularEmmContext::initWithData(payload)->guti();
      if (guti && guti->hasMTmsi()) identity = guti->mTmsi();
    }
    return identity;
  };
  EXPECT_EQ(identityIn(imported(log, {"--keep-identities"})), kTemporaryIdentity);
  const auto hidden = identityIn(imported(log));
  ASSERT_TRUE(hidden);
  EXPECT_NE(hidden, kTemporaryIdentity);
}

TEST(QelctlImport, goesOnAfterWhatIsNoFrameAndCountsIt) {
  std::string damaged = frame(kServingCell, servingCell(2));
  damaged[5] ^= 1;
  const TemporaryFile in(".qmdl", frame(kServingCell, servingCell(1)) + damaged + "nonsense\x7e" +
                                      frame(kServingCell, servingCell(3)));
  const TemporaryFile out;
  const Outcome outcome = qelctl({"import", in.path(), out.path(), "--force"});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_NE(outcome.err.find("2 frames, 2 bad"), std::string::npos) << outcome.err;
  EXPECT_NE(outcome.err.find("understood: B0C2/3 2"), std::string::npos) << outcome.err;
  EXPECT_FALSE(eventsOf(out.path()).empty());
}

TEST(QelctlImport, listsThePacketsAndWritesNothing) {
  const std::string log = frame(kServingCell, servingCell(1)) +
                          frame(kServingCell, BodyWriter().u8(99).zeros(40)) +
                          frame(kServingCell, BodyWriter().u8(3).zeros(2)) +
                          frame(0xBFFF, BodyWriter().u8(1)) + textOf(framed(Bytes{0x13, 0}));
  const TemporaryFile in(".qmdl", log);
  const Outcome text = qelctl({"import", "--inspect", in.path()});
  EXPECT_EQ(text.exitCode, 0);
  EXPECT_EQ(text.err, "");
  const auto lines = linesOf(text.out);
  ASSERT_EQ(lines.size(), 6U) << text.out;
  EXPECT_TRUE(lines[1].starts_with("log    B0C2         3          2          1"));
  EXPECT_TRUE(lines.back().starts_with("5 frames, 0 bad"));
  const auto json = nlohmann::json::parse(qelctl({"import", "--inspect", "--json", in.path()}).out);
  EXPECT_EQ(json["frames"], 5);
  ASSERT_EQ(json["packets"].size(), 3U);
  EXPECT_EQ(json["packets"][0]["code"], "B0C2");
  EXPECT_EQ(json["packets"][0]["version"], 3);
  EXPECT_EQ(json["packets"][0]["understood"], 1);
  EXPECT_EQ(json["packets"][0]["damaged"], 1);
  EXPECT_EQ(json["packets"][1]["version"], 99);
  EXPECT_EQ(json["packets"][1]["unknown_version"], 1);
  EXPECT_EQ(json["packets"][2]["code"], "BFFF");
  EXPECT_TRUE(json["packets"][2]["name"].is_null());
  EXPECT_EQ(json["other_packets"][0]["command"], "13");
}

TEST(QelctlImport, refusesWrongUsage) {
  expectError({"import"}, 64, "FILE");
  expectError({"import", "x"}, 64, "OUT");
  expectError({"import", "--inspect", "x", "y"}, 64, "--inspect");
  expectError({"import", "x", "y", "--json"}, 64, "--json");
  expectError({"import", "x", "y", "--every", "0"}, 64, "--every");
  expectError({"import", "x", "y", "--radio", "0"}, 64, "--radio");
}

TEST(QelctlImport, saysWhyARawLogCannotBeRead) {
  const TemporaryFile out;
  expectError({"import", "/nonexistent.qmdl", out.path(), "--force"}, 66,
              "/nonexistent.qmdl: No such file or directory");
  expectError({"import", "/tmp", out.path(), "--force"}, 66, "/tmp: Is a directory");
  expectError({"import", "/dev/zero", out.path(), "--force"}, 66, "/dev/zero: a device");
  const TemporaryFile text(".txt", "This is a letter to nobody.\n");
  expectError({"import", text.path(), out.path(), "--force"}, 65,
              text.path() + ": no frame of a diagnostics port in it");
  const TemporaryFile cut(".gz", gzipped(frame(kServingCell, servingCell(1))).substr(0, 30));
  expectError({"import", cut.path(), out.path(), "--force"}, 65, "ends in the middle");
}

TEST(QelctlImport, replacesNothingUnlessToldTo) {
  const TemporaryFile in(".qmdl", frame(kServingCell, servingCell(1)));
  const TemporaryFile out(".jsonl", "what was there\n");
  expectError({"import", in.path(), out.path()}, 74, "File exists (--force replaces it)");
  EXPECT_EQ(out.content(), "what was there\n");
  expectError({"import", in.path(), in.path(), "--force"}, 64, "is the raw log itself");
  EXPECT_EQ(in.content(), frame(kServingCell, servingCell(1)));
}

TEST(QelctlImport, saysThatItCannotWrite) {
  const TemporaryFile in(".qmdl", frame(kServingCell, servingCell(1)));
  expectError({"import", in.path(), "/nonexistent/out.jsonl"}, 74, "/nonexistent/out.jsonl: ");
  const Outcome full =
      run("/bin/sh", {"-c", std::string(QEL_QELCTL) + " import " + in.path() + " - > /dev/full"});
  EXPECT_EQ(full.exitCode, 74);
  EXPECT_NE(full.err.find("standard output: No space left on device"), std::string::npos);
}

}  // namespace
}  // namespace qel::testing
