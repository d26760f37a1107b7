// qelctl watch: the viewer in a terminal.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <chrono>
#include <cstdlib>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "base/LogSink.h"
#include "base/NonBlockingWriter.h"
#include "base/TerminalText.h"
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
#include "ui/pages/RecordingControl.h"

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

// Connects as the options say; nothing with a recording alone, where there is nothing to connect
// to.
std::shared_ptr<tesk::Connector> connect(const WatchOptions& options, Watched& watched,
                                         MainLoop& loop) {
  if (!options.file.empty()) {
    MetricValidator::shared();
    return nullptr;
  }
  FeedBook& book = *watched.book;
  if (options.source.empty()) {
    return connectWithoutWaiting({.bus = options.bus,
                                  .say = [](const std::string&) {},
                                  .reachability = book.reachability(),
                                  .condition = book.condition()},
                                 loop);
  }
  sources::SourceError error;
  auto connector = connectWithin(options.source, book, error);
  if (!connector) throw ToolError(error.exitCode, error.message);
  tesk::setConnector(connector);
  startAsTheViewerDoes();
  return connector;
}

// Nothing where there is nothing to record, or nowhere to keep it.
std::unique_ptr<RecordingControl> makeRecorder(const WatchOptions& options,
                                               std::shared_ptr<tesk::Connector> connector) {
  const std::string folder = RecordingsFolder::usualPath();
  if (!connector || folder.empty()) return nullptr;
  const auto bus = options.source.empty() ? std::optional(options.bus) : std::nullopt;
  return std::make_unique<RecordingControl>(
      RecordingsFolder(folder), RecordingControl::Way{std::move(connector), bus, configuration()});
}

// What became of a recording that was still made is said on the terminal that is given back, if
// that is still there.
void finish(RecordingControl& recorder) {
  constexpr std::chrono::milliseconds kPatience{500};
  if (!recorder.view().isRecording) return;
  recorder.stop();
  writeBriefly(STDOUT_FILENO, forTerminal(recorder.view().outcome) + "\n", kPatience);
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
  const auto recorder = makeRecorder(options, connect(options, watched, loop));
  const auto& validator = MetricValidator::shared();
  validator->setObserver(&watched.history);  // no event has been taken yet
  watched.book->setHistory(&watched.history);
  Playback playback(validator, watched.history);
  if (!options.file.empty()) playback.open(options.file);
  watch::Desk desk{playback, watched.book->feed(), recorder.get()};
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
  if (recorder) finish(*recorder);
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
