// The viewer as a program beside the service as a program.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <thread>

#include "bus/ServiceProcess.h"

namespace qel::testing {
namespace {

namespace fs = std::filesystem;

// The window, drawn off screen; what it prints is kept in a file.
class ViewerProcess {
 public:
  ViewerProcess(const PrivateBus& bus, const std::string& directory) : _out(directory + "/out") {
    ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ::setenv("XDG_CONFIG_HOME", directory.c_str(), 1);
    ::setenv("XDG_RUNTIME_DIR", directory.c_str(), 1);
    ::setenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent", 1);
    std::array<std::string, 3> words = {QEL_QELWATCH, "--bus", bus.address()};
    std::array<char*, 4> argv{};
    for (std::size_t i = 0; i < words.size(); ++i) argv[i] = words[i].data();
    posix_spawn_file_actions_t actions;
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, _out.c_str(),
                                       O_WRONLY | O_CREAT | O_TRUNC, 0600);
    EXPECT_EQ(::posix_spawn(&_pid, argv[0], &actions, nullptr, argv.data(), environ), 0);
    ::posix_spawn_file_actions_destroy(&actions);
  }
  ~ViewerProcess() { EXPECT_EQ(end(), 0); }

  // Waits, a minute at most, until the line was printed so many times more than now.
  bool waitForMore(const std::string& line, int times) {
    return waitForAll(line, count(line) + times);
  }

  // The same until it was printed so many times since the start.
  bool waitForAll(const std::string& line, int wanted) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(60);
    while (count(line) < wanted) {
      if (std::chrono::steady_clock::now() > deadline) return false;
      std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    return true;
  }

  int count(const std::string& line) const {
    std::ifstream file(_out);
    int found = 0;
    for (std::string read; std::getline(file, read);) found += read == line ? 1 : 0;
    return found;
  }

 private:
  int end() const {
    ::kill(_pid, SIGTERM);
    int status = 0;
    ::waitpid(_pid, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
  }

  const std::string _out;
  pid_t _pid = 0;
};

class ViewerOnTheBus : public ::testing::Test {
 protected:
  ViewerOnTheBus() {
    fs::create_directories(directory + "/state");
    fs::permissions(directory, fs::perms::owner_all);
  }
  ~ViewerOnTheBus() override { fs::remove_all(directory); }

  const std::string directory =
      (fs::temp_directory_path() / ("qelviewer" + std::to_string(::getpid()))).string();
  const std::string valid = "Received Valid Metric";
  PrivateBus bus;
};

TEST_F(ViewerOnTheBus, showsMetricsAgainAfterTheServiceWasKilled) {
  ServiceProcess service(bus, "simulated,speed=10", directory + "/state");
  ASSERT_TRUE(Client(bus, "first").waitForReachable(true));
  ViewerProcess viewer(bus, directory);
  ASSERT_TRUE(viewer.waitForMore(valid, 5));
  service.signal(SIGKILL);
  service.waitForEnd();
  service.start();
  EXPECT_TRUE(viewer.waitForMore(valid, 5));
  EXPECT_EQ(viewer.count("pushing metric file"), 1);
}

TEST_F(ViewerOnTheBus, comesIntoServiceWhenTheServiceStartsLater) {
  ViewerProcess viewer(bus, directory);
  ASSERT_TRUE(viewer.waitForMore("pushing metric file", 1));
  EXPECT_EQ(viewer.count("Querying SIM files"), 0);
  const ServiceProcess service(bus, "simulated,speed=10");
  EXPECT_TRUE(viewer.waitForMore(valid, 5));
  EXPECT_TRUE(viewer.waitForAll("Querying SIM files", 1));  // events may come while it starts
  EXPECT_EQ(viewer.count("Querying SIM files"), 1);
}

}  // namespace
}  // namespace qel::testing
