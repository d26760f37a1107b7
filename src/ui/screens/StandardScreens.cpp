#include "ui/screens/StandardScreens.h"

#include <algorithm>
#include <array>
#include <string>

#include "ui/screens/FirstLevelViewController.h"
#include "ui/screens/QelViewController.h"
#include "ui/screens/SecondLevelViewController.h"
#include "ui/screens/ThirdLevelViewController.h"

namespace qel {
namespace {

struct Prototype {
  std::string_view identifier;
  bool hasText;
  bool hasDetail;
};

constexpr std::array kPrototypes = {
    Prototype{"LaunchView", true, false},
    Prototype{"FirstClickView", true, false},
    Prototype{"SecondClickView", true, true},
    Prototype{"ThirdClickView", false, false},
};

template <typename Screen>
std::shared_ptr<TableViewController> make() {
  return std::make_shared<Screen>();
}

struct ScreenClass {
  std::string_view name;
  std::shared_ptr<TableViewController> (*make)();
};

constexpr std::array kScreenClasses = {
    ScreenClass{"QelViewController", make<QelViewController>},
    ScreenClass{"FirstLevelViewController", make<FirstLevelViewController>},
    ScreenClass{"SecondLevelViewController", make<SecondLevelViewController>},
    ScreenClass{"ThirdLevelViewController", make<ThirdLevelViewController>},
};

std::optional<Label> labelIf(bool present) {
  return present ? std::optional(Label{}) : std::nullopt;
}

}  // namespace

void registerStandardPrototypes(TableView& tableView) {
  for (const Prototype& prototype : kPrototypes) {
    tableView.registerPrototype(TableViewCell(std::string(prototype.identifier),
                                              labelIf(prototype.hasText),
                                              labelIf(prototype.hasDetail)));
  }
}

std::shared_ptr<TableViewController> makeStandardScreen(std::string_view className) {
  const auto named = [className](const ScreenClass& screen) { return screen.name == className; };
  const auto found = std::find_if(kScreenClasses.begin(), kScreenClasses.end(), named);
  if (found == kScreenClasses.end()) return nullptr;
  std::shared_ptr<TableViewController> screen = found->make();
  auto tableView = std::make_shared<TableView>();
  registerStandardPrototypes(*tableView);
  screen->setTableView(std::move(tableView));
  return screen;
}

}  // namespace qel
