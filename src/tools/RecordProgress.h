// How a piece of work goes on, for people.
#pragma once

#include <chrono>
#include <string>

#include "capture/Recorder.h"

namespace qel::tools {

// Such as "1204 events, 96.3 kB, 0:02:07".
std::string progressText(const capture::Recorder::Progress& progress,
                         std::chrono::seconds duration);

// One line on standard error that is written over again and again; nothing when that is no
// terminal. Main thread only.
class RecordProgress {
 public:
  RecordProgress();

  void show(const std::string& text);
  // A line of its own, "qelctl: TEXT", in place of the progress, terminal or not.
  void say(const std::string& text);

 private:
  void clear();

  const bool _isTerminal;
  bool _shown = false;
};

}  // namespace qel::tools
