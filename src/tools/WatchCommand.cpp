// qelctl watch: the viewer in a terminal.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <cstdlib>
#include <memory>
#include <string>

#include "base/LogSink.h"
#include "feed/EmbeddedFeed.h"
#include "feed/FeedBook.h"
#include "metrics/MetricValidator.h"
#include "tools/Commands.h"
#include "tools/LiveConnection.h"
#include "tools/MainLoop.h"
#include "tools/Service.h"
#include "tools/ToolError.h"
#include "tools/watch/TerminalRescue.h"
#include "tools/watch/Watch.h"

namespace qel::tools {
namespace {

struct WatchOptions {
  std::string source;
  std::string bus = "system";
  std::string file;
};

// What is watched. Held until the process ends: threads of the connection reach it.
struct Watched {
  explicit Watched(const WatchOptions& options)
      : book(std::make_shared<FeedBook>(
            options.file.empty() ? options.source : "recording:" + options.file, options.bus)) {}

  const std::shared_ptr<FeedBook> book;
  History history;
};

void requireTerminal() {
  if (::isatty(STDIN_FILENO) == 1 && ::isatty(STDOUT_FILENO) == 1) return;
  throw ToolError(EX_USAGE, "watch", "standard input and output must be a terminal");
}

// Connects as the options say; with a recording alone there is nothing to connect to.
void connect(const WatchOptions& options, Watched& watched, MainLoop& loop) {
  if (!options.file.empty()) {
    MetricValidator::shared();
    return;
  }
  FeedBook& book = *watched.book;
  if (options.source.empty()) {
    connectWithoutWaiting({.bus = options.bus,
                           .say = [](const std::string&) {},
                           .reachability = book.reachability(),
                           .condition = book.condition()},
                          loop);
  } else {
    sources::SourceError error;
    auto connector = connectWithin(options.source, book, error);
    if (!connector) throw ToolError(error.exitCode, error.message);
    tesk::setConnector(std::move(connector));
    startAsTheViewerDoes();
  }
}

void run(const WatchOptions& options, Output& /*output*/) {
  requireTerminal();
  const watch::TerminalRescue rescue;  // before whoever else handles signals
  // Nothing but the pages may come to the screen.
  setStandardOutput(nullptr);
  setSystemLog(nullptr);
  MainLoop loop;
  watch::TerminalSignals signals;
  findResources();
  configurationFile();
  static auto& watched = *new Watched(options);  // the connection outlives this function
  connect(options, watched, loop);
  const auto& validator = MetricValidator::shared();
  validator->setObserver(&watched.history);  // no event has been taken yet
  watched.book->setHistory(&watched.history);
  Playback playback(validator, watched.history);
  if (!options.file.empty()) playback.open(options.file);
  watch::Desk desk{playback, watched.book->feed()};
  std::string why;
  {
    const auto terminal = watch::Terminal::open(why);
    if (!terminal) throw ToolError(EX_UNAVAILABLE, "watch", why);
    watch::Watch watch(*terminal, signals, loop, desk, watched.history);
    watched.book->setObserver([&watch] { watch.feedChanged(); });
    if (const auto& wrapper = validator->mySharedTeskInstance) {
      wrapper->setLossObserver([](std::uint64_t dropped) { watched.book->noteDropped(dropped); });
    }
    watch.run();
    watched.book->setObserver({});
  }
  // The viewer's connection is never released; its threads must not see the process taken apart.
  std::_Exit(EX_OK);
}

}  // namespace

void addWatchCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("watch", "The viewer in a terminal: pages, tables and keys");
  command->footer("It needs 80x24 characters. Without FILE and --source it follows the service.");
  const auto options = std::make_shared<WatchOptions>();
  auto* file =
      command->add_option("FILE", options->file, "Recording (.jsonl or .jsonl.gz) to open");
  auto* source = command
                     ->add_option("--source", options->source,
                                  "Values from within, without the service, as for qelwatch: "
                                  "simulated, recording:FILE, diag[:PORT] and so on")
                     ->type_name("SOURCE")
                     ->excludes(file);
  addBusOption(*command, options->bus);
  command->get_option("--bus")->excludes(file)->excludes(source);
  command->callback(
      [options, &chosen] { chosen = [options](Output& output) { run(*options, output); }; });
}

}  // namespace qel::tools
