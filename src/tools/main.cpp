// qelctl: the viewer's core on the command line.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <csignal>
#include <cstdio>
#include <exception>
#include <memory>

#include "base/DescriptorSink.h"
#include "base/LogSink.h"
#include "tools/Commands.h"
#include "tools/ToolError.h"

namespace {

int report(int code, const char* why) {
  std::fprintf(stderr, "qelctl: %s\n", why);
  return code;
}

// The first line of the message: errors take one line.
int reportUsage(const CLI::ParseError& error) {
  const std::string text = error.what();
  return report(EX_USAGE, ("usage: " + text.substr(0, text.find('\n'))).c_str());
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
  tools::addMetricsCommand(app, chosen);

  try {
    app.parse(argc, argv);
  } catch (const CLI::Success& success) {  // --help, --version
    return app.exit(success);
  } catch (const CLI::ParseError& error) {
    return reportUsage(error);
  }

  std::signal(SIGPIPE, SIG_IGN);  // a closed pipe shows as a failed write
  setSystemLog(verbose ? std::make_shared<DescriptorSink>(STDERR_FILENO) : nullptr);
  try {
    tools::Output output;
    chosen(output);
    output.flush();
  } catch (const tools::ToolError& error) {
    return report(error.code(), error.what());
  } catch (const std::exception& error) {
    return report(EX_SOFTWARE, error.what());
  }
  return EX_OK;
}
