#include "tools/ScreenDrawing.h"

#include <algorithm>

#include "base/Utf8.h"
#include "ui/screens/SecondLevelViewController.h"
#include "ui/screens/StandardScreens.h"

namespace qel::tools {
namespace {

// Characters, as far as a column's width goes.
std::size_t widthOf(const std::string& text) {
  return static_cast<std::size_t>(std::ranges::count_if(
      text, [](char c) { return (static_cast<unsigned char>(c) & 0xC0) != 0x80; }));
}

bool isControl(unsigned char c, unsigned char next) {
  constexpr unsigned char kDelete = 0x7F;
  // U+0080 to U+009F are controls too.
  return c < ' ' || c == kDelete || (c == 0xC2 && next >= 0x80 && next < 0xA0);
}

// Text that a terminal shows and does not obey: controls become spaces.
std::string visible(const std::string& text) {
  std::string shown = withReplacements(text);
  for (std::size_t i = 0; i < shown.size(); ++i) {
    const auto next = static_cast<unsigned char>(i + 1 < shown.size() ? shown[i + 1] : 0);
    const auto c = static_cast<unsigned char>(shown[i]);
    if (isControl(c, next)) shown.replace(i, c == 0xC2 ? 2 : 1, " ");
  }
  return shown;
}

}  // namespace

std::shared_ptr<TableViewController> makeScreen(const std::string& technology,
                                                const std::string& category) {
  auto screen = std::dynamic_pointer_cast<SecondLevelViewController>(
      makeStandardScreen("SecondLevelViewController"));
  screen->firstSelection = technology;
  screen->seguedThroughRow = category;
  return screen;
}

std::vector<std::string> tableLines(const std::string& key, const TableSnapshot& table) {
  std::size_t width = 0;
  for (const SectionSnapshot& section : table.sections) {
    for (const RowSnapshot& row : section.rows) {
      width = std::max(width, widthOf(visible(row.text.value_or(""))));
    }
  }
  std::vector<std::string> lines = {key};
  for (const SectionSnapshot& section : table.sections) {
    lines.emplace_back();
    if (section.title) lines.push_back(*section.title);
    for (const RowSnapshot& row : section.rows) {
      const std::string name = visible(row.text.value_or(""));
      lines.push_back("  " + name + std::string(width - widthOf(name) + 2, ' ') +
                      visible(row.detail.value_or("")));
    }
  }
  return lines;
}

}  // namespace qel::tools
