#include "sources/recording/RecordingSequence.h"

#include <gmock/gmock.h>

#include "recording/TemporaryFile.h"
#include "support/RecordingSink.h"
#include "tesk/Constants.h"

namespace qel {
namespace {

using namespace sources;
using testing::TemporaryFile;

constexpr std::string_view kLines =
    R"({"time_ms": 10, "event": "metric", "kKeyMetricID": 3952132, "kKeyPayload": "CAE="}
{"time_ms": 20, "event": "trigger", "kKeyTriggerID": 7}
{"time_ms": 30, "event": "metric", "kKeyMetricID": 3952132, "extra": 5, "kKeyPayload": "CAI="}
{"time_ms": 40, "event": "metric", "kKeyMetricID": 3932179, "kKeyPayload": "CAM="}
)";

class RecordingSequenceTest : public ::testing::Test {
 protected:
  RecordingSequence sequence(bool loops) {
    auto firsts = std::make_shared<EventOfMetric>();
    SourceError error;
    EXPECT_TRUE(checkRecording(file.path(), *firsts, error)) << error.message;
    return {file.path(), loops, firsts};
  }
  TemporaryFile file{".jsonl", kLines};
};

TEST_F(RecordingSequenceTest, GivesEventsAsTheyWereRecorded) {
  auto events = sequence(false);
  const auto first = events.next();
  EXPECT_EQ(first->timeMs, 10U);
  EXPECT_EQ(first->stream, tesk::kEventMetric);
  EXPECT_EQ(first->entries, (Dictionary{{"kKeyMetricID", 3952132}, {"kKeyPayload", Bytes{8, 1}}}));
  const auto second = events.next();
  EXPECT_EQ(second->stream, tesk::kEventTrigger);
  EXPECT_EQ(second->entries, (Dictionary{{"kKeyTriggerID", 7}}));
  EXPECT_TRUE(events.next()->entries.contains("extra"));
  EXPECT_TRUE(events.next());
  EXPECT_FALSE(events.next());
  EXPECT_FALSE(events.next());
}

TEST_F(RecordingSequenceTest, BeginsAnewWhenItLoops) {
  auto events = sequence(true);
  std::vector<std::uint64_t> timesMs;
  for (int i = 0; i < 9; ++i) timesMs.push_back(events.next()->timeMs);
  EXPECT_THAT(timesMs, ::testing::ElementsAre(10, 20, 30, 40, 10, 20, 30, 40, 10));
}

TEST_F(RecordingSequenceTest, SaysWhichEventBeginsAnotherRound) {
  auto events = sequence(true);
  std::vector<bool> begins;
  for (int i = 0; i < 9; ++i) {
    events.next();
    begins.push_back(events.beginsAnew());
  }
  EXPECT_THAT(begins,
              ::testing::ElementsAre(false, false, false, false, true, false, false, false, true));
}

TEST_F(RecordingSequenceTest, ALoopOverAFileThatHasBecomeEmptyEnds) {
  auto events = sequence(true);
  for (int i = 0; i < 4; ++i) events.next();
  file.write("");
  EXPECT_FALSE(events.next());
}

TEST_F(RecordingSequenceTest, AFileThatHasBecomeBadEndsWithALogLine) {
  const testing::CapturedSystemLog systemLog;
  auto events = sequence(true);
  for (int i = 0; i < 4; ++i) events.next();
  file.write("no recording any more\n");
  EXPECT_FALSE(events.next());
  EXPECT_FALSE(events.next());
  ASSERT_EQ(systemLog.lines().size(), 1U);
  EXPECT_THAT(systemLog.lines()[0], ::testing::HasSubstr(":1: not JSON"));
}

Bytes payloadOf(const SourceAnswer& answer) {
  return *answer.entries.find(tesk::kKeyPayload)->asBytes();
}

TEST_F(RecordingSequenceTest, AnswersWithTheNewestEventThatPassed) {
  auto events = sequence(false);
  for (int i = 0; i < 3; ++i) events.passed(*events.next());
  EXPECT_EQ(payloadOf(events.query(19972)), (Bytes{8, 2}));
}

TEST_F(RecordingSequenceTest, AnswersBeforehandWithTheFirstInTheFile) {
  auto events = sequence(false);
  EXPECT_EQ(payloadOf(events.query(19972)), (Bytes{8, 1}));
  EXPECT_EQ(payloadOf(events.query(19)), (Bytes{8, 3}));
  events.next();
  events.next();
  events.next();
  EXPECT_EQ(payloadOf(events.query(19972)), (Bytes{8, 1})) << "read ahead, but not yet passed";
}

std::string metricLine(int metric, std::size_t payloadDigits) {
  return R"({"time_ms": 1, "event": "metric", "kKeyMetricID": )" +
         std::to_string(3932160 + metric) + R"(, "kKeyPayload": ")" +
         std::string(payloadDigits, 'A') + "\"}\n";
}

// A small compressed file could ask for any amount of memory.
TEST_F(RecordingSequenceTest, KeepsNoMoreToAnswerQueriesThanItsLimit) {
  std::string lines = metricLine(9000, 400'000) + metricLine(9001, 80'000);
  for (int metric = 0; metric < 300; ++metric) lines += metricLine(metric, 4);
  file.write(lines);
  auto events = sequence(false);
  while (const auto event = events.next()) events.passed(*event);
  int answered = 0;
  for (std::uint32_t metric = 0; metric < 10'000; ++metric) {
    if (events.query(metric).known) ++answered;
  }
  EXPECT_EQ(answered, 256);
  EXPECT_FALSE(events.query(9000).known);
  EXPECT_TRUE(events.query(9001).known);
}

TEST_F(RecordingSequenceTest, HasNoAnswerForWhatItDoesNotHold) {
  auto events = sequence(false);
  const SourceAnswer answer = events.query(20005);
  EXPECT_FALSE(answer.known);
  EXPECT_EQ(answer.message, "metric 20005 is not in the recording");
}

// Once a recording that had ended looked like one that has nothing to say just now.
TEST_F(RecordingSequenceTest, TellsThatItHasEnded) {
  auto events = sequence(false);
  EXPECT_EQ(events.condition().state, "playing");
  for (int i = 0; i < 4; ++i) EXPECT_TRUE(events.next());
  EXPECT_EQ(events.condition().state, "playing");
  EXPECT_FALSE(events.next());
  EXPECT_EQ(events.condition().state, "ended");
  EXPECT_EQ(inWords(events.condition()), "Recording has ended");
  auto endless = sequence(true);
  for (int i = 0; i < 9; ++i) EXPECT_TRUE(endless.next());
  EXPECT_EQ(endless.condition().state, "playing");
}

// Seven lines of a million characters, and what comes after them.
std::string large(const std::string& rest) {
  std::string lines;
  for (int i = 0; i < 7; ++i) {
    lines += R"({"time_ms": 1, "event": "trigger", "x": ")" + std::string(1'000'000, 'x') + "\"}\n";
  }
  return lines + rest;
}

// Once the whole file was read before its first event.
TEST_F(RecordingSequenceTest, WhatIsWrongFarIntoAFileIsToldWhenItIsReached) {
  const std::string content = large(metricLine(5, 4) + "no event\n" + metricLine(6, 4));
  for (const bool compressed : {false, true}) {
    const testing::CapturedSystemLog systemLog;
    file.write(compressed ? testing::gzipped(content) : content);
    auto events = sequence(true);
    for (int i = 0; i < 8; ++i) ASSERT_TRUE(events.next()) << i;
    EXPECT_EQ(events.condition().state, "playing");
    EXPECT_TRUE(systemLog.lines().empty());
    EXPECT_FALSE(events.next());
    EXPECT_FALSE(events.next());
    EXPECT_EQ(events.condition().state, "ended");
    EXPECT_THAT(events.condition().reason, ::testing::StartsWith("line 9: not JSON"));
    ASSERT_EQ(systemLog.lines().size(), 1U);
    EXPECT_THAT(systemLog.lines()[0], ::testing::StartsWith(file.path() + ":9: not JSON"));
  }
}

TEST_F(RecordingSequenceTest, WhatComesFarIntoAFileIsKnownOnceItHasPassed) {
  file.write(metricLine(5, 4) + large(metricLine(6, 4)));
  auto events = sequence(false);
  EXPECT_TRUE(events.query(5).known);
  EXPECT_EQ(events.query(6).message, "metric 6 is not in the recording so far");
  while (const auto event = events.next()) events.passed(*event);
  EXPECT_TRUE(events.query(6).known);
  EXPECT_EQ(events.query(7).message, "metric 7 is not in the recording");
}

TEST_F(RecordingSequenceTest, ThatItsLastLineWasCutOffIsToldOnceAndThere) {
  file.write(metricLine(5, 4) + R"({"time)");
  const testing::CapturedSystemLog systemLog;
  auto events = sequence(true);
  EXPECT_TRUE(events.next());
  EXPECT_TRUE(systemLog.lines().empty());
  for (int round = 0; round < 3; ++round) EXPECT_TRUE(events.next());
  EXPECT_EQ(systemLog.lines(), std::vector<std::string>{file.path() + ":2: last line cut off"});
}

}  // namespace
}  // namespace qel
