// The viewer's own screens in a terminal: category menus and category tables.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "tools/watch/View.h"
#include "ui/kit/NavigationController.h"
#include "ui/kit/TableSnapshot.h"

namespace qel::watch {

// The stack of screens, of which each view shows one. Main thread.
class Screens {
 public:
  Screens();

  // As in the first screen's menu.
  std::vector<std::string> technologies();
  std::unique_ptr<View> openTechnology(const std::string& name, Desk& desk);

 private:
  NavigationController _navigation;
};

// One screen, on top of the stack as long as this is there.
class ScreenView final : public View {
 public:
  ScreenView(NavigationController& navigation, Desk& desk);
  ~ScreenView() override;
  ScreenView(const ScreenView&) = delete;
  ScreenView& operator=(const ScreenView&) = delete;

  Sheet sheet(Size size) override;
  std::unique_ptr<View> open(const std::string& rowId) override;
  bool needsDrawing() const override;

 private:
  void redraw();
  std::unique_ptr<View> openField(IndexPath place);

  NavigationController& _navigation;
  Desk& _desk;
  const std::shared_ptr<TableViewController> _screen;
  TableSnapshot _table;
  bool _isDrawn = false;
  bool _wasOpen = false;           // a recording, when it was drawn
  std::uint64_t _drawnMoment = 0;  // of the recording
};

}  // namespace qel::watch
