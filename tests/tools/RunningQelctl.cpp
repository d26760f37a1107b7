#include "tools/RunningQelctl.h"

#include <fcntl.h>
#include <pty.h>
#include <spawn.h>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <cstdlib>
#include <stdexcept>

namespace qel::testing {
namespace {

std::string contentOf(int descriptor) {
  std::string text;
  std::array<char, 65536> part;
  ssize_t count = 0;
  while ((count = ::pread(descriptor, part.data(), part.size(), static_cast<off_t>(text.size()))) >
         0) {
    text.append(part.data(), static_cast<std::size_t>(count));
  }
  return text;
}

}  // namespace

RunningQelctl::RunningQelctl(const std::vector<std::string>& arguments, Streams streams) {
  ::setenv("TZ", "UTC0", 1);
  int childOut = -1;
  int childErr = -1;
  if (streams == Streams::terminal) {
    if (::openpty(&_out, &childOut, nullptr, nullptr, nullptr) != 0) {
      throw std::runtime_error("no terminal");
    }
    ::fcntl(_out, F_SETFL, O_NONBLOCK);
    ::fcntl(_out, F_SETFD, FD_CLOEXEC);
    childErr = childOut;
  } else {
    childOut = _out = ::memfd_create("out", MFD_CLOEXEC);
    childErr = _err = ::memfd_create("err", MFD_CLOEXEC);
  }
  std::vector<std::string> words = arguments;
  words.insert(words.begin(), QEL_QELCTL);
  std::vector<char*> argv;
  for (std::string& word : words) argv.push_back(word.data());
  argv.push_back(nullptr);
  posix_spawn_file_actions_t actions;
  ::posix_spawn_file_actions_init(&actions);
  ::posix_spawn_file_actions_adddup2(&actions, childOut, STDOUT_FILENO);
  ::posix_spawn_file_actions_adddup2(&actions, childErr, STDERR_FILENO);
  const int failed = ::posix_spawn(&_pid, argv[0], &actions, nullptr, argv.data(), environ);
  ::posix_spawn_file_actions_destroy(&actions);
  if (streams == Streams::terminal) ::close(childOut);
  if (failed != 0) throw std::runtime_error("qelctl cannot be run");
}

RunningQelctl::~RunningQelctl() {
  if (_pid != 0) {
    signal(SIGKILL);
    waitForEnd();
  }
  ::close(_out);
  if (_err >= 0) ::close(_err);
}

void RunningQelctl::signal(int number) const { ::kill(_pid, number); }

int RunningQelctl::waitForEnd() {
  int status = 0;
  ::waitpid(_pid, &status, 0);
  _pid = 0;
  return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

void RunningQelctl::readTerminal() {
  std::array<char, 4096> part;
  ssize_t count = 0;
  while ((count = ::read(_out, part.data(), part.size())) > 0) {
    _shown.append(part.data(), static_cast<std::size_t>(count));
  }
}

std::string RunningQelctl::out() {
  if (_err >= 0) return contentOf(_out);
  readTerminal();
  return _shown;
}

std::string RunningQelctl::err() const { return contentOf(_err); }

}  // namespace qel::testing
