#include "tools/watch/Pty.h"

#include <fcntl.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <cstdlib>
#include <stdexcept>
#include <utility>

#include "tools/RunningQelctl.h"

namespace qel::testing {

WatchAtPty::WatchAtPty(const std::vector<std::string>& arguments, const char* type) {
  winsize size{};
  size.ws_col = 80;
  size.ws_row = 24;
  if (::openpty(&_master, &_slave, nullptr, nullptr, &size) != 0) {
    throw std::runtime_error("no terminal");
  }
  ::fcntl(_master, F_SETFD, FD_CLOEXEC);
  ::fcntl(_slave, F_SETFD, FD_CLOEXEC);
  ::fcntl(_master, F_SETFL, O_NONBLOCK);
  std::vector<std::string> words = arguments;
  words.insert(words.begin(), {QEL_QELCTL, "watch"});
  std::vector<char*> argv;
  for (std::string& word : words) argv.push_back(word.data());
  argv.push_back(nullptr);
  ::setenv("TERM", type, 1);
  ::setenv("LC_ALL", "C.UTF-8", 1);
  ::setenv("TZ", "UTC0", 1);
  _pid = ::fork();
  if (_pid != 0) return;
  ::setsid();
  ::ioctl(_slave, TIOCSCTTY, 0);
  for (const int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) ::dup2(_slave, stream);
  ::execv(argv[0], argv.data());
  std::_Exit(127);
}

WatchAtPty::~WatchAtPty() {
  if (_pid > 0) {
    signal(SIGKILL);
    waitForEnd();
  }
  if (_master >= 0) ::close(_master);
  if (_slave >= 0) ::close(_slave);
}

void WatchAtPty::signal(int number) const { ::kill(_pid, number); }

void WatchAtPty::type(const std::string& keys) const {
  if (::write(_master, keys.data(), keys.size()) < 0) throw std::runtime_error("nothing typed");
}

void WatchAtPty::holdOutput() const { ::tcflow(_slave, TCOOFF); }

void WatchAtPty::hangUp() {
  ::close(std::exchange(_slave, -1));
  ::close(std::exchange(_master, -1));
}

const std::string& WatchAtPty::written() {
  std::array<char, 4096> part;
  ssize_t count = 0;
  while ((count = ::read(_master, part.data(), part.size())) > 0) {
    _written.append(part.data(), static_cast<std::size_t>(count));
  }
  return _written;
}

bool WatchAtPty::writes(const std::string& text) {
  return eventually([&] { return written().find(text) != std::string::npos; });
}

int WatchAtPty::waitForEnd() {
  int status = 0;
  ::waitpid(_pid, &status, 0);
  _pid = 0;
  return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

int WatchAtPty::waitForStop() {
  int status = 0;
  ::waitpid(_pid, &status, WUNTRACED);
  return WIFSTOPPED(status) ? -WSTOPSIG(status) : 0;
}

termios WatchAtPty::settings() const {
  termios settings{};
  ::tcgetattr(_slave, &settings);
  return settings;
}

bool WatchAtPty::areSame(const termios& a, const termios& b) {
  return a.c_iflag == b.c_iflag && a.c_oflag == b.c_oflag && a.c_cflag == b.c_cflag &&
         a.c_lflag == b.c_lflag;
}

}  // namespace qel::testing
