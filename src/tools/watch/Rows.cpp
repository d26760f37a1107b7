#include "tools/watch/Rows.h"

#include <algorithm>

namespace qel::watch {
namespace {

constexpr std::size_t kNameColumns = 6;
constexpr std::size_t kFigureColumns = 6;

// "████·": filled steps of the five.
std::string stepBar(int step) {
  std::string bar;
  for (int i = 1; i <= kGradeSteps; ++i) bar += i <= step ? "█" : "·";
  return bar;
}

}  // namespace

Style styleOf(Grade grade) {
  switch (grade) {
    case Grade::unknown:
      return Style::muted;
    case Grade::poor:
      return Style::poor;
    case Grade::fair:
      return Style::fair;
    case Grade::good:
      return Style::good;
  }
  return Style::plain;
}

std::vector<Span> spansOf(const Reading& reading) {
  const std::string name = padded(reading.name, kNameColumns);
  if (reading.figure.empty()) return {{name + " not reported", Style::muted}};
  const std::size_t width = columnsOf(reading.figure);
  const std::string gap(width < kFigureColumns ? kFigureColumns - width : 0, ' ');
  const Style look = reading.isOld ? Style::muted : Style::strong;
  std::vector<Span> spans = {{name, Style::muted},
                             {gap + reading.figure + " " + padded(reading.unit, 4), look},
                             {padded(reading.word, 5) + stepBar(reading.step),
                              reading.isOld ? Style::muted : styleOf(reading.grade)}};
  if (reading.isOld) spans.push_back({" " + reading.age, Style::muted});
  return spans;
}

std::vector<std::string> wrapped(const std::string& text, std::size_t columns) {
  std::vector<std::string> lines;
  std::string line;
  for (std::size_t start = 0; start < text.size();) {
    const std::size_t end = std::min(text.find(' ', start), text.size());
    const std::string word = text.substr(start, end - start);
    if (!line.empty() && columnsOf(line) + 1 + columnsOf(word) > columns) {
      lines.push_back(std::move(line));
      line.clear();
    }
    line += (line.empty() ? "" : " ") + word;
    start = end + 1;
  }
  if (!line.empty()) lines.push_back(std::move(line));
  return lines;
}

Row plainRow(std::string text, Style style) { return {{{std::move(text), style}}, ""}; }

}  // namespace qel::watch
