// qelctl watch at a terminal whose other side the test holds.
#pragma once

#include <sys/types.h>
#include <termios.h>

#include <chrono>
#include <string>
#include <vector>

namespace qel::testing {

// 80x24 characters. Ended by the end of this object at last.
class WatchAtPty {
 public:
  WatchAtPty(const std::vector<std::string>& arguments, const char* type = "xterm-256color");
  ~WatchAtPty();
  WatchAtPty(const WatchAtPty&) = delete;
  WatchAtPty& operator=(const WatchAtPty&) = delete;

  void signal(int number) const;
  void type(const std::string& keys) const;
  // The terminal takes nothing more, as after Ctrl-S.
  void holdOutput() const;
  // The terminal goes away, as when a connection breaks.
  void hangUp();

  // What has been written to it so far, as it came.
  const std::string& written();
  // Whether the text comes, for twenty seconds at most.
  bool writes(const std::string& text);

  // Its exit code, or minus the signal that ended or stopped it.
  int waitForEnd();
  int waitForStop();

  // How the terminal is set.
  termios settings() const;
  static bool areSame(const termios& a, const termios& b);

 private:
  int _master = -1;
  int _slave = -1;
  pid_t _pid = 0;
  std::string _written;
};

}  // namespace qel::testing
