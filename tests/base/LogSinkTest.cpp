#include "base/LogSink.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <array>
#include <cerrno>

#include "base/DescriptorSink.h"
#include "base/DroppedOutput.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

class Pipe {
 public:
  Pipe() { EXPECT_EQ(::pipe2(_ends.data(), O_NONBLOCK), 0); }
  ~Pipe() {
    for (const int end : _ends) ::close(end);
  }
  int in() const { return _ends[1]; }
  std::string read() const {
    std::string text(100000, '\0');
    const ssize_t count = ::read(_ends[0], text.data(), text.size());
    text.resize(count < 0 ? 0 : static_cast<std::size_t>(count));
    return text;
  }

 private:
  std::array<int, 2> _ends{};
};

TEST(DescriptorSink, writesEachLineAtOnce) {
  const Pipe pipe;
  DescriptorSink sink(pipe.in());
  sink.write("one");
  EXPECT_EQ(pipe.read(), "one\n");
  sink.write("");
  EXPECT_EQ(pipe.read(), "\n");
}

TEST(BatchingSink, holdsLinesBackUntilItIsFlushed) {
  const Pipe pipe;
  BatchingSink sink(pipe.in());
  sink.write("one");
  sink.write("two");
  EXPECT_EQ(pipe.read(), "");
  sink.flush();
  EXPECT_EQ(pipe.read(), "one\ntwo\n");
}

TEST(BatchingSink, writesWhatIsLeftAtItsEnd) {
  const Pipe pipe;
  { BatchingSink(pipe.in()).write("last"); }
  EXPECT_EQ(pipe.read(), "last\n");
}

TEST(BatchingSink, writesAFullBatchByItself) {
  const Pipe pipe;
  BatchingSink sink(pipe.in());
  sink.write(std::string(64 * 1024 - 1, 'x'));
  EXPECT_EQ(pipe.read().size(), 64U * 1024);
}

TEST(BatchingSink, remembersTheFirstError) {
  BatchingSink sink(-1);
  sink.write("lost");
  EXPECT_EQ(sink.error(), 0);
  sink.flush();
  EXPECT_EQ(sink.error(), EBADF);
}

TEST(StandardOutputAndSystemLog, goWhereTheyAreSet) {
  const testing::CapturedStandardOutput out;
  const testing::CapturedSystemLog log;
  standardOutput().write("to the user");
  systemLog().write("to the log");
  EXPECT_EQ(out.lines(), std::vector<std::string>{"to the user"});
  EXPECT_EQ(log.lines(), std::vector<std::string>{"to the log"});
}

TEST(StandardOutput, dropsLinesWhenThereIsNoSink) {
  setStandardOutput(nullptr);
  EXPECT_NO_FATAL_FAILURE(standardOutput().write("dropped"));
}

TEST(StandardOutput, wantsLinesUnlessTheyAreDropped) {
  {
    const testing::CapturedStandardOutput out;
    EXPECT_TRUE(standardOutput().wantsLines());
    const DroppedOutput dropped;
    EXPECT_FALSE(standardOutput().wantsLines());
  }
  setStandardOutput(nullptr);
  EXPECT_FALSE(standardOutput().wantsLines());
}

}  // namespace
}  // namespace qel
