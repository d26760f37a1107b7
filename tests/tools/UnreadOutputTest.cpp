// Programs whose standard output nobody reads. They stood still in a write, deaf to SIGTERM.

#include <fcntl.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <thread>

#include "support/ChildProcess.h"
#include "tools/WithService.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

// The smallest pipe that there is, as a name to write to.
class UnreadPipe {
 public:
  explicit UnreadPipe(std::string name) : _name(std::move(name)) {
    EXPECT_EQ(::mkfifo(_name.c_str(), 0600), 0);
    _descriptor = ::open(_name.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    EXPECT_GT(::fcntl(_descriptor, F_SETPIPE_SZ, 1), 0);
  }
  ~UnreadPipe() { ::close(_descriptor); }
  UnreadPipe(const UnreadPipe&) = delete;
  UnreadPipe& operator=(const UnreadPipe&) = delete;

  const std::string& name() const { return _name; }
  int size() const {
    int bytes = 0;
    ::ioctl(_descriptor, FIONREAD, &bytes);
    return bytes;
  }
  // Something is in it, and no more comes.
  bool isStuck() const {
    const int before = size();
    std::this_thread::sleep_for(500ms);
    return before > 0 && size() == before;
  }
  std::string read() const {
    std::string text(65536, '\0');
    const ssize_t count = ::read(_descriptor, text.data(), text.size());
    text.resize(count < 0 ? 0 : static_cast<std::size_t>(count));
    return text;
  }

 private:
  const std::string _name;
  int _descriptor = -1;
};

class UnreadOutput : public WithService {
 protected:
  // How the program ends on SIGTERM, once its output is stuck; nothing when it does not.
  std::optional<int> endOf(const std::vector<std::string>& words) const {
    ChildProcess program(
        {.words = words,
         .environment = {"QT_QPA_PLATFORM=offscreen", "XDG_CONFIG_HOME=" + directory,
                         "XDG_RUNTIME_DIR=" + directory},
         .out = pipe.name()});
    EXPECT_TRUE(eventually([this] { return pipe.isStuck(); }));
    program.signal(SIGTERM);
    return program.waitForEnd(20s);
  }

  const UnreadPipe pipe{file("pipe")};
};

TEST_F(UnreadOutput, holdsUpNoViewer) {
  EXPECT_EQ(endOf({QEL_QELWATCH, "--event-log", "none", "--source", "simulated,speed=100"}), 0);
  EXPECT_EQ(pipe.read().back(), '\n');
}

TEST_F(UnreadOutput, holdsUpNoQelctlLive) {
  ASSERT_TRUE(Client(bus, "first").waitForReachable(true));
  EXPECT_EQ(endOf({QEL_QELCTL, "live", "--bus", bus.address()}), 0);
  EXPECT_EQ(pipe.read().back(), '\n');
}

TEST_F(UnreadOutput, letsQelctlLiveGoOnWithItsTable) {
  ASSERT_TRUE(Client(bus, "first").waitForReachable(true));
  EXPECT_EQ(endOf({QEL_QELCTL, "live", "--bus", bus.address(), "--screen", "LTE",
                   "LTE Neighbor Cell Meas"}),
            0);
}

TEST_F(UnreadOutput, isWaitedForByAReplayThatStillEndsOnASignal) {
  std::string events;
  for (int i = 0; i < 5000; ++i) events += kTriggerLine;
  const TemporaryRecording recording(events);
  EXPECT_EQ(endOf({QEL_QELCTL, "replay", recording.path()}), -SIGTERM);
}

}  // namespace
}  // namespace qel::testing
