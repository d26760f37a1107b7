// qelctl screen and screens: category tables after a recording, drawn by the viewer's controller.

#include <CLI/CLI.hpp>
#include <algorithm>
#include <memory>
#include <optional>
#include <string>

#include "base/LogSink.h"
#include "base/Rendering.h"
#include "base/Utf8.h"
#include "tools/Commands.h"
#include "tools/RecordingFeed.h"
#include "ui/kit/TableSnapshot.h"
#include "ui/screens/QelViewItems.h"
#include "ui/screens/SecondLevelViewController.h"
#include "ui/screens/StandardScreens.h"

namespace qel::tools {
namespace {

struct Options {
  RecordingOptions recording;
  std::string technology;
  std::string category;
  bool json = false;
};

TableSnapshot draw(const std::string& technology, const std::string& category) {
  const auto screen = std::dynamic_pointer_cast<SecondLevelViewController>(
      makeStandardScreen("SecondLevelViewController"));
  screen->firstSelection = technology;
  screen->seguedThroughRow = category;
  return snapshotOf(*screen);
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

// Characters, as far as a column's width goes.
std::size_t widthOf(const std::string& text) {
  return static_cast<std::size_t>(std::ranges::count_if(
      text, [](char c) { return (static_cast<unsigned char>(c) & 0xC0) != 0x80; }));
}

void printTable(const Options& options, Output& output) {
  const TableSnapshot table = draw(options.technology, options.category);
  std::size_t width = 0;
  for (const SectionSnapshot& section : table.sections) {
    for (const RowSnapshot& row : section.rows) {
      width = std::max(width, widthOf(row.text.value_or("")));
    }
  }
  output.line(options.technology + " " + options.category);
  for (const SectionSnapshot& section : table.sections) {
    output.line("");
    if (section.title) output.line(*section.title);
    for (const RowSnapshot& row : section.rows) {
      const std::string name = row.text.value_or("");
      output.line("  " + withReplacements(name) + std::string(width - widthOf(name) + 2, ' ') +
                  withReplacements(row.detail.value_or("")));
    }
  }
}

void addScreenCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("screen", "Draw one category after a recording");
  const auto options = std::make_shared<Options>();
  addRecordingOptions(*command, options->recording);
  command->add_option("TECHNOLOGY", options->technology, "Such as LTE")->required();
  command->add_option("CATEGORY", options->category, "Such as \"Tx Power\"")->required();
  command->add_flag("--json", options->json, "As one JSON object");
  command->callback([options, &chosen] {
    chosen = [options](Output& output) {
      setStandardOutput(nullptr);
      feedRecording(options->recording);
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
