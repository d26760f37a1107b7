// Lines for the system log that are worth saying once.
#pragma once

#include <set>
#include <string>

#include "base/LogSink.h"

namespace qel::sources {

// One thread.
class SaidOnce {
 public:
  // Once about each subject.
  void say(const std::string& subject, const std::string& line) {
    if (_said.insert(subject + '\n' + line).second) systemLog().write("modem-manager: " + line);
  }

 private:
  std::set<std::string> _said;
};

}  // namespace qel::sources
