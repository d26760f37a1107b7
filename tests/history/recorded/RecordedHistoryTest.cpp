#include "history/recorded/RecordedHistory.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <map>
#include <random>
#include <set>

#include "base/LogSink.h"
#include "base/Rendering.h"
#include "recording/Mark.h"
#include "support/RecordedEvents.h"
#include "support/RecordedLines.h"

namespace qel::testing {
namespace {

std::string textOf(const EntryList& list) {
  return jsonText(Value(List(list.begin(), list.end())));
}

// Everything that a store holds.
std::vector<std::string> contentOf(const MetricStore& store) {
  std::vector<std::string> content;
  for (const DispatchRow& row : dispatchTable()) {
    const auto& slot = store.*row.slot;
    content.push_back(slot ? jsonText(*slot) : "nothing");
  }
  const LTE& lte = store.myLTE;
  const UMTS& umts = store.myUMTS;
  const GSM& gsm = store.myGSM;
  for (const EntryList* list : {&lte.EutraNbrs,
                                &lte.RsrpRsrqSinr,
                                &lte.TxPower,
                                &lte.EutraNbrsMeas,
                                &lte.UtraNbrsMeas,
                                &lte.GeraNbrsMeas,
                                &lte.CAStatusList,
                                &lte.MMCommonInfo,
                                &umts.rXInfo,
                                &umts.TxPower,
                                &umts.eUtraNbrs,
                                &umts.utraNbrs,
                                &umts.geraNbrs,
                                &umts.eUtraNbrMeas,
                                &umts.utraNbrMeas,
                                &umts.geraNbrMeas,
                                &gsm.eUtraNbrMeas,
                                &gsm.utraNbrMeas,
                                &gsm.geraNbrMeas,
                                &store.myCommon.activeBearer,
                                &store.myCommon.simContents}) {
    content.push_back(textOf(*list));
  }
  content.push_back(jsonText(lte.SelReselCellInfo));
  content.push_back(jsonText(umts.SelReselCellInfo));
  content.push_back(jsonText(lte.IMSI));
  return content;
}

// What the dispatcher makes of all events up to each of these times, one after the other.
std::map<std::uint64_t, std::vector<std::string>> contentsAt(
    const std::vector<RecordedEvent>& events, const std::set<std::uint64_t>& times) {
  setStandardOutput(nullptr);
  setSystemLog(nullptr);
  const auto validator = MetricValidator::create(nullptr);
  std::map<std::uint64_t, std::vector<std::string>> contents;
  auto event = events.begin();
  for (const std::uint64_t time : times) {
    for (; event != events.end() && event->timeMs <= time; ++event) {
      if (event->kind == RecordedKind::metric) validator->processMetric(event->entries);
    }
    contents[time] = contentOf(*validator);
  }
  return contents;
}

std::unique_ptr<RecordedHistory> opened(const std::string& path,
                                        const RecordedHistory::Limits& limits = {}) {
  RecordingFault fault;
  auto history = RecordedHistory::open(path, fault, limits);
  EXPECT_TRUE(history) << fault.message;
  while (history->readOn(100)) {
  }
  return history;
}

TEST(RecordedHistory, holdsTheStoreAsItWasAtAnyMoment) {
  const auto events = eventsOf(QEL_SIMULATED_DRIVE);
  RecordedHistory::Limits limits;
  limits.eventsBetween = 50;
  limits.checkpoints = 6;  // so that they are thinned several times
  const auto history = opened(QEL_SIMULATED_DRIVE, limits);
  EXPECT_EQ(history->beginMs(), events.front().timeMs);
  EXPECT_EQ(history->endMs(), events.back().timeMs);
  EXPECT_EQ(history->events(), events.size());
  std::mt19937_64 engine(1);
  std::uniform_int_distribution<std::uint64_t> anyMoment(history->beginMs(), history->endMs());
  std::vector<std::uint64_t> jumps = {0, history->endMs() + 1000, history->beginMs() - 1,
                                      history->endMs(), history->beginMs()};
  for (int i = 0; i < 60; ++i) {
    const std::uint64_t moment = anyMoment(engine);
    jumps.insert(jumps.end(), {moment, moment + 300, moment + 300});
  }
  const auto expected = contentsAt(events, {jumps.begin(), jumps.end()});
  for (const std::uint64_t moment : jumps) {
    EXPECT_EQ(contentOf(history->storeAt(moment)), expected.at(moment)) << moment;
  }
}

TEST(RecordedHistory, saysNothingWhileItReadsAndJumps) {
  struct Counting final : LogSink {
    void write(std::string_view) override { ++lines; }
    std::size_t lines = 0;
  };
  const auto output = std::make_shared<Counting>();
  const auto log = std::make_shared<Counting>();
  setStandardOutput(output);
  setSystemLog(log);
  const auto history = opened(QEL_SIMULATED_DRIVE);
  history->storeAt(history->endMs());
  EXPECT_EQ(output->lines, 0U);
  EXPECT_EQ(log->lines, 0U);
  standardOutput().write("after it");
  EXPECT_EQ(output->lines, 1U);
  setStandardOutput(nullptr);
  setSystemLog(nullptr);
}

TEST(RecordedHistory, tellsHowFarItIs) {
  RecordingFault fault;
  const auto history = RecordedHistory::open(QEL_SIMULATED_DRIVE, fault);
  float before = 0;
  EXPECT_EQ(history->progress(), 0);
  while (history->readOn(500)) {
    EXPECT_GE(history->progress(), before);
    EXPECT_LE(history->progress(), 1);
    before = history->progress();
  }
  EXPECT_EQ(history->progress(), 1);
}

TEST(RecordedHistory, goesFromHappeningToHappening) {
  const TemporaryFolder folder;
  const auto history =
      opened(folder.file("a.jsonl", lineOf(lteCell(1000, 1)) + lineOf(lteCell(2000, 1)) +
                                        lineOf(markEvent(2500, 1)) + lineOf(lteCell(3000, 2))));
  ASSERT_EQ(history->history().happenings().size(), 3U);
  EXPECT_EQ(history->history().happenings()[1].kind, HappeningKind::mark);
  EXPECT_EQ(history->history().happenings()[1].text, "Mark 1");
  EXPECT_EQ(history->nextHappening(0), 1000U);
  EXPECT_EQ(history->nextHappening(1000), 2500U);
  EXPECT_EQ(history->nextHappening(2500), 3000U);
  EXPECT_EQ(history->nextHappening(3000), std::nullopt);
  EXPECT_EQ(history->previousHappening(3000), 2500U);
  EXPECT_EQ(history->previousHappening(2499), 1000U);
  EXPECT_EQ(history->previousHappening(1000), std::nullopt);
  EXPECT_EQ(history->previousHappening(0), std::nullopt);
}

TEST(RecordedHistory, leavesBadLinesAndReportsOutAndSaysSo) {
  const TemporaryFolder folder;
  const std::string bad = "nonsense\n";
  const auto damaged = metricEvent(1500, MetricValidator::K_LTE_RRC_STATE, Bytes{0x08});
  const auto history = opened(folder.file("a.jsonl", lineOf(lteCell(1000, 1)) + bad + bad +
                                                         lineOf(damaged) + lineOf(lteCell(900, 2)) +
                                                         lineOf(lteCell(2000, 3)).substr(0, 40)));
  EXPECT_EQ(history->events(), 2U);
  EXPECT_EQ(history->endMs(), 1000U);
  EXPECT_EQ(history->notes(),
            (std::vector<std::string>{
                "It was cut off at its end", "2 lines are no events and are left out",
                "1 report cannot be decoded and is left out",
                "Its clock went back 1 time: what came then stands at the time before"}));
}

TEST(RecordedHistory, holdsTheStoreWhateverTheClockSaid) {
  const TemporaryFolder folder;
  constexpr std::uint64_t kLast = kLastRecordedMs;
  std::string lines;
  for (const std::uint64_t time :
       {std::uint64_t{0}, std::uint64_t{5}, kLast - 1, std::uint64_t{7}, kLast}) {
    lines += lineOf(lteCell(time, static_cast<std::uint32_t>(time % 400)));
  }
  RecordedHistory::Limits limits;
  limits.eventsBetween = 1;
  const auto history = opened(folder.file("a.jsonl", lines), limits);
  const auto cellAt = [&history](std::uint64_t timeMs) {
    return *history->storeAt(timeMs).myLTESCellInfoDict->find("phy_cell_id")->asUInt64();
  };
  EXPECT_EQ(cellAt(kLast), kLast % 400);
  EXPECT_EQ(cellAt(4), 0U);
  EXPECT_EQ(cellAt(6), (kLast - 1) % 400) << "far ahead, alone";
  EXPECT_EQ(cellAt(7), 7U);
  EXPECT_EQ(cellAt(history->endMs()), kLast % 400);
  EXPECT_EQ(cellAt(0), 0U);
}

std::string cellsAt(const std::vector<std::uint64_t>& times) {
  std::string lines;
  std::uint32_t code = 0;
  for (const std::uint64_t time : times) lines += lineOf(lteCell(time, ++code));
  return lines;
}

std::uint64_t codeAt(RecordedHistory& history, std::uint64_t timeMs) {
  return *history.storeAt(timeMs).myLTESCellInfoDict->find("phy_cell_id")->asUInt64();
}

TEST(RecordedHistory, bearsAnEventFarAhead) {
  const TemporaryFolder folder;
  constexpr std::uint64_t kYears = 300'000'000'000;
  const auto history =
      opened(folder.file("a.jsonl", cellsAt({1000, 2000, kYears, 3000, 4000, 90'000, 91'000})));
  EXPECT_EQ(history->endMs(), 91'000U);
  EXPECT_EQ(codeAt(*history, 2500), 3U);
  EXPECT_EQ(codeAt(*history, 3500), 4U);
  EXPECT_EQ(codeAt(*history, 89'000), 5U) << "a pause is none";
  EXPECT_EQ(codeAt(*history, 90'000), 6U);
  EXPECT_EQ(history->notes(),
            std::vector<std::string>{"Its clock was ahead at 1 event, shown at the time before"});
}

TEST(RecordedHistory, goesOnWhereItsClockWasSetBack) {
  const TemporaryFolder folder;
  const auto history = opened(folder.file(
      "a.jsonl", cellsAt({10'000'000, 10'001'000, 5000, 6000, 7000, 10'009'000, 10'010'000})));
  EXPECT_EQ(history->beginMs(), 10'000'000U);
  EXPECT_EQ(codeAt(*history, 10'001'000), 3U);
  EXPECT_EQ(codeAt(*history, 10'002'500), 4U);
  EXPECT_EQ(codeAt(*history, 10'003'000), 5U);
  EXPECT_EQ(codeAt(*history, 10'009'000), 6U) << "set right again";
  EXPECT_EQ(history->endMs(), 10'010'000U);
  EXPECT_EQ(history->notes(),
            std::vector<std::string>{
                "Its clock was set back 1 time: what came then is shown as if it had gone on"});
}

TEST(RecordedHistory, opensOfATooLargeRecordingWhatItCanHold) {
  const TemporaryFolder folder;
  std::string lines;
  for (unsigned i = 0; i < 20000; ++i) lines += lineOf(lteCell(1000 + i, i % 500));
  RecordedHistory::Limits limits;
  limits.bytes = 100'000;
  const auto history = opened(folder.file("a.jsonl", lines), limits);
  EXPECT_GT(history->events(), 1000U);
  EXPECT_LT(history->events(), 20000U);
  ASSERT_EQ(history->notes().size(), 1U);
  EXPECT_TRUE(history->notes()[0].starts_with("Too large to be opened whole"))
      << history->notes()[0];
  EXPECT_EQ(history->progress(), 1);
}

TEST(RecordedHistory, holdsNoMoreHappeningsThanItMay) {
  const TemporaryFolder folder;
  std::string lines;
  for (unsigned i = 0; i < 50; ++i) lines += lineOf(markEvent(1000 + i, i + 1));
  RecordedHistory::Limits limits;
  limits.happenings = 20;
  const auto history = opened(folder.file("a.jsonl", lines), limits);
  EXPECT_EQ(history->history().happenings().size(), 20U);
  EXPECT_EQ(history->endMs(), 1019U);
  ASSERT_EQ(history->notes().size(), 1U);
  EXPECT_TRUE(history->notes()[0].starts_with("Too large to be opened whole"))
      << history->notes()[0];
}

TEST(RecordedHistory, opensFilesOnly) {
  const TemporaryFolder folder;
  const std::string pipe = folder.path() + "/pipe.jsonl";
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  for (const std::string& path : {pipe, folder.path(), folder.path() + "/none"}) {
    RecordingFault fault;
    EXPECT_FALSE(RecordedHistory::open(path, fault));
    EXPECT_TRUE(fault.message.starts_with(path + ": ")) << fault.message;
  }
}

}  // namespace
}  // namespace qel::testing
