// One chart of the curves.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QPointer>
#include <QtGui/QColor>
#include <QtGui/QFont>
#include <QtQuick/QQuickPaintedItem>
#include <array>
#include <cstdint>

#include "ui/quick/pages/CurvePainter.h"
#include "ui/quick/pages/SignalsModel.h"

namespace qel {

// GUI thread. Draws on every renderer, and again only for a new page, size, colour or font. The
// quality bands are told apart by words and by how dark they are, not by colour alone.
class ChartItem : public QQuickPaintedItem {
  Q_OBJECT
  QML_NAMED_ELEMENT(ChartCurves)
  Q_PROPERTY(qel::SignalsModel* page MEMBER _page WRITE setPage NOTIFY pageChanged)
  Q_PROPERTY(int chart MEMBER _chart NOTIFY looksChanged)
  Q_PROPERTY(QColor serving MEMBER _serving NOTIFY looksChanged)
  Q_PROPERTY(QColor neighbours MEMBER _neighbours NOTIFY looksChanged)
  Q_PROPERTY(QColor lines MEMBER _lines NOTIFY looksChanged)
  Q_PROPERTY(QColor words MEMBER _words NOTIFY looksChanged)
  Q_PROPERTY(QColor good MEMBER _good NOTIFY looksChanged)
  Q_PROPERTY(QColor fair MEMBER _fair NOTIFY looksChanged)
  Q_PROPERTY(QColor poor MEMBER _poor NOTIFY looksChanged)
  Q_PROPERTY(QFont font MEMBER _font NOTIFY looksChanged)
  Q_PROPERTY(qreal plotLeft READ plotLeft NOTIFY plotChanged)
  Q_PROPERTY(qreal plotWidth READ plotWidth NOTIFY plotChanged)
  Q_PROPERTY(qreal plotTop READ plotTop NOTIFY plotChanged)
  Q_PROPERTY(qreal plotHeight READ plotHeight NOTIFY plotChanged)

 public:
  explicit ChartItem(QQuickItem* parent = nullptr);

  void setPage(SignalsModel* page);

  // Where the curves are within the item: read-off lines stand there.
  qreal plotLeft() const { return plotRect().left(); }
  qreal plotWidth() const { return plotRect().width(); }
  qreal plotTop() const { return plotRect().top(); }
  qreal plotHeight() const { return plotRect().height(); }

  void paint(QPainter* painter) override;

 signals:
  void pageChanged();
  void looksChanged();
  void plotChanged();

 protected:
  void geometryChange(const QRectF& now, const QRectF& before) override;

 private:
  // What gives way to the curves where large text takes more than half of the width: of a
  // neighbour's code all but its number, then words that stand in a column of their own.
  enum class Writing : std::uint8_t { full, shortCodes, withoutWords };

  // How much room the numbers and the words at the left of the curves take.
  struct AxisRoom {
    qreal numbers = 0;
    qreal words = 0;
    bool isOneColumn = true;  // words stand between numbers; else left of them
    qreal width(Writing writing) const;
  };

  const Chart* chart() const;
  AxisRoom axisRoom(const Chart& chart) const;
  Writing writing() const;
  QRectF plotRect() const { return plotRect(writing()); }
  QRectF plotRect(Writing writing) const;
  QColor colorOf(Grade grade) const;
  void drawBands(QPainter& painter, const PlotArea& plot, const Chart& chart) const;
  void drawAxis(QPainter& painter, const PlotArea& plot, const Chart& chart) const;
  void drawMarks(QPainter& painter, const PlotArea& plot) const;
  void drawTimes(QPainter& painter, const PlotArea& plot) const;
  void drawCurves(QPainter& painter, const PlotArea& plot, const Chart& chart) const;

  QPointer<SignalsModel> _page;
  int _chart = 0;
  QColor _serving;
  QColor _neighbours;
  QColor _lines;
  QColor _words;
  QColor _good;
  QColor _fair;
  QColor _poor;
  QFont _font;
};

}  // namespace qel
