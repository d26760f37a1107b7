#include "tools/watch/Screens.h"

#include <algorithm>
#include <charconv>

#include "tools/watch/FieldView.h"
#include "tools/watch/Rows.h"
#include "ui/kit/Storyboard.h"
#include "ui/screens/Placeholders.h"
#include "ui/screens/QelViewItems.h"
#include "ui/screens/SecondLevelViewController.h"
#include "ui/screens/StandardScreens.h"

namespace qel::watch {
namespace {

// Where rows lead, as in the window.
class TerminalStoryboard final : public Storyboard {
 public:
  std::string destinationOfCell(std::string_view cellIdentifier) const override {
    if (cellIdentifier == "LaunchView") return "FirstLevelViewController";
    if (cellIdentifier == "FirstClickView") return "SecondLevelViewController";
    return {};
  }
  std::shared_ptr<TableViewController> makeScreen(std::string_view className) const override {
    return makeStandardScreen(className);
  }
};

std::string idOf(IndexPath place) {
  return std::to_string(place.section) + "." + std::to_string(place.row);
}

std::optional<IndexPath> placeOf(const std::string& id) {
  const std::size_t dot = id.find('.');
  if (dot == std::string::npos) return std::nullopt;
  IndexPath place{};
  const char* const end = id.data() + id.size();
  const auto section = std::from_chars(id.data(), id.data() + dot, place.section);
  const auto row = std::from_chars(id.data() + dot + 1, end, place.row);
  if (section.ec != std::errc() || row.ec != std::errc()) return std::nullopt;
  return place;
}

std::shared_ptr<TableViewController> topOf(const NavigationController& navigation) {
  return std::dynamic_pointer_cast<TableViewController>(navigation.topViewController());
}

std::size_t nameColumns(const TableSnapshot& table) {
  std::size_t columns = 0;
  for (const SectionSnapshot& section : table.sections) {
    for (const RowSnapshot& row : section.rows) {
      columns = std::max(columns, columnsOf(row.text.value_or("")));
    }
  }
  return columns;
}

}  // namespace

Screens::Screens() : _navigation(makeStandardScreen("QelViewController")) {}

std::vector<std::string> Screens::technologies() {
  return QelViewItems::shared().launchViewItemNames;
}

std::unique_ptr<View> Screens::openTechnology(const std::string& name, Desk& desk) {
  const TableSnapshot menu = snapshotOf(*topOf(_navigation));
  for (int row = 0; const RowSnapshot& each : menu.sections.front().rows) {
    const IndexPath place{0, row++};
    if (each.text != name || !followRow(_navigation, TerminalStoryboard(), place)) continue;
    return std::make_unique<ScreenView>(_navigation, desk);
  }
  return nullptr;
}

ScreenView::ScreenView(NavigationController& navigation, Desk& desk)
    : _navigation(navigation), _desk(desk), _screen(topOf(navigation)) {}

ScreenView::~ScreenView() { _navigation.popViewController(); }

bool ScreenView::needsDrawing() const {
  return _screen->tableView()->needsDrawing() || _wasOpen != _desk.playback.isOpen() ||
         (_wasOpen && _drawnMoment != _desk.playback.momentMs());
}

void ScreenView::redraw() {
  if (_isDrawn && !needsDrawing()) return;
  _table = snapshotOf(*_screen);
  _screen->tableView()->drawn();
  _isDrawn = true;
  _wasOpen = _desk.playback.isOpen();
  _drawnMoment = _wasOpen ? _desk.playback.momentMs() : 0;
}

Sheet ScreenView::sheet(Size /*size*/) {
  redraw();
  Sheet sheet;
  sheet.title = _screen->title();
  const auto category = std::dynamic_pointer_cast<SecondLevelViewController>(_screen);
  if (category) sheet.side = category->firstSelection.value_or("");
  sheet.keys = "up/down choose  Enter open  Escape back  q quit";
  const std::size_t columns = nameColumns(_table);
  for (int section = 0; const SectionSnapshot& each : _table.sections) {
    if (each.title) {
      if (!sheet.rows.empty()) sheet.rows.emplace_back();
      sheet.rows.push_back(plainRow(*each.title, Style::accent));
    }
    for (int row = 0; const RowSnapshot& shown : each.rows) {
      const std::string name = shown.text.value_or("");
      const bool isNotice = shown.detail && isPlaceholder(name, *shown.detail);
      Row made{{{"  " + padded(name, columns), shown.detail ? Style::muted : Style::plain}},
               idOf({section, row++})};
      if (isNotice) {
        made.spans = {{"  " + name, Style::muted}};
      } else if (shown.detail) {
        made.spans.push_back({"  " + *shown.detail, Style::plain});
      }
      sheet.rows.push_back(std::move(made));
    }
    ++section;
  }
  return sheet;
}

std::unique_ptr<View> ScreenView::open(const std::string& rowId) {
  const auto place = placeOf(rowId);
  if (!place) return nullptr;
  if (followRow(_navigation, TerminalStoryboard(), *place)) {
    return std::make_unique<ScreenView>(_navigation, _desk);
  }
  return openField(*place);
}

std::unique_ptr<View> ScreenView::openField(IndexPath place) {
  const auto category = std::dynamic_pointer_cast<SecondLevelViewController>(_screen);
  if (!category) return nullptr;
  auto view = std::make_unique<FieldView>(
      _desk, FieldPlace{category->firstSelection.value_or(""),
                        category->seguedThroughRow.value_or(""), place.section, place.row});
  return view->isThere() ? std::move(view) : nullptr;
}

}  // namespace qel::watch
