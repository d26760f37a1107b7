#include "tools/watch/HappeningsView.h"

#include <algorithm>

#include "tools/watch/Rows.h"

namespace qel::watch {
namespace {

constexpr std::size_t kTimeColumns = 10;
constexpr std::size_t kKindColumns = 20;

std::string filterText(const HappeningsPage& page, const HappeningsFilter& filter) {
  if (filter.kinds.empty()) return "All kinds";
  for (const KindChoice& kind : page.kinds) {
    if (filter.kinds.contains(kind.kind)) return kind.name + " only";
  }
  return {};
}

void addRow(const HappeningRow& row, Size size, Sheet& sheet) {
  const std::size_t before = kTimeColumns + kKindColumns;
  const auto columns = static_cast<std::size_t>(size.columns);
  std::string time = row.time;
  std::string kind = row.kindName;
  for (std::string& part : wrapped(row.text, columns - before)) {
    sheet.rows.push_back({{{padded(time, kTimeColumns), Style::muted},
                           {padded(kind, kKindColumns), Style::accent},
                           {std::move(part), Style::plain}},
                          time.empty() ? "" : row.id});
    time.clear();
    kind.clear();
  }
}

}  // namespace

Sheet HappeningsView::sheet(Size size) {
  const HappeningsPage page = happeningsPage(_desk.viewpoint(), _filter);
  Sheet sheet;
  sheet.title = "Happenings";
  sheet.side = filterText(page, _filter);
  sheet.keys = "up/down choose  left/right filter  a all kinds  Escape back  q quit";
  for (std::string& line : wrapped(page.notice, static_cast<std::size_t>(size.columns))) {
    sheet.rows.push_back(plainRow(std::move(line)));
  }
  std::string day;
  for (const HappeningRow& row : page.rows) {
    if (row.day != day) {
      if (!day.empty()) sheet.rows.emplace_back();
      sheet.rows.push_back(plainRow(row.day, Style::strong));
      day = row.day;
    }
    addRow(row, size, sheet);
  }
  if (!page.older.empty()) sheet.rows.push_back(plainRow(page.older, Style::muted));
  const auto chosenRow = std::ranges::find(page.rows, chosen, &HappeningRow::id);
  if (chosenRow != page.rows.end() && !chosenRow->record.empty()) {
    sheet.foot.push_back(plainRow("Told by " + chosenRow->record, Style::muted));
  }
  return sheet;
}

// From all kinds to the first one, and on to the last.
void HappeningsView::nextFilter(int direction) {
  const HappeningsPage page = happeningsPage(_desk.viewpoint(), _filter);
  int place = -1;  // all kinds
  const int count = static_cast<int>(page.kinds.size());
  for (int i = 0; i < count && !_filter.kinds.empty(); ++i) {
    if (_filter.kinds.contains(page.kinds[static_cast<std::size_t>(i)].kind)) place = i;
  }
  place = (place + 1 + direction + count + 1) % (count + 1) - 1;
  _filter.kinds.clear();
  if (place >= 0) _filter.kinds.insert(page.kinds[static_cast<std::size_t>(place)].kind);
  top = 0;
  chosen.clear();
}

bool HappeningsView::take(const KeyPress& press) {
  if (press.key == Key::left || press.key == Key::right) {
    nextFilter(press.key == Key::left ? -1 : 1);
    return true;
  }
  if (press.character != 'a') return false;
  _filter.kinds.clear();
  return true;
}

}  // namespace qel::watch
