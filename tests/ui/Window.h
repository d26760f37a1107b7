// The real window with the real interface, driven by a finger and a keyboard that are not there.
#pragma once

#include <QtQml/QQmlApplicationEngine>
#include <QtQuick/QQuickItem>
#include <QtQuick/QQuickWindow>
#include <memory>
#include <string>
#include <vector>

#include "metrics/MetricValidator.h"
#include "support/FakeTransport.h"
#include "support/RecordingSink.h"
#include "ui/quick/Appearance.h"
#include "ui/quick/Navigation.h"
#include "ui/quick/QuickRunLoop.h"

namespace qel::testing {

class Window {
 public:
  // Shown and drawn, without animations unless asked for.
  explicit Window(bool animated = false, std::shared_ptr<FakeService> service = nullptr);

  QQuickWindow& window() const { return *_window; }
  Navigation& navigation() const { return *_navigation; }
  Appearance& appearance() const { return *_appearance; }
  TableModel& top() const { return *_navigation->top(); }
  MetricStore& store() const { return *MetricValidator::shared(); }

  // A tap on the row of the top screen that has this text. False when there is none in sight.
  bool tap(const std::string& text) const;
  // A tap in the middle of an item.
  void tap(const QQuickItem& item) const;
  void press(Qt::Key key) const;
  // Opens category after technology.
  bool open(const std::string& technology, const std::string& category) const;

  // What is written on the window, top to bottom, then left to right; hidden items left out.
  std::vector<std::string> texts() const;
  bool shows(const std::string& text) const;
  std::vector<QQuickItem*> itemsInSight() const;
  // The item in sight whose text or accessible name this is, or null.
  QQuickItem* find(const std::string& text) const;
  // The list of the top screen.
  QQuickItem* list() const;
  QQuickItem* row(int index) const;

  // Lets five seconds pass at once: every timer fires and the queue is worked off.
  void refresh() const;
  // Handles events until the window rests.
  void settle() const;

  // Warnings of the interface so far.
  int warnings() const;

 private:
  CapturedSystemLog _log;
  CapturedStandardOutput _out;
  std::shared_ptr<FakeService> _service;
  QuickRunLoop _runLoop;
  std::unique_ptr<QQmlApplicationEngine> _engine = std::make_unique<QQmlApplicationEngine>();
  QQuickWindow* _window = nullptr;
  Navigation* _navigation = nullptr;
  Appearance* _appearance = nullptr;
};

}  // namespace qel::testing
