// The viewer's real window for programs that measure it: no service, the store filled by hand.
#pragma once

#include <QtCore/QTemporaryDir>
#include <QtGui/QGuiApplication>
#include <QtQml/QQmlApplicationEngine>
#include <QtQuick/QQuickWindow>
#include <chrono>
#include <memory>

#include "ui/quick/Navigation.h"
#include "ui/quick/QuickRunLoop.h"

namespace qel::benchmarks {

inline constexpr int kSections = 20;
inline constexpr int kRowsEach = 10;

// GUI thread, one a process. The application object is made with it, on the platform that the
// environment names. Settings are those of a new user.
class ViewerWindow {
 public:
  ViewerWindow(int& argc, char** argv);

  // False when the interface did not load.
  bool isThere() const { return _window; }
  QQuickWindow& window() const { return *_window; }
  Navigation& navigation() const { return *_navigation; }

  // Opens the row of the menu in sight that has this text.
  void choose(const char* text) const;

 private:
  const QTemporaryDir _home;
  std::unique_ptr<QGuiApplication> _application;
  std::unique_ptr<QuickRunLoop> _runLoop;
  std::unique_ptr<QQmlApplicationEngine> _engine;
  QQuickWindow* _window = nullptr;
  Navigation* _navigation = nullptr;
};

void handleEvents(std::chrono::milliseconds time);
// Handles events until the window has shown another frame. False after five seconds without one.
bool waitForFrame(QQuickWindow& window);
// 200 rows of "EUTRA Neighbor Info" whose values carry the number.
void fillStore(int number);
// The five seconds are over: every timer fires and the queue is worked off.
void tick();

}  // namespace qel::benchmarks
