// qelctl replay: a recording through the dispatcher, and what the dispatcher says.

#include <CLI/CLI.hpp>
#include <csignal>
#include <memory>

#include "base/LogSink.h"
#include "tools/Commands.h"
#include "tools/RecordingFeed.h"
#include "tools/StopSignals.h"
#include "tools/ToolError.h"

namespace qel::tools {

namespace {

// With every line of the events so far. The handler of the first signal has gone by itself.
void endBySignal(int signal, Output& output) {
  output.flush();
  std::raise(signal);
}

}  // namespace

void addReplayCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("replay", "Print the dispatcher's lines for a recording");
  const auto options = std::make_shared<RecordingOptions>();
  addRecordingOptions(*command, *options);
  command->callback([options, &chosen] {
    chosen = [options](Output& output) {
      setStandardOutput(output.sink());
      const StopSignals signals(StopSignals::Waiting::fails);
      output.setGivesUp([&signals] { return signals.arrived() != 0; });
      const auto lookForSignal = [&] {
        if (signals.arrived() != 0) endBySignal(signals.arrived(), output);
      };
      try {
        feedRecording(*options, [&] {
          output.check();
          lookForSignal();
        });
      } catch (const ToolError&) {
        lookForSignal();  // it may be what ended the reading
        throw;
      }
    };
  });
}

}  // namespace qel::tools
