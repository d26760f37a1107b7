// A curve drawn small, without axes.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QPointer>
#include <QtGui/QColor>
#include <QtQuick/QQuickPaintedItem>
#include <cstdint>
#include <optional>
#include <vector>

#include "history/Series.h"

namespace qel {

// GUI thread. Draws on every renderer, and again only when its points, its size or its colour
// changed. What kind it is of says which page it follows and which curve of it that is.
class SmallCurveItem : public QQuickPaintedItem {
  Q_OBJECT
  QML_ANONYMOUS
  Q_PROPERTY(QColor color MEMBER _color NOTIFY colorChanged)

 public:
  explicit SmallCurveItem(QQuickItem* parent = nullptr);

  void paint(QPainter* painter) final;

 signals:
  void colorChanged();
  void pageChanged();

 protected:
  // As long as its page does not change.
  struct Drawn {
    const std::vector<Run>& runs;
    std::uint64_t fromMs;
    std::uint64_t toMs;
    float lowest;
    float highest;
  };

  // Nothing: there is none to draw.
  virtual std::optional<Drawn> curve() const = 0;

  // From now on it is this page whose changes are followed.
  template <typename Page>
  void follow(QPointer<Page>& held, Page* page, void (Page::*changes)()) {
    if (held == page) return;
    if (held) disconnect(held, nullptr, this, nullptr);
    held = page;
    if (page) connect(page, changes, this, [this] { update(); });
    emit pageChanged();
    update();
  }

 private:
  QColor _color;
};

}  // namespace qel
