// qelctl in the background, with what it has said so far.
#pragma once

#include <sys/types.h>

#include <chrono>
#include <string>
#include <thread>
#include <vector>

namespace qel::testing {

// Calls until the condition holds, for twenty seconds at most.
template <class Condition>
bool eventually(Condition condition) {
  const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(20);
  while (!condition()) {
    if (std::chrono::steady_clock::now() > end) return false;
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
  }
  return true;
}

// Ended by the end of this object at last.
class RunningQelctl {
 public:
  enum class Streams { files, terminal };

  // With `terminal`, standard output and standard error are one terminal: out() has both.
  explicit RunningQelctl(const std::vector<std::string>& arguments,
                         Streams streams = Streams::files);
  ~RunningQelctl();
  RunningQelctl(const RunningQelctl&) = delete;
  RunningQelctl& operator=(const RunningQelctl&) = delete;

  void signal(int number) const;
  // Its exit code, or minus the signal that ended it.
  int waitForEnd();

  std::string out();
  std::string err() const;
  bool hasSaid(const std::string& text) { return err().find(text) != std::string::npos; }

 private:
  void readTerminal();

  int _out = -1;       // a file in memory, or the terminal's other side
  int _err = -1;       // a file in memory
  std::string _shown;  // on the terminal
  pid_t _pid = 0;
};

}  // namespace qel::testing
