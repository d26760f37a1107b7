// Recordings into the dispatcher, for the subcommands that work on a file.
#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "base/Clock.h"

namespace qel {
class History;
}

namespace CLI {
class App;
}

namespace qel::tools {

struct RecordingOptions {
  std::string file;
  bool skipBad = false;
};

// FILE and --skip-bad.
void addRecordingOptions(CLI::App& command, RecordingOptions& options);

// The time of reception of the event in hand, as the recording has it.
class RecordedClock final : public Clock {
 public:
  void set(std::uint64_t timeMs) { _timeMs = timeMs; }
  std::uint64_t nowMs() const override { return _timeMs; }

 private:
  std::uint64_t _timeMs = 0;
};

// Feeds the whole recording to the one dispatcher of the process, without waiting, and calls
// `afterEach` after each event. A recording that cannot be read is a ToolError; one that was cut
// off at its end, and lines skipped, are said on standard error.
void feedRecording(const RecordingOptions& options, const std::function<void()>& afterEach = {});
// The same, with a history of it, which is told the times of the recording and its marks.
void feedRecording(const RecordingOptions& options, History& history,
                   const std::function<void()>& afterEach = {});

}  // namespace qel::tools
