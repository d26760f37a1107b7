#include "tools/watch/Tmux.h"

#include <unistd.h>

#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <stdexcept>

#include "support/Subprocess.h"

namespace qel::testing {
namespace {

std::string newSocket() {
  static std::atomic<int> count = 0;
  const char* folder = std::getenv("TMPDIR");
  return std::string(folder ? folder : "/tmp") + "/qelctl-watch-" + std::to_string(::getpid()) +
         "-" + std::to_string(++count);
}

}  // namespace

Tmux::Tmux(int columns, int lines, const std::string& command) : _socket(newSocket()) {
  ask({"new-session", "-d", "-x", std::to_string(columns), "-y", std::to_string(lines), command});
}

Tmux::~Tmux() {
  run("/usr/bin/tmux", {"-S", _socket, "kill-server"});
  std::remove(_socket.c_str());
}

std::string Tmux::ask(std::vector<std::string> words) const {
  words.insert(words.begin(), {"-S", _socket, "-f", "/dev/null", "-u"});
  const Outcome outcome = run("/usr/bin/tmux", words);
  if (outcome.exitCode != 0) throw std::runtime_error("tmux: " + outcome.err);
  return outcome.out;
}

void Tmux::press(const std::string& key) const { ask({"send-keys", key}); }

void Tmux::resize(int columns, int lines) const {
  ask({"resize-window", "-x", std::to_string(columns), "-y", std::to_string(lines)});
}

std::string Tmux::screen() const { return ask({"capture-pane", "-p"}); }

}  // namespace qel::testing
