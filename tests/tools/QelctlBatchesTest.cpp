// When qelctl's lines are written: to a terminal at once, to a file together, and never too late.

#include <fcntl.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <set>

#include "tools/Qelctl.h"
#include "tools/RunningQelctl.h"

namespace qel::testing {
namespace {

// A recording that goes on: what is fed to it, and then silence.
class EndlessRecording {
 public:
  EndlessRecording() : _path(::testing::TempDir() + "endless" + std::to_string(::getpid())) {
    EXPECT_EQ(::mkfifo(_path.c_str(), 0600), 0);
    _descriptor = ::open(_path.c_str(), O_RDWR | O_CLOEXEC);
  }
  ~EndlessRecording() {
    ::close(_descriptor);
    std::filesystem::remove(_path);
  }
  EndlessRecording(const EndlessRecording&) = delete;
  EndlessRecording& operator=(const EndlessRecording&) = delete;

  const std::string& path() const { return _path; }

  // A little more than a reader takes in one go: once it has taken the rest, it has worked off all
  // before.
  void feed() const {
    std::string text;
    while (text.size() < 70'000) text += kTriggerLine;
    std::string_view left = text;
    while (!left.empty()) {
      const ssize_t count = ::write(_descriptor, left.data(), left.size());
      ASSERT_GT(count, 0);
      left.remove_prefix(static_cast<std::size_t>(count));
    }
  }

  bool isTaken() const {
    int left = -1;
    return ::ioctl(_descriptor, FIONREAD, &left) == 0 && left == 0;
  }

 private:
  std::string _path;
  int _descriptor;
};

TEST(QelctlBatches, aTerminalSeesTheLinesWhileTheRecordingGoesOn) {
  const EndlessRecording recording;
  RunningQelctl replay({"replay", recording.path()}, RunningQelctl::Streams::terminal);
  recording.feed();
  EXPECT_TRUE(eventually([&] { return linesOf(replay.out()).size() > 800; }));
  EXPECT_TRUE(replay.out().starts_with("I dont care for events\r\n"));
  replay.signal(SIGTERM);
  EXPECT_EQ(replay.waitForEnd(), -SIGTERM);
}

TEST(QelctlBatches, aSignalLeavesWholeLinesOfAllThatWasRead) {
  for (const int signal : {SIGTERM, SIGINT}) {
    const EndlessRecording recording;
    RunningQelctl replay({"replay", recording.path()});
    recording.feed();
    ASSERT_TRUE(eventually([&] { return recording.isTaken(); }));
    EXPECT_EQ(replay.out(), "");
    replay.signal(signal);
    EXPECT_EQ(replay.waitForEnd(), -signal);
    const auto lines = linesOf(replay.out());
    EXPECT_GT(lines.size(), 800U);
    EXPECT_EQ(std::set<std::string>(lines.begin(), lines.end()),
              std::set<std::string>{"I dont care for events"});
    EXPECT_EQ(replay.out().back(), '\n');
    EXPECT_EQ(replay.err(), "");
  }
}

TEST(QelctlBatches, aFatalErrorComesAfterAllLinesBeforeIt) {
  const std::string bad =
      R"({"time_ms": 1, "event": "metric", "kKeyMetricID": 3952132, "kKeyPayload": "/w=="})";
  const TemporaryRecording recording(std::string(kTriggerLine) + kTriggerLine + bad + "\n");
  const Outcome outcome = qelctl({"replay", recording.path()});
  EXPECT_EQ(outcome.signal, SIGABRT);
  EXPECT_TRUE(outcome.out.starts_with("I dont care for events\nI dont care for events\n"))
      << outcome.out;
  EXPECT_TRUE(outcome.err.starts_with("fatal error: ")) << outcome.err;
}

}  // namespace
}  // namespace qel::testing
