#include "tools/ScreenDrawing.h"

#include <algorithm>
#include <optional>

#include "base/TerminalText.h"
#include "ui/screens/SecondLevelViewController.h"
#include "ui/screens/StandardScreens.h"

namespace qel::tools {
namespace {

// Characters, as far as a column's width goes.
std::size_t widthOf(const std::string& text) {
  return static_cast<std::size_t>(std::ranges::count_if(
      text, [](char c) { return (static_cast<unsigned char>(c) & 0xC0) != 0x80; }));
}

std::string visible(const std::optional<std::string>& text) {
  return forTerminal(text.value_or(""), Instead::blank);
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
      width = std::max(width, widthOf(visible(row.text)));
    }
  }
  std::vector<std::string> lines = {visible(key)};
  for (const SectionSnapshot& section : table.sections) {
    lines.emplace_back();
    if (section.title) lines.push_back(visible(section.title));
    for (const RowSnapshot& row : section.rows) {
      const std::string name = visible(row.text);
      lines.push_back("  " + name + std::string(width - widthOf(name) + 2, ' ') +
                      visible(row.detail));
    }
  }
  return lines;
}

}  // namespace qel::tools
