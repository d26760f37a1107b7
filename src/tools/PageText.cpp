#include "tools/PageText.h"

#include <algorithm>

#include "tools/watch/Blocks.h"
#include "tools/watch/Sheet.h"
#include "ui/pages/Words.h"

namespace qel::tools {
namespace {

constexpr std::size_t kColumns = 60;  // of a curve

std::string readingText(const Reading& reading) {
  if (reading.figure.empty()) return reading.spoken;
  std::string text = reading.name + " " + reading.figure + " " + reading.unit + ", " + reading.word;
  if (reading.isOld) text += " (" + reading.age + ")";
  return text;
}

std::string curveLine(const Chart& chart, const Curve& curve, const SignalsPage& page) {
  const watch::BlockFrame frame{page.fromMs, page.toMs, chart.lowest, chart.highest, kColumns};
  return watch::padded(curve.isServing ? "serving" : curve.label, 12) +
         watch::sparkline(curve.runs, frame);
}

void addNeighbours(const SignalsPage& page, std::vector<std::string>& lines) {
  lines.emplace_back();
  lines.emplace_back("Neighbours");
  if (page.neighbours.empty()) lines.push_back("  " + page.neighboursNotice);
  for (const NeighbourRow& row : page.neighbours) {
    std::string line = "  " + watch::padded(row.name, 16) + watch::padded(row.channel, 15) +
                       watch::padded(row.level, 10) + watch::padded(row.quality, 10) +
                       watch::padded(row.difference, 10) + row.age;
    line.resize(line.find_last_not_of(' ') + 1);
    lines.push_back(std::move(line));
  }
}

}  // namespace

std::vector<std::string> linesOf(const NowPage& page) {
  if (!page.reason.empty()) {
    std::vector<std::string> lines = {page.reason};
    if (!page.advice.empty()) lines.push_back(page.advice);
    return lines;
  }
  std::vector<std::string> lines;
  for (const NowLine& line : page.lines) lines.push_back(line.text);
  lines.push_back(readingText(page.level));
  if (page.quality) lines.push_back(readingText(*page.quality));
  if (page.sinr) lines.push_back(readingText(*page.sinr));
  if (!page.runs.empty()) {
    lines.push_back(watch::sparkline(
        page.runs, {page.runsFromMs, page.runsToMs, page.lowest, page.highest, kColumns}));
  }
  return lines;
}

std::vector<std::string> linesOf(const SignalsPage& page) {
  std::vector<std::string> lines = {capitalized(page.span)};
  if (!page.notice.empty()) lines.push_back(page.notice);
  for (const Chart& chart : page.charts) {
    lines.emplace_back();
    lines.push_back(chart.title + " from " + figureText(chart.lowest) + " to " +
                    figureText(chart.highest) + " " + chart.unit + "; " +
                    readingText(chart.newest));
    for (auto curve = chart.curves.rbegin(); curve != chart.curves.rend(); ++curve) {
      lines.push_back(curveLine(chart, *curve, page));
    }
  }
  if (!page.marks.empty()) {
    lines.emplace_back();
    lines.emplace_back("Marks");
    for (const SignalMark& mark : page.marks) {
      lines.push_back("  " + secondText(mark.timeMs, systemTimeZone()) + " " + mark.letter + " " +
                      mark.text);
    }
  }
  addNeighbours(page, lines);
  return lines;
}

}  // namespace qel::tools
