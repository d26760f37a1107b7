// qelctl now and signals: the pages beside the tables, of a recording or live.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <chrono>
#include <memory>
#include <optional>
#include <string>

#include "base/LogSink.h"
#include "base/Rendering.h"
#include "base/TerminalText.h"
#include "feed/FeedBook.h"
#include "metrics/MetricValidator.h"
#include "tools/Commands.h"
#include "tools/LiveConnection.h"
#include "tools/PageJson.h"
#include "tools/PageText.h"
#include "tools/RecordingFeed.h"
#include "tools/Service.h"

namespace qel::tools {
namespace {

using namespace std::chrono_literals;

struct PageOptions {
  RecordingOptions recording;
  std::string bus = "system";
  bool json = false;
  std::uint64_t spanSeconds = 600;
};

// What one page has to say at a moment.
using Lines = std::vector<std::string>;
using Describe = std::function<Lines(const PageOptions&, const Viewpoint&, const Feed&)>;

Lines describeNow(const PageOptions& options, const Viewpoint& viewpoint, const Feed& feed) {
  const NowPage page = nowPage(viewpoint, feed);
  return options.json ? Lines{jsonText(asJson(page))} : linesOf(page);
}

Lines describeSignals(const PageOptions& options, const Viewpoint& viewpoint,
                      const Feed& /*feed*/) {
  SignalsRange range;
  range.spanMs = options.spanSeconds * 1000;
  const SignalsPage page = signalsPage(viewpoint, range);
  return options.json ? Lines{jsonText(asJson(page, viewpoint))} : linesOf(page);
}

void print(const Lines& lines, Output& output) {
  for (const std::string& line : lines) output.line(forTerminal(line));
}

// The page after a recording.
void describeRecording(const PageOptions& options, const Describe& describe, Output& output) {
  History history;
  feedRecording(options.recording, history);
  const Viewpoint viewpoint{&history, MetricValidator::shared().get(),
                            history.lastReceivedMs(History::kLatest).value_or(0), false};
  print(describe(options, viewpoint, feedOf("recording:" + options.recording.file)), output);
}

// Prints the page whenever it has changed, at most once a second.
class LivePage {
 public:
  LivePage(const PageOptions& options, const Describe& describe, Output& output)
      : _options(options), _describe(describe), _output(output) {}

  void print(const History& history, const Feed& feed) {
    const auto now = MainLoop::Clock::now();
    if (now < _next) return;
    _next = now + 1s;
    if (_output.isBehind()) return;
    const Viewpoint viewpoint{&history, MetricValidator::shared().get(), systemClock().nowMs(),
                              true};
    Lines lines = _describe(_options, viewpoint, feed);
    if (lines == _printed) return;
    draw(lines);
    _printed = std::move(lines);
  }

  MainLoop::Clock::time_point next() const { return _next; }

 private:
  void draw(const Lines& lines) {
    const bool isInPlace = !_options.json && ::isatty(STDOUT_FILENO) == 1;
    std::string text = isInPlace ? "\x1B[H\x1B[2J" : "";
    if (!isInPlace && !_options.json && !_printed.empty()) text = "\n";
    for (std::size_t i = 0; i < lines.size(); ++i) {
      text += (i == 0 ? "" : "\n") + forTerminal(lines[i]);
    }
    _output.draw(text);
  }

  const PageOptions& _options;
  const Describe& _describe;
  Output& _output;
  Lines _printed;
  MainLoop::Clock::time_point _next;
};

void followLive(const PageOptions& options, const Describe& describe, Output& output) {
  LivePage page(options, describe, output);
  followService(options.bus, {}, output, [&page](const History& history, const Feed& feed) {
    page.print(history, feed);
    return page.next();
  });
}

void run(const PageOptions& options, const Describe& describe, Output& output) {
  setStandardOutput(nullptr);
  if (options.recording.file.empty()) {
    followLive(options, describe, output);
  } else {
    describeRecording(options, describe, output);
  }
}

CLI::App* addPage(CLI::App& app, Action& chosen, const char* name, const char* what,
                  const std::shared_ptr<PageOptions>& options, Describe describe) {
  auto* command = app.add_subcommand(name, what);
  command->footer("Without FILE it follows the service until SIGINT or SIGTERM.");
  addRecordingOptions(*command, options->recording);
  auto* file = command->get_option("FILE")->required(false);
  addBusOption(*command, options->bus);
  command->get_option("--bus")->excludes(file);
  command->add_flag("--json", options->json, "As JSON, one object a line");
  command->callback([options, &chosen, describe = std::move(describe)] {
    chosen = [options, describe](Output& output) { run(*options, describe, output); };
  });
  return command;
}

}  // namespace

void addPageCommands(CLI::App& app, Action& chosen) {
  addPage(app, chosen, "now", "Tell which cell the phone is on, and how good it is",
          std::make_shared<PageOptions>(), describeNow);
  const auto options = std::make_shared<PageOptions>();
  addPage(app, chosen, "signals", "Show curves of the serving cell and its neighbours", options,
          describeSignals)
      ->add_option("--span", options->spanSeconds, "How far back to look, in seconds")
      ->type_name("SECONDS")
      ->check(CLI::Range(10, 86400))
      ->capture_default_str();
}

}  // namespace qel::tools
