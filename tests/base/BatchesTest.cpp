// Lines by the batch: to a file, a pipe and a terminal, and at the end of the process.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <pty.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <cstdlib>

#include "base/DescriptorSink.h"
#include "base/FatalError.h"

namespace qel {
namespace {

using std::chrono::milliseconds;
using Clock = BatchingSink::Clock;

enum class Kind { file, pipe, terminal };

// Both ends of where the lines go.
class Channel {
 public:
  explicit Channel(Kind kind) {
    if (kind == Kind::pipe) {
      EXPECT_EQ(::pipe2(_ends.data(), O_NONBLOCK), 0);
    } else if (kind == Kind::terminal) {
      EXPECT_EQ(::openpty(&_ends[0], &_ends[1], nullptr, nullptr, nullptr), 0);
      EXPECT_EQ(::fcntl(_ends[0], F_SETFL, O_NONBLOCK), 0);
    } else {
      std::string name = ::testing::TempDir() + "batchesXXXXXX";
      _ends[1] = ::mkstemp(name.data());
      _ends[0] = ::open(name.c_str(), O_RDONLY);
      ::unlink(name.c_str());
    }
  }
  ~Channel() {
    for (const int end : _ends) ::close(end);
  }
  Channel(const Channel&) = delete;
  Channel& operator=(const Channel&) = delete;

  int in() const { return _ends[1]; }
  // What came since the last look.
  std::string read() const {
    std::array<char, 4096> text{};
    const ssize_t count = ::read(_ends[0], text.data(), text.size());
    return {text.data(), count < 0 ? 0 : static_cast<std::size_t>(count)};
  }

 private:
  std::array<int, 2> _ends{};
};

TEST(Batches, aTerminalGetsEachLineAtOnce) {
  const Channel terminal(Kind::terminal);
  int waits = 0;
  BatchingSink sink(terminal.in(), [&waits] { ++waits; });
  sink.write("one");
  EXPECT_EQ(terminal.read(), "one\r\n");
  sink.write("two");
  EXPECT_EQ(terminal.read(), "two\r\n");
  EXPECT_EQ(waits, 0);
}

TEST(Batches, filesAndPipesGetThemTogether) {
  for (const Kind kind : {Kind::file, Kind::pipe}) {
    const Channel channel(kind);
    BatchingSink sink(channel.in());
    sink.write("one");
    sink.write("two");
    EXPECT_EQ(channel.read(), "");
    sink.flush();
    EXPECT_EQ(channel.read(), "one\ntwo\n");
  }
}

TEST(Batches, tellOnceThatALineWaits) {
  const Channel pipe(Kind::pipe);
  int waits = 0;
  BatchingSink sink(pipe.in(), [&waits] { ++waits; });
  sink.write("one");
  sink.write("two");
  EXPECT_EQ(waits, 1);
  sink.flush();
  sink.write("three");
  EXPECT_EQ(waits, 2);
}

TEST(Batches, aQuietSinkWritesAtOnceAndABusyOneAfterAMoment) {
  const Channel pipe(Kind::pipe);
  BatchingSink sink(pipe.in());
  auto now = Clock::now();
  EXPECT_FALSE(sink.flushWhenDue(now)) << "nothing waits";
  sink.write("one");
  EXPECT_FALSE(sink.flushWhenDue(now));
  EXPECT_EQ(pipe.read(), "one\n");
  sink.write("two");
  const auto due = sink.flushWhenDue(now + milliseconds(1));
  ASSERT_TRUE(due);
  EXPECT_GT(*due, now + milliseconds(1));
  EXPECT_LE(*due, now + milliseconds(100));
  sink.write("three");
  EXPECT_EQ(sink.flushWhenDue(*due - milliseconds(1)), due);
  EXPECT_EQ(pipe.read(), "");
  EXPECT_FALSE(sink.flushWhenDue(*due));
  EXPECT_EQ(pipe.read(), "two\nthree\n");
}

// Standard output of this process by the batch into a file, with one line that still waits.
void leaveALineWaiting(const Channel& file) {
  setStandardOutput(std::make_shared<BatchingSink>(file.in()));
  standardOutput().write("the last line");
}

TEST(BatchesDeathTest, areCompleteWhenTheProcessExits) {
  const Channel file(Kind::file);
  const auto end = [&file] {
    leaveALineWaiting(file);
    std::exit(3);
  };
  EXPECT_EXIT(end(), ::testing::ExitedWithCode(3), "");
  EXPECT_EQ(file.read(), "the last line\n");
}

TEST(BatchesDeathTest, areCompleteBeforeAFatalError) {
  const Channel file(Kind::file);
  const auto end = [&file] {
    leaveALineWaiting(file);
    fatalError("the reason");
  };
  EXPECT_EXIT(end(), ::testing::KilledBySignal(SIGABRT), "fatal error: the reason");
  EXPECT_EQ(file.read(), "the last line\n");
}

}  // namespace
}  // namespace qel
