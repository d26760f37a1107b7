#include "support/PrivateBus.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>

namespace qel::testing {
namespace {

constexpr const char* kOpenPolicy =
    "<policy context=\"default\"><allow send_destination=\"*\" eavesdrop=\"true\"/>"
    "<allow eavesdrop=\"true\"/><allow own=\"*\"/></policy>";

// Waits for the daemon to print its address, which it does once it listens.
void waitForLine(int descriptor) {
  char character = 0;
  while (::read(descriptor, &character, 1) == 1) {
    if (character == '\n') return;
  }
  throw std::runtime_error("dbus-daemon did not start");
}

}  // namespace

PrivateBus::PrivateBus(const std::string& policy) {
  std::string pattern = (std::filesystem::temp_directory_path() / "qelbusXXXXXX").string();
  if (!::mkdtemp(pattern.data())) throw std::runtime_error("no directory for the bus");
  _directory = pattern;
  _address = "unix:path=" + _directory + "/bus";
  std::ofstream(_directory + "/bus.conf")
      << "<!DOCTYPE busconfig PUBLIC \"-//freedesktop//DTD D-Bus Bus Configuration 1.0//EN\" "
         "\"http://www.freedesktop.org/standards/dbus/1.0/busconfig.dtd\">"
         "<busconfig><type>session</type><listen>"
      << _address << "</listen><auth>EXTERNAL</auth>" << (policy.empty() ? kOpenPolicy : policy)
      << "</busconfig>";
  std::filesystem::permissions(_directory, std::filesystem::perms::all);
  start();
}

PrivateBus::~PrivateBus() {
  stop();
  std::filesystem::remove_all(_directory);
}

void PrivateBus::start() {
  std::array<int, 2> ends{};
  if (::pipe2(ends.data(), O_CLOEXEC) != 0) throw std::runtime_error("no pipe");
  constexpr int kPrintDescriptor = 3;
  posix_spawn_file_actions_t actions;
  ::posix_spawn_file_actions_init(&actions);
  ::posix_spawn_file_actions_adddup2(&actions, ends[1], kPrintDescriptor);
  ::posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, "/dev/null", O_WRONLY, 0);
  std::string configuration = "--config-file=" + _directory + "/bus.conf";
  std::string print = "--print-address=" + std::to_string(kPrintDescriptor);
  std::array<std::string, 5> words = {"dbus-daemon", configuration, print, "--nofork",
                                      "--nopidfile"};
  std::array<char*, 6> argv{};
  for (std::size_t i = 0; i < words.size(); ++i) argv[i] = words[i].data();
  const int failed = ::posix_spawnp(&_pid, "dbus-daemon", &actions, nullptr, argv.data(), environ);
  ::posix_spawn_file_actions_destroy(&actions);
  ::close(ends[1]);
  if (failed == 0) waitForLine(ends[0]);
  ::close(ends[0]);
  if (failed != 0) throw std::runtime_error("dbus-daemon cannot be run");
}

void PrivateBus::stop() { end(SIGTERM); }
void PrivateBus::kill() { end(SIGKILL); }

void PrivateBus::signal(int number) const {
  if (_pid != 0) ::kill(_pid, number);
}

void PrivateBus::end(int signalNumber) {
  if (_pid == 0) return;
  signal(signalNumber);
  ::waitpid(_pid, nullptr, 0);
  _pid = 0;
}

}  // namespace qel::testing
