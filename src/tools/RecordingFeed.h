// Recordings into the dispatcher, for the subcommands that work on a file.
#pragma once

#include <functional>
#include <string>

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

// Feeds the whole recording to the one dispatcher of the process, without waiting, and calls
// `afterEach` after each event. A recording that cannot be read is a ToolError; one that was cut
// off at its end, and lines skipped, are said on standard error.
void feedRecording(const RecordingOptions& options, const std::function<void()>& afterEach = {});

}  // namespace qel::tools
