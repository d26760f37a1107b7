// qelctl live: the viewer without its window.

#include <sys/ioctl.h>
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cstdlib>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "base/DescriptorSink.h"
#include "base/SystemLogSink.h"
#include "base/TerminalText.h"
#include "metrics/MetricValidator.h"
#include "recording/privacy/EventLog.h"
#include "tools/Commands.h"
#include "tools/LiveConnection.h"
#include "tools/LossReport.h"
#include "tools/MainLoop.h"
#include "tools/ScreenDrawing.h"
#include "tools/Service.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

using namespace std::chrono_literals;

struct FollowOptions {
  std::string bus = "system";
  std::string loggedEvents = "none";
  std::vector<std::string> screen;  // technology and category, or empty
};

// A table that is drawn anew when it has changed, at most once a second.
class LiveTable {
 public:
  explicit LiveTable(const std::vector<std::string>& screen)
      : _key(screen.at(0) + " " + screen.at(1)), _screen(makeScreen(screen.at(0), screen.at(1))) {}

  // When draw() may next have something to do. A table that nobody has read yet is not drawn over.
  std::optional<MainLoop::Clock::time_point> due(Output& output) const {
    const auto written = output.flushWhenDue();
    return written || !_touched ? written : std::optional(_next);
  }

  void touch() { _touched = true; }

  void draw(Output& output) {
    const auto now = MainLoop::Clock::now();
    if (!_touched || now < _next || output.isBehind()) return;
    _touched = false;
    TableSnapshot table = snapshotOf(*_screen);
    if (_drawn && table == *_drawn) return;
    print(tableLines(_key, table), output);
    _drawn = std::move(table);
    _next = now + 1s;
  }

 private:
  void print(const std::vector<std::string>& lines, Output& output) const {
    const bool inPlace = ::isatty(STDOUT_FILENO) == 1;
    std::size_t most = lines.size();
    struct winsize size {};
    if (inPlace && ::ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_row > 1) {
      most = std::min<std::size_t>(most, size.ws_row - 1U);  // more would scroll
    }
    if (!inPlace && _drawn) output.line("");
    std::string text = inPlace ? kClear : "";  // in one piece, so that it does not flicker
    for (std::size_t i = 0; i < most; ++i) text += (i == 0 ? "" : "\n") + lines[i];
    output.draw(text);
  }

  inline static const std::string kClear = "\x1B[H\x1B[2J";

  const std::string _key;
  const std::shared_ptr<TableViewController> _screen;
  std::optional<TableSnapshot> _drawn;
  MainLoop::Clock::time_point _next;
  bool _touched = true;
};

void showLines(MainLoop& loop, Output& output) {
  auto due = output.flushWhenDue();
  while (loop.runOnce(due)) due = output.flushWhenDue();
}

void showTable(MainLoop& loop, Output& output, const std::vector<std::string>& screen) {
  LiveTable table(screen);
  table.draw(output);
  while (loop.runOnce(table.due(output))) {
    table.touch();
    table.draw(output);
  }
}

void chooseLog(const FollowOptions& options, bool verbose) {
  const LoggedEvents events = *loggedEventsNamed(options.loggedEvents);
  std::shared_ptr<LogSink> log = std::make_shared<NullSink>();
  using Sink = SystemLogSink;
  if (events != LoggedEvents::none) {
    log = std::make_shared<Sink>("qelctl", verbose ? Sink::Echo::standardError : Sink::Echo::none);
  } else if (verbose) {
    log = std::make_shared<StandardErrorSink>();
  }
  setSystemLog(std::make_shared<EventLog>(std::move(log), events));
}

void run(const FollowOptions& options, bool verbose, Output& output) {
  chooseLog(options, verbose);
  MainLoop loop;
  loop.watchStandardOutput();
  findResources();
  configurationFile();
  output.goOnWithoutReader();
  setStandardOutput(options.screen.empty() ? std::shared_ptr<LogSink>(output.sink()) : nullptr);
  const auto say = [](const std::string& text) { complain("qelctl", text); };
  connectToService({.bus = options.bus, .say = say}, loop);
  const auto& wrapper = MetricValidator::shared()->mySharedTeskInstance;
  LossReport loss(say);
  wrapper->setLossObserver(
      [&loss](std::uint64_t dropped) { loss.note(dropped, LossReport::Clock::now()); });
  if (options.screen.empty()) {
    showLines(loop, output);
  } else {
    showTable(loop, output, options.screen);
  }
  output.flush();
  loss.end(wrapper->droppedEvents());
  // The viewer's connection is never released; its threads must not see the process taken apart.
  std::_Exit(EX_OK);
}

}  // namespace

void addLiveCommand(CLI::App& app, Action& chosen, const bool& verbose) {
  auto* command = app.add_subcommand(
      "live", "Connect as the viewer does; print the lines, or draw one category");
  command->footer("It runs until SIGINT or SIGTERM, and goes on when the service comes back.");
  const auto options = std::make_shared<FollowOptions>();
  addBusOption(*command, options->bus);
  command
      ->add_option("--screen", options->screen,
                   "Draw this category whenever it changes, instead of printing lines")
      ->type_name("TECHNOLOGY CATEGORY")
      ->type_size(2)
      ->expected(1);
  command
      ->add_option("--event-log", options->loggedEvents,
                   "Events in the system log: full (with the identities in them), hidden (with "
                   "pseudonyms) or none")
      ->type_name("EVENTS")
      ->check(CLI::IsMember(loggedEventsNames()).description(""))
      ->capture_default_str();
  command->callback([options, &chosen, &verbose] {
    chosen = [options, &verbose](Output& output) { run(*options, verbose, output); };
  });
}

}  // namespace qel::tools
