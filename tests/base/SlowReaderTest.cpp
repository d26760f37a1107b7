// Lines for a reader who takes nothing. The program stood still in write until it was killed.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <pty.h>
#include <sys/socket.h>
#include <termios.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <thread>
#include <vector>

#include "base/DescriptorSink.h"
#include "base/FatalError.h"

namespace qel {
namespace {

using SlowReader = BatchingSink::SlowReader;

enum class Kind { pipe, socket, terminal };

// Both ends; writing waits, reading does not.
class Channel {
 public:
  explicit Channel(Kind kind) {
    switch (kind) {
      case Kind::pipe:
        EXPECT_EQ(::pipe2(_ends.data(), O_CLOEXEC), 0);
        break;
      case Kind::socket:
        EXPECT_EQ(::socketpair(AF_UNIX, SOCK_STREAM, 0, _ends.data()), 0);
        break;
      case Kind::terminal:
        EXPECT_EQ(::openpty(&_ends[0], &_ends[1], nullptr, nullptr, nullptr), 0);
        break;
    }
    EXPECT_EQ(::fcntl(_ends[0], F_SETFL, O_NONBLOCK), 0);
  }
  ~Channel() {
    for (const int end : _ends) ::close(end);
  }
  Channel(const Channel&) = delete;
  Channel& operator=(const Channel&) = delete;

  int in() const { return _ends[1]; }
  // What came since the last look.
  std::string read() const {
    std::string all;
    std::array<char, 65536> text{};
    for (;;) {
      const ssize_t count = ::read(_ends[0], text.data(), text.size());
      if (count <= 0) return all;
      all.append(text.data(), static_cast<std::size_t>(count));
    }
  }

 private:
  std::array<int, 2> _ends{};
};

std::vector<std::string> linesOf(const std::string& text) {
  std::vector<std::string> lines;
  for (std::size_t start = 0; start < text.size();) {
    const std::size_t end = text.find('\n', start);
    EXPECT_NE(end, std::string::npos) << "half a line: " << text.substr(start);
    if (end == std::string::npos) break;
    lines.push_back(text.substr(start, end - start));
    start = end + 1;
  }
  return lines;
}

constexpr std::string_view kDropped = "lines dropped because nobody read: ";

TEST(SlowReader, losesLinesWholeAndIsToldHowMany) {
  for (const Kind kind : {Kind::pipe, Kind::socket}) {
    const Channel channel(kind);
    BatchingSink sink(channel.in(), {}, SlowReader::losesLines);
    constexpr int kLines = 100'000;
    for (int i = 0; i < kLines; ++i) sink.write(std::to_string(i) + std::string(40, '.'));
    std::string all;
    for (std::string part = channel.read(); !part.empty(); part = channel.read()) {
      all += part;
      sink.flushWhatGoes();
    }
    sink.write("the next");
    sink.flush();
    all += channel.read();
    const auto lines = linesOf(all);
    ASSERT_GT(lines.size(), 10'000U);
    int next = 0;
    std::size_t at = 0;
    for (; lines[at] == std::to_string(next) + std::string(40, '.'); ++at) ++next;
    ASSERT_TRUE(lines[at].starts_with(kDropped)) << lines[at];
    EXPECT_EQ(std::stoi(lines[at].substr(kDropped.size())), kLines - next);
    EXPECT_EQ(lines[at + 1], "the next");
    EXPECT_EQ(lines.size(), at + 2);
  }
}

// Nothing waited then, so nobody wrote any more, and every further line was lost too.
TEST(SlowReader, goesOnAfterALineThatIsTooLongForIt) {
  const Channel channel(Kind::pipe);
  int asked = 0;
  BatchingSink sink(
      channel.in(), [&asked] { ++asked; }, SlowReader::losesLines);
  sink.write(std::string(BatchingSink::kMostWaiting, 'x'));
  EXPECT_EQ(asked, 1);
  sink.write("the next");
  sink.flushWhatGoes();
  EXPECT_EQ(linesOf(channel.read()),
            (std::vector<std::string>{std::string(kDropped) + "1", "the next"}));
}

TEST(SlowReader, leavesTheDescriptorAsItIsForOthers) {
  for (const Kind kind : {Kind::pipe, Kind::terminal}) {
    const Channel channel(kind);
    BatchingSink sink(channel.in(), {}, SlowReader::losesLines);
    sink.write("one");
    sink.flush();
    EXPECT_EQ(::fcntl(channel.in(), F_GETFL) & O_NONBLOCK, 0);
  }
}

TEST(SlowReader, ofATerminalThatWasStoppedGetsTheLinesLater) {
  const Channel terminal(Kind::terminal);
  BatchingSink sink(terminal.in(), {}, SlowReader::losesLines);
  ASSERT_EQ(::tcflow(terminal.in(), TCOOFF), 0);
  for (int i = 0; i < 1000; ++i) sink.write("a line of the event that came " + std::to_string(i));
  EXPECT_TRUE(sink.isBehind());
  terminal.read();
  ASSERT_EQ(::tcflow(terminal.in(), TCOON), 0);
  std::string all;
  const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(20);
  while (sink.isBehind() && std::chrono::steady_clock::now() < end) {
    sink.flushWhatGoes();
    all += terminal.read();
  }
  EXPECT_FALSE(sink.isBehind());
  all += terminal.read();
  EXPECT_NE(all.find("that came 999\r\n"), std::string::npos);
}

TEST(SlowReader, losesNoLineWhenItIsWaitedFor) {
  const Channel pipe(Kind::pipe);
  std::string all;
  BatchingSink sink(pipe.in());
  // Each time that the sink waits for it the reader takes what is there.
  sink.setGivesUp([&] {
    all += pipe.read();
    return false;
  });
  constexpr int kLines = 50'000;
  for (int i = 0; i < kLines; ++i) sink.write(std::to_string(i));
  sink.flush();
  all += pipe.read();
  const auto lines = linesOf(all);
  ASSERT_EQ(lines.size(), static_cast<std::size_t>(kLines));
  EXPECT_EQ(lines.back(), std::to_string(kLines - 1));
}

TEST(SlowReader, isWaitedForUntilTheProgramIsToldToEnd) {
  const Channel pipe(Kind::pipe);
  int asked = 0;
  BatchingSink sink(pipe.in());
  sink.setGivesUp([&asked] { return ++asked >= 3; });
  for (int i = 0; i < 10'000 && asked < 3; ++i) sink.write(std::string(100, '.'));
  EXPECT_EQ(asked, 3);
}

TEST(SlowReaderDeathTest, doesNotHoldUpAFatalError) {
  const Channel pipe(Kind::pipe);
  const auto end = [&pipe] {
    setStandardOutput(
        std::make_shared<BatchingSink>(pipe.in(), std::function<void()>(), SlowReader::losesLines));
    for (int i = 0; i < 100'000; ++i) standardOutput().write(std::string(40, '.'));
    fatalError("the reason");
  };
  EXPECT_EXIT(end(), ::testing::KilledBySignal(SIGABRT), "fatal error: the reason");
}

TEST(SlowReaderDeathTest, ofStandardErrorDoesNotHoldUpAFatalErrorEither) {
  const auto end = [] {
    const Channel pipe(Kind::pipe);
    ::dup2(pipe.in(), STDERR_FILENO);
    StandardErrorSink echo;
    for (int i = 0; i < 100'000; ++i) echo.write(std::string(40, '.'));
    fatalError("the reason");
  };
  EXPECT_EXIT(end(), ::testing::KilledBySignal(SIGABRT), "");
}

}  // namespace
}  // namespace qel
