#include "tools/watch/SignalsView.h"

#include <algorithm>

#include "tools/watch/Blocks.h"
#include "tools/watch/Rows.h"
#include "ui/pages/Charts.h"
#include "ui/pages/Words.h"

namespace qel::watch {
namespace {

constexpr std::size_t kAxisColumns = 12;
constexpr std::size_t kChartLines = 7;
constexpr double kCloser = 0.5;

// High enough for the serving cell; what lies below the axis has the lowest block.
BlockFrame frameOf(const SignalsPage& page, const Chart& chart, Size size) {
  Axis axis = usualAxis(chart.quantity);
  const Curve& last = chart.curves.back();
  if (last.isServing) axis.highest = widened(axis, last.runs).highest;
  return {page.fromMs, page.toMs, axis.lowest, axis.highest,
          static_cast<std::size_t>(size.columns) - kAxisColumns};
}

// The label of the threshold that lies within a line of the chart; else blank.
std::string axisText(const Chart& chart, const BlockFrame& frame, std::size_t line) {
  const float height = (frame.highest - frame.lowest) / static_cast<float>(kChartLines);
  const float bottom = frame.highest - static_cast<float>(line + 1) * height;
  for (const AxisLabel& label : chart.labels) {
    if (label.value < bottom || label.value >= bottom + height) continue;
    return padded(label.text, 5) + padded(label.word, kAxisColumns - 5);
  }
  return std::string(kAxisColumns, ' ');
}

// Letters under the curve; where two fall together the later stands.
std::string marksText(const SignalsPage& page, const BlockFrame& frame) {
  std::string line(frame.columns, ' ');
  for (const SignalMark& mark : page.marks) line[columnOf(mark.timeMs, frame)] = mark.letter;
  return line;
}

std::string timesText(const SignalsPage& page, const BlockFrame& frame) {
  std::string line(frame.columns, ' ');
  std::size_t free = 0;
  for (const TimeLabel& label : page.times) {
    const std::size_t column = columnOf(label.timeMs, frame);
    if (column < free || column + label.text.size() > line.size()) continue;
    line.replace(column, label.text.size(), label.text);
    free = column + label.text.size() + 1;
  }
  return line;
}

Row captioned(const std::string& caption, std::string text, Style style) {
  return {{{padded(caption, kAxisColumns), Style::muted}, {std::move(text), style}}, ""};
}

const Chart* chartNamed(const SignalsPage& page, const std::string& id) {
  const auto found = std::ranges::find(page.charts, id, &Chart::id);
  if (found != page.charts.end()) return &*found;
  return page.charts.empty() ? nullptr : &page.charts.front();
}

void addNeighbours(const SignalsPage& page, Sheet& sheet) {
  sheet.rows.emplace_back();
  sheet.rows.push_back(plainRow("Neighbours", Style::accent));
  if (page.neighbours.empty()) sheet.rows.push_back(plainRow(page.neighboursNotice, Style::muted));
  for (const NeighbourRow& row : page.neighbours) {
    sheet.rows.push_back(
        {{{"  " + padded(row.name, 16), Style::plain},
          {padded(row.channel, 15), Style::muted},
          {padded(row.level, 10) + padded(row.quality, 10) + padded(row.difference, 10),
           row.age.empty() ? Style::plain : Style::muted},
          {row.age, Style::muted}},
         ""});
  }
}

}  // namespace

Sheet SignalsView::sheet(Size size) {
  const SignalsPage page = signalsPage(_desk.viewpoint(), _range);
  Sheet sheet;
  sheet.title = "Signals";
  sheet.side = page.span;
  sheet.keys = "arrows read, scroll  +/- zoom  [ ] move  Tab chart  Escape back";
  if (!page.notice.empty()) {
    for (std::string& line : wrapped(page.notice, static_cast<std::size_t>(size.columns))) {
      sheet.rows.push_back(plainRow(std::move(line)));
    }
  }
  if (const Chart* chart = chartNamed(page, _chart)) {
    addChart(page, *chart, size, sheet);
    for (const Chart& other : page.charts) {
      if (other.id == chart->id || !other.curves.back().isServing) continue;
      sheet.rows.push_back(
          captioned(other.title, sparkline(other.curves.back().runs, frameOf(page, other, size)),
                    Style::plain));
    }
  }
  addNeighbours(page, sheet);
  return sheet;
}

void SignalsView::addChart(const SignalsPage& page, const Chart& chart, Size size,
                           Sheet& sheet) const {
  const BlockFrame frame = frameOf(page, chart, size);
  Row head{{{padded(chart.title, kAxisColumns), Style::accent}}, ""};
  if (_readAtMs) {
    const ReadOff off = readOff(chart, *_readAtMs);
    head.spans.push_back({off.spoken, Style::strong});
  } else {
    for (Span& span : spansOf(chart.newest)) head.spans.push_back(std::move(span));
  }
  sheet.rows.push_back(std::move(head));
  const auto& serving = chart.curves.back();
  const std::vector<Run> none;
  for (std::size_t line = 0;
       std::string & text : bars(serving.isServing ? serving.runs : none, frame, kChartLines)) {
    sheet.rows.push_back(captioned(axisText(chart, frame, line++), std::move(text), Style::accent));
  }
  if (_readAtMs) {
    std::string cursor(frame.columns, ' ');
    cursor[columnOf(readOff(chart, *_readAtMs).timeMs, frame)] = '^';
    sheet.rows.push_back(captioned("read off", std::move(cursor), Style::strong));
  }
  sheet.rows.push_back(captioned("marks", marksText(page, frame), Style::strong));
  sheet.rows.push_back(captioned("", timesText(page, frame), Style::muted));
  for (const Curve& curve : chart.curves) {
    if (curve.isServing) continue;
    sheet.rows.push_back(captioned(curve.label, sparkline(curve.runs, frame), Style::plain));
  }
}

void SignalsView::readOffBy(int direction) {
  const SignalsPage page = signalsPage(_desk.viewpoint(), _range);
  const Chart* chart = chartNamed(page, _chart);
  if (!chart) return;
  const std::uint64_t from = _readAtMs.value_or(page.toMs + 1);
  const auto next = direction < 0 ? pointBefore(*chart, from) : pointAfter(*chart, from);
  if (next) {
    _readAtMs = next;
  } else if (direction > 0) {
    _readAtMs.reset();  // behind the last one the newest value stands again
  }
}

bool SignalsView::take(const KeyPress& press) {
  if (press.key == Key::left || press.key == Key::right) {
    readOffBy(press.key == Key::left ? -1 : 1);
    return true;
  }
  if (press.key == Key::tab) {
    const SignalsPage page = signalsPage(_desk.viewpoint(), _range);
    const Chart* chart = chartNamed(page, _chart);
    if (!chart) return true;
    const bool isLast = chart == &page.charts.back();
    _chart = isLast ? page.charts.front().id : (chart + 1)->id;
    _readAtMs.reset();
    return true;
  }
  switch (press.character) {
    case '+':
    case '=':
      _range = _range.zoomed(kCloser);
      return true;
    case '-':
      _range = _range.zoomed(1 / kCloser);
      return true;
    case '[':
      _range = _range.moved(kCloser);
      return true;
    case ']':
      _range = _range.moved(-kCloser);
      return true;
    default:
      return false;
  }
}

}  // namespace qel::watch
