// qelctl replay: a recording through the dispatcher, and what the dispatcher says.

#include <CLI/CLI.hpp>
#include <memory>

#include "base/LogSink.h"
#include "tools/Commands.h"
#include "tools/RecordingFeed.h"

namespace qel::tools {

void addReplayCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("replay", "Print the dispatcher's lines for a recording");
  const auto options = std::make_shared<RecordingOptions>();
  addRecordingOptions(*command, *options);
  command->callback([options, &chosen] {
    chosen = [options](Output& output) {
      setStandardOutput(output.sink());
      feedRecording(*options, [&output] { output.check(); });
    };
  });
}

}  // namespace qel::tools
