// A program of the build in the background.
#pragma once

#include <sys/types.h>

#include <chrono>
#include <optional>
#include <string>
#include <vector>

namespace qel::testing {

struct Launch {
  std::vector<std::string> words;             // the program first
  std::vector<std::string> environment = {};  // NAME=VALUE, instead of the caller's
  std::string out = {};  // file that standard output is appended to; empty: the caller's
  std::string err = {};
};

// Runs from its making; killed at the end of this object, if it still runs. How a program ended is
// its exit code, or minus the signal that ended it.
class ChildProcess {
 public:
  explicit ChildProcess(Launch launch);
  ~ChildProcess();
  ChildProcess(const ChildProcess&) = delete;
  ChildProcess& operator=(const ChildProcess&) = delete;

  // Again, once it has ended.
  void start();
  void signal(int number) const;
  int waitForEnd();
  // Nothing when it still runs then.
  std::optional<int> waitForEnd(std::chrono::milliseconds patience);
  // Nothing while it runs.
  std::optional<int> ended() { return waitForEnd(std::chrono::milliseconds(0)); }

  pid_t pid() const { return _pid; }
  const Launch& launch() const { return _launch; }

 private:
  const Launch _launch;
  pid_t _pid = 0;  // 0 once it was waited for
  std::optional<int> _ended;
};

}  // namespace qel::testing
