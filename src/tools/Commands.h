// The subcommands of qelctl.
#pragma once

#include <functional>

#include "tools/Output.h"

namespace CLI {
class App;
}

namespace qel::tools {

// What a subcommand does once the command line is read. It throws a ToolError when it fails.
using Action = std::function<void(Output&)>;

// Each adds one subcommand with its options and sets `chosen` when the user asks for it.
void addDecodeCommand(CLI::App& app, Action& chosen);
void addReplayCommand(CLI::App& app, Action& chosen);
void addStoreCommand(CLI::App& app, Action& chosen);
void addScreenCommands(CLI::App& app, Action& chosen);
void addHappeningsCommand(CLI::App& app, Action& chosen);
void addPageCommands(CLI::App& app, Action& chosen);
void addFieldCommand(CLI::App& app, Action& chosen);
void addMetricsCommand(CLI::App& app, Action& chosen);
void addStatusCommand(CLI::App& app, Action& chosen);
void addWatchCommand(CLI::App& app, Action& chosen);
// `verbose` is read when the subcommand runs.
void addLiveCommand(CLI::App& app, Action& chosen, const bool& verbose);
void addRecordCommand(CLI::App& app, Action& chosen);
void addPublishCommand(CLI::App& app, Action& chosen);
void addExporterCommand(CLI::App& app, Action& chosen);
void addCollectCommand(CLI::App& app, Action& chosen);
void addImportCommand(CLI::App& app, Action& chosen);
void addExportCommand(CLI::App& app, Action& chosen);
void addDiagReportCommand(CLI::App& app, Action& chosen);

}  // namespace qel::tools
