// qelctl field: all that is known of one field of a category table, after a recording.

#include <CLI/CLI.hpp>
#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/LogSink.h"
#include "base/Rendering.h"
#include "base/TerminalText.h"
#include "metrics/MetricValidator.h"
#include "tools/Commands.h"
#include "tools/RecordingFeed.h"
#include "tools/ToolError.h"
#include "ui/pages/FieldSheet.h"
#include "ui/pages/Words.h"
#include "ui/screens/CategoryTable.h"

namespace qel::tools {
namespace {

struct FieldOptions {
  RecordingOptions recording;
  std::string technology;
  std::string category;
  std::string field;
  int section = 0;
  bool json = false;
};

std::string keyOf(const FieldOptions& options) {
  return options.technology + ' ' + options.category;
}

FieldSheet sheetOf(const FieldOptions& options, const Viewpoint& viewpoint) {
  const auto row =
      rowOfField(viewpoint, options.technology, options.category, options.section, options.field);
  auto sheet =
      row ? fieldSheet(viewpoint, options.technology, options.category, options.section, *row)
          : std::nullopt;
  if (sheet) return std::move(*sheet);
  throw ToolError(EX_DATAERR, options.recording.file + ": section " +
                                  std::to_string(options.section) + " of \"" + keyOf(options) +
                                  "\" shows no value of \"" + options.field + '"');
}

Value asJson(const Run& run) {
  List points;
  for (const Point& point : run) {
    points.emplace_back(Dictionary{{"time_ms", point.timeMs}, {"value", point.value}});
  }
  return points;
}

std::string asJson(const FieldSheet& sheet) {
  Dictionary object{{"label", sheet.label}, {"key", sheet.key},   {"place", sheet.place},
                    {"value", sheet.value}, {"unit", sheet.unit}, {"word", sheet.word}};
  List decoded;
  for (const SheetLine& line : sheet.lines) {
    if (line.id == "decoded") {
      decoded.emplace_back(Dictionary{{"label", line.label}, {"value", line.value}});
    } else {
      object.set(Text(line.id), line.value);
    }
  }
  List curve;
  for (const Run& run : sheet.curve) curve.push_back(asJson(run));
  object.set("decoded", std::move(decoded));
  object.set("curve", std::move(curve));
  return jsonText(object);
}

// In one line what the curve of a window shows.
std::string curveText(const FieldSheet& sheet) {
  std::size_t count = 0;
  float least = sheet.highest;
  float most = sheet.lowest;
  for (const Run& run : sheet.curve) {
    count += run.size();
    for (const Point& point : run) {
      least = std::min(least, point.value);
      most = std::max(most, point.value);
    }
  }
  if (count == 1) return "one value, " + figureText(least);
  return std::to_string(count) + " values from " + figureText(least) + " to " + figureText(most);
}

void print(const FieldSheet& sheet, Output& output) {
  std::vector<SheetLine> lines = {{"value", "Value", sheet.value}};
  if (!sheet.unit.empty()) lines.front().value += ' ' + sheet.unit;
  if (!sheet.word.empty()) lines.front().value += ", " + sheet.word;
  lines.insert(lines.end(), sheet.lines.begin(), sheet.lines.end());
  if (!sheet.curve.empty()) lines.push_back({"curve", "Last 10 minutes", curveText(sheet)});
  std::size_t width = 0;
  for (const SheetLine& line : lines) width = std::max(width, line.label.size());
  output.line(forTerminal(sheet.label + " (" + sheet.key + ")", Instead::blank));
  output.line(forTerminal(sheet.place, Instead::blank));
  output.line("");
  for (const SheetLine& line : lines) {
    const std::string gap(width + 2 - line.label.size(), ' ');
    output.line(line.label + gap + forTerminal(line.value, Instead::blank));
  }
}

void run(const FieldOptions& options, Output& output) {
  if (!findCategory(keyOf(options), Routine::cells)) {
    throw ToolError(EX_USAGE, "no table is named \"" + keyOf(options) + '"');
  }
  setStandardOutput(nullptr);
  History history;
  feedRecording(options.recording, history);
  const Viewpoint viewpoint{&history, MetricValidator::shared().get(),
                            history.lastReceivedMs(History::kLatest).value_or(0), false};
  const FieldSheet sheet = sheetOf(options, viewpoint);
  if (options.json) {
    output.line(asJson(sheet));
  } else {
    print(sheet, output);
  }
}

}  // namespace

void addFieldCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("field", "Tell all of one field after a recording");
  const auto options = std::make_shared<FieldOptions>();
  addRecordingOptions(*command, options->recording);
  command->add_option("TECHNOLOGY", options->technology, "Such as LTE")->required();
  command->add_option("CATEGORY", options->category, "Such as \"Tx Power\"")->required();
  command->add_option("FIELD", options->field, "Such as pucch_tx_power")->required();
  command->add_option("--section", options->section, "Of a table with an entry a section; from 0")
      ->type_name("N");
  command->add_flag("--json", options->json, "As one JSON object");
  command->callback(
      [options, &chosen] { chosen = [options](Output& output) { run(*options, output); }; });
}

}  // namespace qel::tools
