// The first page: the serving cell at a glance, the menu of technologies and the other pages.
#pragma once

#include <memory>

#include "tools/watch/Screens.h"
#include "tools/watch/View.h"

namespace qel::watch {

class HomeView final : public View {
 public:
  HomeView(Desk& desk, Screens& screens) : _desk(desk), _screens(screens) {}

  Sheet sheet(Size size) override;
  std::unique_ptr<View> open(const std::string& rowId) override;

 private:
  void addNow(Size size, Sheet& sheet);
  void addMenu(Sheet& sheet);
  void addFreshness(Size size, Sheet& sheet);

  Desk& _desk;
  Screens& _screens;
};

// The page behind a letter: s, h or r; nothing: none has it.
std::unique_ptr<View> viewOfLetter(char letter, Desk& desk);

}  // namespace qel::watch
