// qelctl happenings: what happened in a recording, or happens now.

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "base/LogSink.h"
#include "base/Rendering.h"
#include "base/TerminalText.h"
#include "base/TimeZone.h"
#include "history/History.h"
#include "tools/Commands.h"
#include "tools/HappeningJson.h"
#include "tools/LiveConnection.h"
#include "tools/RecordingFeed.h"
#include "tools/Service.h"

namespace qel::tools {
namespace {

struct HappeningsOptions {
  RecordingOptions recording;
  std::string bus = "system";
  std::string kind;  // empty: all
  bool json = false;
};

// Curves and payloads are of no use here.
constexpr History::Limits kHappeningsAlone = {
    .series = {.recentMs = 0, .mostRecent = 1, .dayMs = 0},
    .journal = {.bytes = 0},
};

std::vector<std::string> kindNames() {
  std::vector<std::string> names;
  for (const HappeningKind kind : kHappeningKinds) names.emplace_back(nameOf(kind));
  return names;
}

// "2018-03-24 08:38:33.178 CET".
std::string timeText(std::uint64_t timeMs) {
  std::string text = dateText(static_cast<double>(timeMs), systemTimeZone());
  const std::string fraction = std::to_string(1000 + timeMs % 1000);
  const std::size_t zone = text.rfind(' ');
  return text.insert(zone, '.' + fraction.substr(1));
}

std::string line(const Happening& happening) {
  constexpr std::size_t kWidth = 20;
  std::string kind(nameOf(happening.kind));
  kind.resize(std::max(kind.size(), kWidth), ' ');
  return timeText(happening.timeMs) + "  " + kind + forTerminal(happening.text, Instead::blank);
}

// Prints what became known since it was last asked to.
class Printer {
 public:
  Printer(const HappeningsOptions& options, Output& output)
      : _kind(happeningKindNamed(options.kind)), _json(options.json), _output(output) {}

  void printNew(const History& history) {
    const auto& happenings = history.happenings();
    const std::uint64_t gone = history.happeningsGone();
    for (; _next < gone + happenings.size(); ++_next) {
      if (_next >= gone) print(happenings[static_cast<std::size_t>(_next - gone)]);
    }
  }

 private:
  void print(const Happening& happening) {
    if (_kind && happening.kind != *_kind) return;
    _output.line(_json ? jsonText(asJson(happening)) : line(happening));
  }

  const std::optional<HappeningKind> _kind;
  const bool _json;
  Output& _output;
  std::uint64_t _next = 0;  // number of the first one that is not printed
};

void readRecording(const HappeningsOptions& options, Output& output) {
  History history(kHappeningsAlone);
  Printer printer(options, output);
  feedRecording(options.recording, history, [&] {
    printer.printNew(history);
    output.check();
  });
}

void followLive(const HappeningsOptions& options, Output& output) {
  Printer printer(options, output);
  followService(options.bus, kHappeningsAlone, output, [&](const History& history, const Feed&) {
    printer.printNew(history);
    return output.flushWhenDue();
  });
}

void run(const HappeningsOptions& options, Output& output) {
  setStandardOutput(nullptr);
  if (options.recording.file.empty()) {
    followLive(options, output);
  } else {
    readRecording(options, output);
  }
}

}  // namespace

void addHappeningsCommand(CLI::App& app, Action& chosen) {
  auto* command =
      app.add_subcommand("happenings", "Print what happened in a recording, or what happens");
  command->footer("Without FILE it follows the service until SIGINT or SIGTERM.");
  const auto options = std::make_shared<HappeningsOptions>();
  addRecordingOptions(*command, options->recording);
  auto* file = command->get_option("FILE")->required(false);
  addBusOption(*command, options->bus);
  command->get_option("--bus")->excludes(file);
  command->add_flag("--json", options->json, "As JSON, one object a line");
  command->add_option("--kind", options->kind, "Those of one kind only")
      ->type_name("KIND")
      ->check(CLI::IsMember(kindNames()));
  command->callback(
      [options, &chosen] { chosen = [options](Output& output) { run(*options, output); }; });
}

}  // namespace qel::tools
