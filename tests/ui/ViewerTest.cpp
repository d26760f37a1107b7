// The program as its users start it.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <pty.h>
#include <spawn.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <thread>

#include "support/Subprocess.h"

namespace qel {
namespace {

using testing::Outcome;

class Viewer : public ::testing::Test {
 protected:
  Viewer() {
    std::filesystem::create_directories(home);
    std::filesystem::permissions(home, std::filesystem::perms::owner_all);
    for (const char* name : {"DISPLAY", "WAYLAND_DISPLAY"}) ::unsetenv(name);
    ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ::setenv("XDG_CONFIG_HOME", home.c_str(), 1);
    ::setenv("XDG_RUNTIME_DIR", home.c_str(), 1);
    ::setenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent", 1);
  }
  ~Viewer() override { std::filesystem::remove_all(home); }

  static Outcome start(const std::vector<std::string>& arguments) {
    return testing::run(QELWATCH_PROGRAM, arguments);
  }

  // Waits for a file to be there; a minute is for a machine in trouble.
  static bool appears(const std::string& file) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::minutes(1);
    while (!std::filesystem::exists(file)) {
      if (std::chrono::steady_clock::now() > deadline) return false;
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    return true;
  }

  std::filesystem::path home = std::filesystem::path(::testing::TempDir()) /
                               ("qelwatch_viewer_test" + std::to_string(::getpid()));
};

TEST_F(Viewer, tellsItsVersionAndItsOptions) {
  const Outcome version = start({"--version"});
  EXPECT_EQ(version.exitCode, 0);
  EXPECT_EQ(version.out.rfind("qelwatch ", 0), 0U) << version.out;
  const Outcome help = start({"--help"});
  EXPECT_EQ(help.exitCode, 0);
  for (const char* option : {"--source", "--bus", "--theme", "--picture", "--event-log",
                             "--self-test", "--verbose", "--version"}) {
    EXPECT_NE(help.out.find(option), std::string::npos) << option;
  }
}

TEST_F(Viewer, saysInOneLineWhatIsWrongWithItsCall) {
  const std::vector<std::vector<std::string>> wrongCalls = {
      {"--nonsense"},          {"extra"},
      {"--theme", "pink"},     {"--source"},
      {"--source", "radio"},   {"--source", "simulated,seed=x"},
      {"--event-log", "some"}, {"--bus", "nonsense"}};
  for (const auto& wrong : wrongCalls) {
    const Outcome outcome = start(wrong);
    EXPECT_EQ(outcome.exitCode, 64) << wrong.back();
    EXPECT_EQ(outcome.err.rfind("qelwatch: ", 0), 0U) << outcome.err;
    EXPECT_EQ(std::count(outcome.err.begin(), outcome.err.end(), '\n'), 1) << outcome.err;
  }
}

TEST_F(Viewer, saysThatARecordingIsNotThere) {
  const Outcome outcome = start({"--source", "recording:/no/such/file.jsonl"});
  EXPECT_EQ(outcome.exitCode, 66);
  EXPECT_NE(outcome.err.find("/no/such/file.jsonl"), std::string::npos);
}

TEST_F(Viewer, drawsEveryScreenInItsSelfTest) {
  const Outcome outcome = start({"--self-test", "--source", "simulated"});
  EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
  EXPECT_NE(outcome.err.find("50 screens, 0 failures"), std::string::npos) << outcome.err;
  EXPECT_EQ(outcome.out.rfind("pushing metric file\n", 0), 0U) << outcome.out;
}

TEST_F(Viewer, keepsAPictureAndEndsOnATermination) {
  const std::string picture = home / "picture.png";
  std::vector<std::string> words = {QELWATCH_PROGRAM, "--picture", picture};
  std::vector<char*> argv;
  for (std::string& word : words) argv.push_back(word.data());
  argv.push_back(nullptr);
  for (const int signal : {SIGTERM, SIGINT}) {
    std::filesystem::remove(picture);
    pid_t viewer = 0;
    ASSERT_EQ(::posix_spawn(&viewer, QELWATCH_PROGRAM, nullptr, nullptr, argv.data(), environ), 0);
    EXPECT_TRUE(appears(picture));
    ::kill(viewer, signal);
    int status = 0;
    ASSERT_EQ(::waitpid(viewer, &status, 0), viewer);
    EXPECT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 0);
    std::string start(4, ' ');
    std::ifstream(picture, std::ios::binary).read(start.data(), 4);
    EXPECT_EQ(start, "\x89PNG");
  }
}

// What qelwatch has written so far to where its standard output goes.
class RunningViewer {
 public:
  explicit RunningViewer(std::vector<std::string> words, bool onTerminal) {
    int in = -1;
    if (onTerminal) {
      EXPECT_EQ(::openpty(&_out, &in, nullptr, nullptr, nullptr), 0);
    } else {
      std::array<int, 2> ends{};
      EXPECT_EQ(::pipe(ends.data()), 0);
      _out = ends[0];
      in = ends[1];
    }
    ::fcntl(_out, F_SETFL, O_NONBLOCK);
    ::fcntl(_out, F_SETFD, FD_CLOEXEC);
    words.insert(words.begin(), QELWATCH_PROGRAM);
    std::vector<char*> argv;
    for (std::string& word : words) argv.push_back(word.data());
    argv.push_back(nullptr);
    posix_spawn_file_actions_t actions;
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawn_file_actions_adddup2(&actions, in, STDOUT_FILENO);
    EXPECT_EQ(::posix_spawn(&_pid, argv[0], &actions, nullptr, argv.data(), environ), 0);
    ::posix_spawn_file_actions_destroy(&actions);
    ::close(in);
  }
  ~RunningViewer() { ::close(_out); }
  RunningViewer(const RunningViewer&) = delete;
  RunningViewer& operator=(const RunningViewer&) = delete;

  const std::string& out() {
    std::array<char, 4096> piece{};
    for (ssize_t count = 0; (count = ::read(_out, piece.data(), piece.size())) > 0;) {
      _text.append(piece.data(), static_cast<std::size_t>(count));
    }
    return _text;
  }

  // A minute is for a machine in trouble.
  bool says(const std::string& wanted) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::minutes(1);
    while (out().find(wanted) == std::string::npos) {
      if (std::chrono::steady_clock::now() > deadline) return false;
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    return true;
  }

  // Its exit code, or minus the signal that ended it.
  int end(int signal) {
    ::kill(_pid, signal);
    int status = 0;
    EXPECT_EQ(::waitpid(_pid, &status, 0), _pid);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
  }

 private:
  int _out = -1;
  std::string _text;
  pid_t _pid = 0;
};

TEST_F(Viewer, itsReaderSeesEveryLineThoughNoMoreCome) {
  const std::string recording = home / "three.jsonl";
  const std::string event = R"({"time_ms": 1, "event": "trigger", "kKeyTriggerID": 8323091})";
  std::ofstream(recording) << event << '\n' << event << '\n' << event << '\n';
  for (const bool onTerminal : {false, true}) {
    for (const int signal : {SIGTERM, SIGINT}) {
      RunningViewer viewer({"--source", "recording:" + recording}, onTerminal);
      const std::string line = std::string("I dont care for events") + (onTerminal ? "\r\n" : "\n");
      EXPECT_TRUE(viewer.says(line + line + line)) << viewer.out();
      EXPECT_EQ(viewer.end(signal), 0);
      EXPECT_EQ(viewer.out().back(), '\n');
    }
  }
}

TEST_F(Viewer, withoutDisplayDrawsOffScreenAndSaysSo) {
  ::unsetenv("QT_QPA_PLATFORM");
  ::unsetenv("XDG_RUNTIME_DIR");
  const std::string picture = home / "picture.png";
  const Outcome outcome = start({"--self-test", "--source", "simulated", "--picture", picture});
  EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
  EXPECT_EQ(outcome.err, "qelwatch: no display, drawing off screen; the picture is kept in " +
                             picture + "\nqelwatch: self-test: 50 screens, 0 failures\n");
}

// Once, whoever made the folder that the toolkit makes up could be this user's session bus.
TEST_F(Viewer, takesNoSessionBusOutOfAFolderThatIsOpenToOthers) {
  const std::filesystem::path madeUp = home / ("runtime-" + std::to_string(::getuid()));
  std::filesystem::create_directory(madeUp);
  std::filesystem::permissions(madeUp, std::filesystem::perms::all);
  const int strangersBus = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0);
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  const std::string path = madeUp / "bus";
  path.copy(address.sun_path, sizeof address.sun_path - 1);
  ASSERT_EQ(::bind(strangersBus, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
  ASSERT_EQ(::listen(strangersBus, 1), 0);
  ::setenv("TMPDIR", home.c_str(), 1);
  ::unsetenv("XDG_RUNTIME_DIR");
  ::unsetenv("DBUS_SESSION_BUS_ADDRESS");
  const Outcome outcome = start({"--self-test", "--bus", "session"});
  EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
  EXPECT_EQ(::accept(strangersBus, nullptr, nullptr), -1) << "the viewer called it";
  EXPECT_EQ(errno, EAGAIN);
  ::close(strangersBus);
  const auto entries = std::filesystem::directory_iterator(home);
  EXPECT_TRUE(std::none_of(begin(entries), end(entries), [](const auto& entry) {
    return entry.path().filename().string().starts_with("qelwatch-");
  })) << "what it made for itself is left";
}

}  // namespace
}  // namespace qel
