// Opens every screen once and looks whether it draws.
#pragma once

#include <QtCore/QString>
#include <QtCore/QStringList>
#include <QtQuick/QQuickWindow>

#include "ui/quick/Navigation.h"

namespace qel {

// GUI thread only, with the event loop not yet running. Counts warnings of the interface too.
class SelfTest {
 public:
  SelfTest(QQuickWindow& window, Navigation& navigation);
  ~SelfTest();
  SelfTest(const SelfTest&) = delete;
  SelfTest& operator=(const SelfTest&) = delete;

  // True when every screen of every technology drew. Says how many on standard error, and what
  // failed.
  bool run();

 private:
  void visitChildren();
  void visitPage(const char* page);
  void check();
  bool waitForFrame();
  void fail(const QString& what);

  QQuickWindow& _window;
  Navigation& _navigation;
  QStringList _path;
  int _screens = 0;
  int _failures = 0;
};

}  // namespace qel
