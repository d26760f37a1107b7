#include "support/ChildProcess.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <system_error>
#include <thread>

namespace qel::testing {
namespace {

std::string nameOf(const std::string& variable) {
  return variable.substr(0, variable.find('=') + 1);
}

// The caller's variables with the given ones in their place.
std::vector<std::string> environmentWith(const std::vector<std::string>& variables) {
  std::vector<std::string> all = variables;
  for (char** entry = environ; *entry != nullptr; ++entry) {
    const std::string name = nameOf(*entry);
    bool isReplaced = false;
    for (const std::string& variable : variables) isReplaced |= nameOf(variable) == name;
    if (!isReplaced) all.emplace_back(*entry);
  }
  return all;
}

std::vector<char*> pointersTo(std::vector<std::string>& words) {
  std::vector<char*> pointers;
  for (std::string& word : words) pointers.push_back(word.data());
  pointers.push_back(nullptr);
  return pointers;
}

void sendTo(const std::string& file, int descriptor, posix_spawn_file_actions_t& actions) {
  if (file.empty()) return;
  ::posix_spawn_file_actions_addopen(&actions, descriptor, file.c_str(),
                                     O_WRONLY | O_CREAT | O_APPEND, 0600);
}

int outcomeOf(int status) { return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status); }

}  // namespace

ChildProcess::ChildProcess(Launch launch) : _launch(std::move(launch)) { start(); }

ChildProcess::~ChildProcess() {
  if (_pid == 0) return;
  signal(SIGKILL);
  waitForEnd();
}

void ChildProcess::start() {
  std::vector<std::string> words = _launch.words;
  std::vector<std::string> variables = environmentWith(_launch.environment);
  posix_spawn_file_actions_t actions;
  ::posix_spawn_file_actions_init(&actions);
  sendTo(_launch.out, STDOUT_FILENO, actions);
  sendTo(_launch.err, STDERR_FILENO, actions);
  _ended.reset();
  const int failed = ::posix_spawn(&_pid, words[0].c_str(), &actions, nullptr,
                                   pointersTo(words).data(), pointersTo(variables).data());
  ::posix_spawn_file_actions_destroy(&actions);
  if (failed != 0) throw std::system_error(failed, std::generic_category(), words[0]);
}

void ChildProcess::signal(int number) const {
  if (_pid != 0) ::kill(_pid, number);
}

int ChildProcess::waitForEnd() {
  if (_ended) return *_ended;
  int status = 0;
  while (::waitpid(_pid, &status, 0) < 0 && errno == EINTR) {
  }
  _pid = 0;
  _ended = outcomeOf(status);
  return *_ended;
}

std::optional<int> ChildProcess::waitForEnd(std::chrono::milliseconds patience) {
  const auto deadline = std::chrono::steady_clock::now() + patience;
  while (!_ended) {
    int status = 0;
    if (::waitpid(_pid, &status, WNOHANG) == _pid) {
      _pid = 0;
      _ended = outcomeOf(status);
    } else if (std::chrono::steady_clock::now() >= deadline) {
      return std::nullopt;
    } else {
      std::this_thread::sleep_for(std::chrono::milliseconds(2));
    }
  }
  return _ended;
}

}  // namespace qel::testing
