#include "ui/Spoken.h"

#include <QtGui/private/qguiapplication_p.h>
#include <QtGui/qpa/qplatformaccessibility.h>
#include <QtGui/qpa/qplatformintegration.h>
#include <QtGui/QAccessibleActionInterface>
#include <algorithm>
#include <utility>

namespace qel::testing {
namespace {

std::vector<std::string> entered;

void hear(QAccessibleEvent* event) {
  if (event->type() != QAccessible::Focus) return;
  QAccessibleInterface* about = event->accessibleInterface();
  if (about) entered.push_back(about->text(QAccessible::Name).toStdString());
}

void collect(QAccessibleInterface& about, std::vector<SpokenItem>& all) {
  if (about.state().invisible) return;
  SpokenItem item;
  item.role = about.role();
  item.name = about.text(QAccessible::Name).toStdString();
  item.description = about.text(QAccessible::Description).toStdString();
  item.state = about.state();
  if (about.actionInterface()) item.actions = about.actionInterface()->actionNames();
  item.interface = &about;
  item.item = qobject_cast<QQuickItem*>(about.object());
  all.push_back(item);
  for (int i = 0; i < about.childCount(); ++i) {
    if (QAccessibleInterface* child = about.child(i)) collect(*child, all);
  }
}

// As a platform does when an assistive tool comes or goes.
void setActive(bool active) {
  QGuiApplicationPrivate::platformIntegration()->accessibility()->setActive(active);
}

}  // namespace

ScreenReaderEars::ScreenReaderEars() {
  setActive(true);
  entered.clear();
  QAccessible::installUpdateHandler(hear);
}

ScreenReaderEars::~ScreenReaderEars() {
  QAccessible::installUpdateHandler(nullptr);
  setActive(false);
}

std::vector<std::string> ScreenReaderEars::heard() { return std::exchange(entered, {}); }

std::vector<SpokenItem> spokenItems(const Window& window) {
  std::vector<SpokenItem> all;
  QAccessibleInterface* root = QAccessible::queryAccessibleInterface(&window.window());
  if (root) collect(*root, all);
  return all;
}

SpokenItem spoken(const Window& window, QAccessible::Role role, const std::string& name) {
  const auto all = spokenItems(window);
  const auto found = std::ranges::find_if(
      all, [&](const SpokenItem& item) { return item.role == role && item.name == name; });
  return found == all.end() ? SpokenItem() : *found;
}

bool isSpoken(const Window& window, QAccessible::Role role, const std::string& text) {
  const auto all = spokenItems(window);
  return std::ranges::any_of(all, [&](const SpokenItem& item) {
    return item.role == role && item.name.find(text) != std::string::npos;
  });
}

bool press(const SpokenItem& item) {
  if (!item.actions.contains(QAccessibleActionInterface::pressAction())) return false;
  item.interface->actionInterface()->doAction(QAccessibleActionInterface::pressAction());
  return true;
}

}  // namespace qel::testing
