// The programs hold payloads that tell where a phone is and whose it is. A core file once brought
// them to the disk.

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <chrono>
#include <csignal>
#include <fstream>
#include <sstream>
#include <string>
#include <thread>

#include "bus/ServiceProcess.h"

namespace qel::testing {
namespace {

// The limits, soft and hard, in bytes.
std::string coreLimitOf(pid_t pid) {
  std::ifstream limits("/proc/" + std::to_string(pid) + "/limits");
  const std::string name = "Max core file size";
  for (std::string line; std::getline(limits, line);) {
    if (!line.starts_with(name)) continue;
    std::istringstream values(line.substr(name.size()));
    std::string soft;
    std::string hard;
    values >> soft >> hard;
    return soft + " " + hard;
  }
  return "no such process";
}

bool becomes(const std::string& wanted, pid_t pid) {
  const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(20);
  while (coreLimitOf(pid) != wanted) {
    if (std::chrono::steady_clock::now() > end) return false;
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
  }
  return true;
}

class NoCore : public ::testing::Test {
 protected:
  void SetUp() override {
    rlimit limit{};
    ::getrlimit(RLIMIT_CORE, &limit);
    if (limit.rlim_max < 1024) GTEST_SKIP() << "no core files here";
    limit.rlim_cur = limit.rlim_max;
    ASSERT_EQ(::setrlimit(RLIMIT_CORE, &limit), 0);
  }
  PrivateBus bus;
};

TEST_F(NoCore, IsLeftByTheServiceWhichStillEndsAsItShould) {
  ServiceProcess service(bus, "simulated");
  EXPECT_TRUE(becomes("1 1", service.pid())) << coreLimitOf(service.pid());
  service.signal(SIGABRT);
  EXPECT_EQ(service.waitForEnd(), -SIGABRT);
}

TEST_F(NoCore, IsLeftByTheConsoleProgram) {
  const ChildProcess live({{QEL_QELCTL, "live", "--bus", bus.address()}, {}, "/dev/null"});
  EXPECT_TRUE(becomes("1 1", live.pid())) << coreLimitOf(live.pid());
}

TEST_F(NoCore, IsLeftByTheViewer) {
  const std::string directory = ::testing::TempDir();
  const ChildProcess viewer({{QEL_QELWATCH, "--bus", bus.address()},
                             {"QT_QPA_PLATFORM=offscreen", "XDG_RUNTIME_DIR=" + directory,
                              "HOME=" + directory, "LC_ALL=C.UTF-8"},
                             "/dev/null"});
  EXPECT_TRUE(becomes("1 1", viewer.pid())) << coreLimitOf(viewer.pid());
}

}  // namespace
}  // namespace qel::testing
