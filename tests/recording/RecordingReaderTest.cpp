#include "recording/RecordingReader.h"

#include <gmock/gmock.h>

#include <vector>

#include "recording/TemporaryFile.h"

namespace qel {
namespace {

using testing::gzipped;
using testing::TemporaryFile;
using BadLines = RecordingReader::BadLines;

constexpr std::string_view kFirst = "{\"time_ms\": 1, \"event\": \"trigger\", \"n\": 1}\n";
constexpr std::string_view kSecond = "{\"time_ms\": 2, \"event\": \"trigger\", \"n\": 2}\n";
constexpr std::string_view kBad = "{\"time_ms\": 2}\n";

std::string text(std::initializer_list<std::string_view> parts) {
  std::string all;
  for (const auto part : parts) all += part;
  return all;
}

struct Read {
  std::vector<std::uint64_t> timesMs;
  std::optional<RecordingFault> fault;
  std::optional<std::string> cutOff;
  std::uint64_t skipped = 0;
};

Read readAll(const TemporaryFile& file, BadLines badLines = BadLines::fail) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(file.path(), badLines, fault);
  if (!reader) return {{}, fault, {}, 0};
  Read read;
  while (const auto event = reader->next()) read.timesMs.push_back(event->timeMs);
  EXPECT_FALSE(reader->next()) << "an end is an end";
  read.fault = reader->fault();
  read.cutOff = reader->cutOff();
  read.skipped = reader->skippedLines();
  return read;
}

using Times = std::vector<std::uint64_t>;

TEST(RecordingReader, ReadsEventsInOrder) {
  const TemporaryFile file(".jsonl", text({kFirst, kSecond}));
  const Read read = readAll(file);
  EXPECT_EQ(read.timesMs, (Times{1, 2}));
  EXPECT_FALSE(read.fault);
  EXPECT_FALSE(read.cutOff);
}

TEST(RecordingReader, AnEmptyFileHasNoEvents) {
  const TemporaryFile file;
  const Read read = readAll(file);
  EXPECT_TRUE(read.timesMs.empty());
  EXPECT_FALSE(read.fault);
  EXPECT_FALSE(read.cutOff);
}

TEST(RecordingReader, KnowsGzipByItsContentWhateverTheName) {
  const TemporaryFile named(".jsonl.gz", gzipped(text({kFirst, kSecond})));
  EXPECT_EQ(readAll(named).timesMs, (Times{1, 2}));
  const TemporaryFile unnamed(".jsonl", gzipped(text({kFirst, kSecond})));
  EXPECT_EQ(readAll(unnamed).timesMs, (Times{1, 2}));
  const TemporaryFile plain(".jsonl.gz", kFirst);
  EXPECT_EQ(readAll(plain).timesMs, (Times{1}));
}

TEST(RecordingReader, TakesCarriageReturnsForBlanks) {
  std::string line(kFirst);
  line.insert(line.size() - 1, "\r");
  const TemporaryFile file(".jsonl", line);
  EXPECT_EQ(readAll(file).timesMs, (Times{1}));
}

TEST(RecordingReader, AFileThatIsNotThereIsNamed) {
  RecordingFault fault;
  EXPECT_FALSE(RecordingReader::open("/nowhere/at.all", BadLines::fail, fault));
  EXPECT_EQ(fault.kind, RecordingFault::Kind::notOpened);
  EXPECT_EQ(fault.message, "/nowhere/at.all: No such file or directory");
}

TEST(RecordingReader, ADirectoryIsNoRecording) {
  RecordingFault fault;
  EXPECT_FALSE(RecordingReader::open("/tmp", BadLines::fail, fault));
  EXPECT_EQ(fault.message, "/tmp: Is a directory");
}

TEST(RecordingReader, ABadLineEndsTheReadingWithFileLineAndReason) {
  const TemporaryFile file(".jsonl", text({kFirst, kBad, kSecond}));
  const Read read = readAll(file);
  EXPECT_EQ(read.timesMs, (Times{1}));
  ASSERT_TRUE(read.fault);
  EXPECT_EQ(read.fault->kind, RecordingFault::Kind::badData);
  EXPECT_EQ(read.fault->message, file.path() + ":2: \"event\" is missing");
}

TEST(RecordingReader, SkipsAndCountsBadLinesWhenAsked) {
  const TemporaryFile file(".jsonl", text({kBad, kFirst, "no JSON\n", "\n", kSecond}));
  const Read read = readAll(file, BadLines::skip);
  EXPECT_EQ(read.timesMs, (Times{1, 2}));
  EXPECT_EQ(read.skipped, 3U);
  EXPECT_FALSE(read.fault);
}

TEST(RecordingReader, ALastLineWithoutNewlineCountsWhenItIsWhole) {
  const TemporaryFile file(".jsonl", text({kFirst, kSecond.substr(0, kSecond.size() - 1)}));
  const Read read = readAll(file);
  EXPECT_EQ(read.timesMs, (Times{1, 2}));
  EXPECT_FALSE(read.cutOff);
}

TEST(RecordingReader, ALastLineThatWasCutOffAnywhereIsReportedApart) {
  for (std::size_t length = 1; length < kSecond.size() - 1; ++length) {
    const TemporaryFile file(".jsonl", text({kFirst, kSecond.substr(0, length)}));
    const Read read = readAll(file);
    EXPECT_EQ(read.timesMs, (Times{1})) << length;
    EXPECT_FALSE(read.fault) << length;
    ASSERT_TRUE(read.cutOff) << length;
    EXPECT_EQ(*read.cutOff, file.path() + ":2: last line cut off");
  }
}

TEST(RecordingReader, ALastLineOfZerosIsOneThatWasCutOff) {
  const TemporaryFile file(".jsonl", text({kFirst, std::string(100, '\0')}));
  const Read read = readAll(file);
  EXPECT_EQ(read.timesMs, (Times{1}));
  EXPECT_TRUE(read.cutOff);
}

TEST(RecordingReader, ALastLineThatIsJsonButNoEventIsAnErrorStill) {
  const TemporaryFile file(".jsonl", text({kFirst, kBad.substr(0, kBad.size() - 1)}));
  const Read read = readAll(file);
  ASSERT_TRUE(read.fault);
  EXPECT_FALSE(read.cutOff);
}

TEST(RecordingReader, ABadLineInTheMiddleIsNotOneThatWasCutOff) {
  const TemporaryFile file(".jsonl", text({"{\"time\n", kSecond}));
  const Read read = readAll(file);
  ASSERT_TRUE(read.fault);
  EXPECT_EQ(read.fault->kind, RecordingFault::Kind::badData);
}

TEST(RecordingReader, AGzipStreamMayEndAnywhere) {
  std::string lines;
  for (int i = 0; i < 200; ++i) lines += i % 2 == 0 ? kFirst : kSecond;
  const std::string whole = gzipped(lines);
  for (std::size_t length = 2; length < whole.size(); ++length) {
    const TemporaryFile file(".gz", std::string_view(whole).substr(0, length));
    const Read read = readAll(file);
    EXPECT_FALSE(read.fault) << length << " " << read.fault->message;
    EXPECT_TRUE(read.cutOff) << length;
    EXPECT_LE(read.timesMs.size(), 200U);
  }
}

TEST(RecordingReader, DamagedGzipDataAreAnError) {
  std::string damaged = gzipped(std::string(5000, 'x') + "\n");
  damaged[damaged.size() - 6] = static_cast<char>(damaged[damaged.size() - 6] ^ 0x55);
  const TemporaryFile file(".gz", damaged);
  const Read read = readAll(file, BadLines::skip);
  ASSERT_TRUE(read.fault);
  EXPECT_EQ(read.fault->kind, RecordingFault::Kind::badData);
  EXPECT_THAT(read.fault->message, ::testing::HasSubstr("damaged gzip data"));
}

TEST(RecordingReader, ALineBeyondReasonIsBadAndTheNextIsFound) {
  const std::string huge(20 * 1024 * 1024, ' ');
  const TemporaryFile file(".jsonl", text({kFirst, huge, "\n", kSecond}));
  const Read failed = readAll(file);
  ASSERT_TRUE(failed.fault);
  EXPECT_EQ(failed.fault->message, file.path() + ":2: line too long");
  EXPECT_EQ(readAll(file, BadLines::skip).timesMs, (Times{1, 2}));
}

TEST(RecordingReader, ALineOfTheLongestLengthIsRead) {
  std::string line(kFirst.substr(0, kFirst.size() - 1));
  line.resize(1024 * 1024, ' ');
  const TemporaryFile longest(".jsonl", text({line, "\n", kSecond}));
  EXPECT_EQ(readAll(longest).timesMs, (Times{1, 2}));
  const TemporaryFile longer(".jsonl", text({line, " \n", kSecond}));
  EXPECT_EQ(readAll(longer).fault->message, longer.path() + ":1: line too long");
}

TEST(RecordingReader, WhatDecompressesToAnEndlessLineIsOneBadLine) {
  const TemporaryFile file(".gz",
                           gzipped(text({kFirst, std::string(64U << 20U, ' '), "\n", kSecond})));
  const Read read = readAll(file, BadLines::skip);
  EXPECT_EQ(read.timesMs, (Times{1, 2}));
  EXPECT_EQ(read.skipped, 1U);
}

// Ended the program, with --skip-bad too.
TEST(RecordingReader, ANumberOutOfRangeIsABadLine) {
  const TemporaryFile file(
      ".jsonl",
      text({kFirst, "{\"time_ms\": 1, \"event\": \"trigger\", \"x\": 1e400}\n", kSecond}));
  EXPECT_EQ(readAll(file).fault->message,
            file.path() + ":2: \"x\" is nested too deep or out of range");
  EXPECT_EQ(readAll(file, BadLines::skip).timesMs, (Times{1, 2}));
}

TEST(RecordingReader, ReadsCompressedStreamsInARow) {
  const std::string half = gzipped("{\"time_ms\": 3, \"event\": ");
  const std::string otherHalf = gzipped("\"trigger\"}\n");
  const TemporaryFile file(".gz",
                           text({gzipped(kFirst), gzipped(""), half, otherHalf, gzipped(kSecond)}));
  const Read read = readAll(file);
  EXPECT_EQ(read.timesMs, (Times{1, 3, 2}));
  EXPECT_FALSE(read.fault);
  EXPECT_FALSE(read.cutOff);
}

TEST(RecordingReader, TheLastOfSeveralStreamsMayEndAnywhere) {
  const std::string last = gzipped(kSecond);
  for (std::size_t length = 1; length < last.size(); ++length) {
    const TemporaryFile file(".gz",
                             text({gzipped(kFirst), std::string_view(last).substr(0, length)}));
    const Read read = readAll(file);
    EXPECT_EQ(read.timesMs.front(), 1U) << length;
    EXPECT_FALSE(read.fault) << length;
    EXPECT_TRUE(read.cutOff) << length;
  }
}

// Was dropped without a word.
TEST(RecordingReader, PlainTextBehindACompressedStreamIsABadLine) {
  const TemporaryFile file(".gz", text({gzipped(text({kFirst, kSecond})), kFirst, kSecond}));
  const Read failed = readAll(file);
  EXPECT_EQ(failed.timesMs, (Times{1, 2}));
  ASSERT_TRUE(failed.fault);
  EXPECT_EQ(failed.fault->kind, RecordingFault::Kind::badData);
  EXPECT_EQ(failed.fault->message, file.path() + ":3: not compressed, as what comes before it is");
  const Read skipped = readAll(file, BadLines::skip);
  EXPECT_EQ(skipped.timesMs, (Times{1, 2}));
  EXPECT_EQ(skipped.skipped, 1U);
  EXPECT_FALSE(skipped.fault);
}

TEST(RecordingReader, CountsLinesFromOne) {
  const TemporaryFile file(".jsonl", text({kFirst, kSecond}));
  RecordingFault fault;
  const auto reader = RecordingReader::open(file.path(), BadLines::fail, fault);
  ASSERT_TRUE(reader);
  reader->next();
  EXPECT_EQ(reader->lineNumber(), 1U);
  reader->next();
  EXPECT_EQ(reader->lineNumber(), 2U);
}

}  // namespace
}  // namespace qel
