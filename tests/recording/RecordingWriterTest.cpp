#include "recording/RecordingWriter.h"

#include <gmock/gmock.h>
#include <signal.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include "recording/EventLine.h"
#include "recording/RecordingReader.h"
#include "recording/TemporaryFile.h"

namespace qel {
namespace {

using testing::TemporaryFile;

RecordedEvent event(std::uint64_t timeMs) {
  return {timeMs,
          RecordedKind::metric,
          {{"kKeyMetricID", std::int64_t{3952132}}, {"kKeyPayload", Bytes{8, 1, 16, 3}}}};
}

struct Content {
  std::size_t events = 0;
  bool cutOff = false;
};

Content contentOf(const std::string& path) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(path, RecordingReader::BadLines::fail, fault);
  Content content;
  while (const auto read = reader->next()) {
    EXPECT_EQ(read->timeMs, content.events);
    EXPECT_EQ(read->entries, event(0).entries);
    ++content.events;
  }
  EXPECT_FALSE(reader->fault());
  content.cutOff = reader->cutOff().has_value();
  return content;
}

class RecordingWriterOf : public ::testing::TestWithParam<const char*> {};

TEST_P(RecordingWriterOf, WritesWhatTheReaderReads) {
  const TemporaryFile file(GetParam());
  std::string error;
  const auto writer = RecordingWriter::create(file.path(), error);
  ASSERT_TRUE(writer) << error;
  for (std::uint64_t i = 0; i < 100; ++i) ASSERT_TRUE(writer->write(event(i)));
  EXPECT_EQ(writer->eventsWritten(), 100U);
  ASSERT_TRUE(writer->close());
  const Content content = contentOf(file.path());
  EXPECT_EQ(content.events, 100U);
  EXPECT_FALSE(content.cutOff);
}

// A file that everybody could read stayed so.
TEST_P(RecordingWriterOf, TakesAFileThatWasThereAwayFromOthers) {
  const TemporaryFile file(GetParam(), "old\n");
  ASSERT_EQ(::chmod(file.path().c_str(), 0666), 0);
  std::string error;
  const auto writer = RecordingWriter::create(file.path(), error);
  ASSERT_TRUE(writer) << error;
  struct stat status {};
  ASSERT_EQ(::stat(file.path().c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 07777U, 0600U);
}

TEST_P(RecordingWriterOf, ReplacesAnOlderFile) {
  const TemporaryFile file(GetParam(),
                           "something of old that is much longer than the new content\n");
  std::string error;
  const auto writer = RecordingWriter::create(file.path(), error);
  ASSERT_TRUE(writer->write(event(0)));
  ASSERT_TRUE(writer->close());
  EXPECT_EQ(contentOf(file.path()).events, 1U);
}

TEST_P(RecordingWriterOf, EveryEventCanBeReadAtOnce) {
  const TemporaryFile file(GetParam());
  std::string error;
  const auto writer = RecordingWriter::create(file.path(), error);
  for (std::uint64_t i = 0; i < 20; ++i) {
    writer->write(event(i));
    EXPECT_EQ(contentOf(file.path()).events, i + 1);
  }
}

TEST_P(RecordingWriterOf, AKilledProcessLeavesAllItsWholeEvents) {
  const TemporaryFile file(GetParam());
  const pid_t child = ::fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    std::string error;
    const auto writer = RecordingWriter::create(file.path(), error);
    for (std::uint64_t i = 0; i < 10; ++i) writer->write(event(i));
    ::kill(::getpid(), SIGKILL);
  }
  int status = 0;
  ASSERT_EQ(::waitpid(child, &status, 0), child);
  ASSERT_TRUE(WIFSIGNALED(status));
  EXPECT_EQ(contentOf(file.path()).events, 10U);
}

TEST_P(RecordingWriterOf, AFileCutAnywhereKeepsTheEventsBefore) {
  const TemporaryFile file(GetParam());
  std::string error;
  {
    const auto writer = RecordingWriter::create(file.path(), error);
    for (std::uint64_t i = 0; i < 5; ++i) writer->write(event(i));
  }
  const std::string whole = file.content();
  std::size_t before = 0;
  for (std::size_t length = 2; length < whole.size(); ++length) {
    file.write(std::string_view(whole).substr(0, length));
    const Content content = contentOf(file.path());
    EXPECT_GE(content.events, before) << length;
    before = content.events;
  }
  EXPECT_EQ(before, 5U);
}

INSTANTIATE_TEST_SUITE_P(PlainAndGzip, RecordingWriterOf, ::testing::Values(".jsonl", ".jsonl.gz"),
                         [](const auto& parameter) {
                           return std::string_view(parameter.param) == ".jsonl" ? "Plain" : "Gzip";
                         });

TEST(RecordingWriter, LeavesAFileOfSomebodyElseAlone) {
  if (::geteuid() != 0) GTEST_SKIP() << "only root can give a file away";
  const TemporaryFile file(".jsonl", "theirs\n");
  ASSERT_EQ(::chown(file.path().c_str(), 12345, 12345), 0);
  std::string error;
  EXPECT_FALSE(RecordingWriter::create(file.path(), error));
  EXPECT_EQ(error, file.path() + ": belongs to another user");
  EXPECT_EQ(file.content(), "theirs\n");
}

// An event that a reader refuses made the whole recording unreadable.
TEST(RecordingWriter, LeavesOutWhatNoReaderWouldTake) {
  const TemporaryFile file(".jsonl");
  std::string error;
  const auto writer = RecordingWriter::create(file.path(), error);
  RecordedEvent tooLong = event(0);
  tooLong.entries.set("kKeyPayload", Bytes(1024 * 1024));
  RecordedEvent tooMany = event(0);
  for (int i = 0; i < 300; ++i) tooMany.entries.append(std::to_string(i), i);
  EXPECT_TRUE(writer->write(event(0)));
  EXPECT_TRUE(writer->write(tooLong));
  EXPECT_TRUE(writer->write(tooMany));
  EXPECT_TRUE(writer->write(event(1)));
  EXPECT_EQ(writer->eventsWritten(), 2U);
  EXPECT_EQ(writer->eventsLeftOut(), 2U);
  EXPECT_TRUE(writer->close());
  EXPECT_EQ(contentOf(file.path()).events, 2U);
}

TEST(RecordingWriter, GzipIsChosenByTheName) {
  const TemporaryFile file(".jsonl.gz");
  std::string error;
  RecordingWriter::create(file.path(), error)->close();
  ASSERT_GE(file.content().size(), 2U);
  EXPECT_EQ(file.content().substr(0, 2), "\x1F\x8B");
}

TEST(RecordingWriter, AFileThatCannotBeOpenedIsNamed) {
  std::string error;
  EXPECT_FALSE(RecordingWriter::create("/nowhere/at.all", error));
  EXPECT_EQ(error, "/nowhere/at.all: No such file or directory");
}

TEST(RecordingWriter, AFullDiskIsReportedAndNothingMoreWritten) {
  std::string error;
  const auto writer = RecordingWriter::create("/dev/full", error);
  ASSERT_TRUE(writer) << error;
  EXPECT_FALSE(writer->write(event(0)));
  EXPECT_EQ(writer->error(), "/dev/full: No space left on device");
  EXPECT_FALSE(writer->write(event(1)));
  EXPECT_EQ(writer->eventsWritten(), 0U);
  EXPECT_FALSE(writer->close());
}

TEST(RecordingWriter, NothingIsWrittenAfterTheClose) {
  const TemporaryFile file;
  std::string error;
  const auto writer = RecordingWriter::create(file.path(), error);
  ASSERT_TRUE(writer->close());
  EXPECT_FALSE(writer->write(event(0)));
}

}  // namespace
}  // namespace qel
