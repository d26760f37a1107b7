// The window as a screen reader finds it, and what it is told.
#pragma once

#include <QtGui/QAccessible>
#include <QtQuick/QQuickItem>
#include <string>
#include <vector>

#include "ui/Window.h"

namespace qel::testing {

// What is said of one item.
struct SpokenItem {
  QAccessible::Role role = QAccessible::NoRole;
  std::string name;
  std::string description;
  QAccessible::State state;
  QStringList actions;
  QAccessibleInterface* interface = nullptr;
  QQuickItem* item = nullptr;
};

// One at a time, made before its window: what is told is heard from then on.
class ScreenReaderEars {
 public:
  ScreenReaderEars();
  ~ScreenReaderEars();
  ScreenReaderEars(const ScreenReaderEars&) = delete;
  ScreenReaderEars& operator=(const ScreenReaderEars&) = delete;

  // Names of what the keyboard came to since the last call, in order.
  static std::vector<std::string> heard();
};

// All that is there to be read and can be seen, in the order of the tree.
std::vector<SpokenItem> spokenItems(const Window& window);
// The first of them with that role and name; a role of nothing if there is none.
SpokenItem spoken(const Window& window, QAccessible::Role role, const std::string& name);
// Whether one of them has the role and a name that holds the text.
bool isSpoken(const Window& window, QAccessible::Role role, const std::string& text);
// As an assistive tool sets off what the item is for.
bool press(const SpokenItem& item);

}  // namespace qel::testing
