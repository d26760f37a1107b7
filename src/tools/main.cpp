// qelctl: the viewer's core on the command line.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <csignal>
#include <exception>
#include <memory>
#include <string>
#include <string_view>

#include "base/CoreDumps.h"
#include "base/DescriptorSink.h"
#include "base/LogSink.h"
#include "base/TerminalText.h"
#include "tools/Commands.h"
#include "tools/ToolError.h"

namespace {

int report(int code, std::string_view why) {
  qel::complain("qelctl", why);
  return code;
}

// The first line of the message: errors take one line.
int reportUsage(const CLI::App& app, const CLI::ParseError& error) {
  const auto unknown = app.remaining();
  if (!unknown.empty() && app.get_subcommands().empty()) {
    return report(EX_USAGE, "usage: no such subcommand: " + unknown.front());
  }
  const std::string text = error.what();
  return report(EX_USAGE, "usage: " + text.substr(0, text.find('\n')));
}

}  // namespace

int main(int argc, char* argv[]) {
  using namespace qel;
  CLI::App app("Cellular diagnostics on the command line", "qelctl");
  app.set_version_flag("--version", "qelctl " QEL_VERSION);
  app.require_subcommand(1);
  bool verbose = false;
  app.add_flag("-v,--verbose", verbose, "Show what goes to the system log on standard error");

  tools::Action chosen;
  tools::addDecodeCommand(app, chosen);
  tools::addReplayCommand(app, chosen);
  tools::addStoreCommand(app, chosen);
  tools::addScreenCommands(app, chosen);
  tools::addHappeningsCommand(app, chosen);
  tools::addPageCommands(app, chosen);
  tools::addWatchCommand(app, chosen);
  tools::addFieldCommand(app, chosen);
  tools::addMetricsCommand(app, chosen);
  tools::addStatusCommand(app, chosen);
  tools::addLiveCommand(app, chosen, verbose);
  tools::addRecordCommand(app, chosen);
  tools::addPublishCommand(app, chosen);
  tools::addExporterCommand(app, chosen);
  tools::addCollectCommand(app, chosen);
  tools::addImportCommand(app, chosen);
  tools::addExportCommand(app, chosen);
  tools::addDiagReportCommand(app, chosen);

  try {
    app.parse(argc, argv);
  } catch (const CLI::Success& success) {  // --help, --version
    return app.exit(success);
  } catch (const CLI::ParseError& error) {
    return reportUsage(app, error);
  }

  leaveNoCore();
  std::signal(SIGPIPE, SIG_IGN);  // a closed pipe shows as a failed write
  std::signal(SIGXFSZ, SIG_IGN);  // and so does a file that has reached its limit
  setSystemLog(verbose ? std::make_shared<StandardErrorSink>() : nullptr);
  tools::Output output;
  try {
    chosen(output);
    output.flush();
    return EX_OK;
  } catch (const tools::ToolError& error) {
    output.sink()->flush();  // what was good before the error stays good
    return report(error.code(), error.what());
  } catch (const std::exception& error) {
    output.sink()->flush();
    return report(EX_SOFTWARE, error.what());
  }
}
