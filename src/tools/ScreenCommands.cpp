// qelctl screen and screens: category tables after a recording, drawn by the viewer's controller.

#include <CLI/CLI.hpp>
#include <algorithm>
#include <memory>
#include <optional>
#include <string>

#include "base/LogSink.h"
#include "base/Rendering.h"
#include "base/TerminalText.h"
#include "tools/Commands.h"
#include "tools/RecordingFeed.h"
#include "tools/ScreenDrawing.h"
#include "ui/kit/TableSnapshot.h"
#include "ui/screens/CategoryTable.h"
#include "ui/screens/QelViewItems.h"

namespace qel::tools {
namespace {

struct ScreenOptions {
  RecordingOptions recording;
  std::string technology;
  std::string category;
  bool json = false;
};

TableSnapshot draw(const std::string& technology, const std::string& category) {
  return snapshotOf(*makeScreen(technology, category));
}

Value orNull(const std::optional<std::string>& text) { return text ? Value(*text) : Value(); }

std::string asJson(const std::string& technology, const std::string& category) {
  List sections;
  for (const SectionSnapshot& section : draw(technology, category).sections) {
    List rows;
    for (const RowSnapshot& row : section.rows) {
      rows.emplace_back(List{orNull(row.text), orNull(row.detail)});
    }
    sections.emplace_back(Dictionary{{"title", orNull(section.title)}, {"rows", std::move(rows)}});
  }
  return jsonText(
      Dictionary{{"key", technology + " " + category}, {"sections", std::move(sections)}});
}

bool isTable(const ScreenOptions& options) {
  const auto& menu = QelViewItems::shared().firstLevelViewItems;
  const auto names = menu.find(options.technology);
  if (names != menu.end() && std::ranges::count(names->second, options.category) > 0) return true;
  const std::string key = options.technology + " " + options.category;
  const auto knows = [&key](Routine routine) { return findCategory(key, routine) != nullptr; };
  return knows(Routine::sections) || knows(Routine::rows) || knows(Routine::cells);
}

// It is drawn all the same: "Come back later" stands for every name.
void tellOfUnknownTable(const ScreenOptions& options) {
  if (isTable(options)) return;
  complain("qelctl", "no table is named \"" + options.technology + " " + options.category +
                         "\"; qelctl screens FILE draws all there are");
}

void printTable(const ScreenOptions& options, Output& output) {
  const TableSnapshot table = draw(options.technology, options.category);
  for (const std::string& line : tableLines(options.technology + " " + options.category, table)) {
    output.line(line);
  }
}

void addScreenCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("screen", "Draw one category after a recording");
  const auto options = std::make_shared<ScreenOptions>();
  addRecordingOptions(*command, options->recording);
  command->add_option("TECHNOLOGY", options->technology, "Such as LTE")->required();
  command->add_option("CATEGORY", options->category, "Such as \"Tx Power\"")->required();
  command->add_flag("--json", options->json, "As one JSON object");
  command->callback([options, &chosen] {
    chosen = [options](Output& output) {
      setStandardOutput(nullptr);
      feedRecording(options->recording);
      tellOfUnknownTable(*options);
      if (options->json) {
        output.line(asJson(options->technology, options->category));
      } else {
        printTable(*options, output);
      }
    };
  });
}

void addScreensCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("screens", "Draw every category of the menu, as JSON lines");
  const auto options = std::make_shared<RecordingOptions>();
  addRecordingOptions(*command, *options);
  command->callback([options, &chosen] {
    chosen = [options](Output& output) {
      setStandardOutput(nullptr);
      feedRecording(*options);
      const QelViewItems items;
      for (const std::string& technology : items.launchViewItemNames) {
        for (const std::string& category : items.firstLevelViewItems.at(technology)) {
          output.line(asJson(technology, category));
        }
      }
    };
  });
}

}  // namespace

void addScreenCommands(CLI::App& app, Action& chosen) {
  addScreenCommand(app, chosen);
  addScreensCommand(app, chosen);
}

}  // namespace qel::tools
