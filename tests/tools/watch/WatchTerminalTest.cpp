// qelctl watch and its terminal: nothing that it changes there stays.

#include <gtest/gtest.h>

#include <csignal>
#include <thread>

#include "support/Sanitized.h"
#include "tools/Qelctl.h"
#include "tools/RunningQelctl.h"
#include "tools/watch/Pty.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

const std::vector<std::string> kSimulated = {"--source", "simulated,speed=20"};

TEST(WatchTerminal, isAsBeforeWhenItIsLeftOrInterrupted) {
  for (const int signal : {0, SIGINT, SIGTERM}) {
    WatchAtPty watch(kSimulated);
    const termios before = watch.settings();
    ASSERT_TRUE(watch.writes("Operator"));
    EXPECT_FALSE(WatchAtPty::areSame(watch.settings(), before));
    if (signal == 0) {
      watch.type("q");
    } else {
      watch.signal(signal);
    }
    EXPECT_TRUE(watch.writes("\x1B[?1049l")) << "the other screen stays";
    EXPECT_EQ(watch.waitForEnd(), 0);
    EXPECT_TRUE(WatchAtPty::areSame(watch.settings(), before)) << "signal " << signal;
  }
}

TEST(WatchTerminal, isGivenBackWhileTheProgramIsStopped) {
  WatchAtPty watch(kSimulated);
  const termios before = watch.settings();
  ASSERT_TRUE(watch.writes("Operator"));
  const termios watching = watch.settings();
  watch.signal(SIGSTOP);  // a process whose group has nobody to go on with is not stopped by TSTP
  ASSERT_EQ(watch.waitForStop(), -SIGSTOP);
  watch.signal(SIGCONT);
  watch.signal(SIGTSTP);
  EXPECT_TRUE(watch.writes("\x1B[?1049l"));
  EXPECT_TRUE(eventually([&] { return WatchAtPty::areSame(watch.settings(), watching); }));
  EXPECT_FALSE(WatchAtPty::areSame(before, watching));
  watch.type("h");
  EXPECT_TRUE(watch.writes("Happenings"));
}

TEST(WatchTerminal, holdsNothingUpWhenItDoesNotRead) {
  WatchAtPty watch(kSimulated);
  const termios before = watch.settings();
  ASSERT_TRUE(eventually([&] { return !WatchAtPty::areSame(watch.settings(), before); }));
  std::this_thread::sleep_for(2s);  // frames that nobody reads
  watch.signal(SIGTERM);
  EXPECT_EQ(watch.waitForEnd(), 0);
  EXPECT_TRUE(WatchAtPty::areSame(watch.settings(), before));
}

TEST(WatchTerminal, isAsBeforeWhateverSignalEndsTheProgram) {
  for (const int signal : {SIGQUIT, SIGABRT, SIGUSR1, SIGALRM, SIGSEGV}) {
    WatchAtPty watch(kSimulated);
    const termios before = watch.settings();
    ASSERT_TRUE(watch.writes("Operator"));
    watch.signal(signal);
    const int end = watch.waitForEnd();
    const bool isReported = kIsSanitized && signal == SIGSEGV;
    EXPECT_EQ(end, isReported ? end : -signal);
    EXPECT_TRUE(watch.writes("\x1B[?1049l")) << "signal " << signal;
    EXPECT_TRUE(WatchAtPty::areSame(watch.settings(), before)) << "signal " << signal;
  }
}

// While it still waits for a terminal that does not read.
TEST(WatchTerminal, isAsBeforeWhenItIsInterruptedTwice) {
  WatchAtPty watch(kSimulated);
  const termios before = watch.settings();
  ASSERT_TRUE(watch.writes("Operator"));
  watch.holdOutput();
  std::this_thread::sleep_for(1s);  // frames that nobody reads
  watch.signal(SIGINT);
  std::this_thread::sleep_for(100ms);
  watch.signal(SIGINT);
  watch.waitForEnd();
  EXPECT_TRUE(WatchAtPty::areSame(watch.settings(), before));
}

TEST(WatchTerminal, endsTheProgramWhenItIsGone) {
  WatchAtPty watch(kSimulated);
  ASSERT_TRUE(watch.writes("Operator"));
  watch.hangUp();
  EXPECT_EQ(watch.waitForEnd(), 0);
}

TEST(WatchTerminal, getsNothingWhileNothingChanges) {
  const TemporaryRecording recording("");
  WatchAtPty watch({recording.path()});
  ASSERT_TRUE(watch.writes("Recordings"));
  std::this_thread::sleep_for(1s);
  const std::size_t before = watch.written().size();
  std::this_thread::sleep_for(2s);
  EXPECT_EQ(watch.written().size(), before);
}

TEST(WatchTerminal, isDrawnAnewOnlyWhereSomethingChanged) {
  WatchAtPty watch(kSimulated);
  ASSERT_TRUE(watch.writes("Operator"));
  const std::size_t before = watch.written().size();
  ASSERT_TRUE(eventually([&] { return watch.written().size() > before + 2000; }));
  const std::string later = watch.written().substr(before);
  EXPECT_EQ(later.find("\x1B[2J"), std::string::npos) << "the screen is cleared";
  EXPECT_EQ(later.find("\x1B[H\x1B[J"), std::string::npos) << "the screen is cleared";
  EXPECT_EQ(later.find("Happenings"), std::string::npos) << "what stays is written again";
}

TEST(WatchTerminal, mustBeOne) {
  const Outcome outcome = qelctl({"watch", "--source", "simulated"});
  EXPECT_EQ(outcome.exitCode, 64);
  EXPECT_EQ(outcome.err, "qelctl: watch: standard input and output must be a terminal\n");
}

TEST(WatchTerminal, mustBeOfAKnownType) {
  WatchAtPty watch(kSimulated, "no-such-terminal");
  const termios before = watch.settings();
  EXPECT_TRUE(watch.writes("TERM is \"no-such-terminal\""));
  EXPECT_EQ(watch.waitForEnd(), 69);
  EXPECT_TRUE(WatchAtPty::areSame(watch.settings(), before));
}

TEST(WatchTerminal, saysWhatIsWrongWithASourceBeforeItIsTouched) {
  WatchAtPty watch({"--source", "nonsense"});
  EXPECT_EQ(watch.waitForEnd(), 64);
  EXPECT_TRUE(watch.writes("qelctl: "));
  EXPECT_EQ(watch.written().find("\x1B[?1049h"), std::string::npos);
}

}  // namespace
}  // namespace qel::testing
