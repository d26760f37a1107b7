// The curves, as the window shows them, and the part of time that is looked at.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QString>
#include <QtCore/QVariantList>
#include <QtCore/QVariantMap>
#include <functional>

#include "ui/pages/SignalsPage.h"
#include "ui/quick/pages/RowsModel.h"

namespace qel {

// GUI thread only. A gesture changes the range and asks for the page anew; every text comes ready
// from it.
class SignalsModel : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Pages")
  Q_PROPERTY(QString notice READ notice NOTIFY changed)
  Q_PROPERTY(QString span READ span NOTIFY changed)
  Q_PROPERTY(QVariantList charts READ charts NOTIFY changed)
  Q_PROPERTY(int chartCount READ chartCount NOTIFY chartCountChanged)
  Q_PROPERTY(qel::RowsModel* neighbours READ neighbours CONSTANT)
  Q_PROPERTY(QString neighboursNotice READ neighboursNotice NOTIFY changed)
  Q_PROPERTY(bool canZoomIn READ canZoomIn NOTIFY changed)
  Q_PROPERTY(bool canZoomOut READ canZoomOut NOTIFY changed)
  Q_PROPERTY(bool isAtEnd READ isAtEnd NOTIFY changed)
  Q_PROPERTY(int columns READ columns WRITE setColumns NOTIFY columnsChanged)
  Q_PROPERTY(QVariant readOff READ readOff NOTIFY readOffChanged)

 public:
  using QObject::QObject;

  // Called when another part of time is to be shown.
  void setAsk(std::function<void()> ask) { _ask = std::move(ask); }
  const SignalsRange& range() const { return _range; }

  void take(SignalsPage page);
  const SignalsPage& page() const { return _page; }

  QString notice() const;
  QString span() const;
  QVariantList charts() const { return _charts; }  // title, unit, newest, spoken
  int chartCount() const { return static_cast<int>(_page.charts.size()); }
  RowsModel* neighbours() { return &_neighbours; }
  QString neighboursNotice() const;
  bool canZoomIn() const { return _page.canZoomIn; }
  bool canZoomOut() const { return _page.canZoomOut; }
  bool isAtEnd() const { return _page.isAtEnd; }

  // How many columns there are to draw in.
  int columns() const { return static_cast<int>(_range.columns); }
  void setColumns(int columns);

  // Looks closer by a factor below 1, around a place from 0, left, to 1, right.
  Q_INVOKABLE void zoom(qreal factor, qreal around);
  // To earlier times by so many widths of what is seen; negative: to later ones.
  Q_INVOKABLE void move(qreal widths);
  Q_INVOKABLE void toEnd();

  // What the curves of one chart say at a place from 0 to 1: "chart", "place", "time", "values"
  // (label, text, serving, height from 0 to 1), "spoken". Nothing while nothing is read off.
  QVariant readOff() const { return _readOff; }
  Q_INVOKABLE void readAt(int chart, qreal place);
  // The next point of the serving cell's curve, or the one before it.
  Q_INVOKABLE void readNext(int chart);
  Q_INVOKABLE void readPrevious(int chart);
  Q_INVOKABLE void stopReading();

 signals:
  void changed();
  void chartCountChanged();
  void columnsChanged();
  void readOffChanged();

 private:
  void look(const SignalsRange& range);
  void takeNeighbours();
  void readTime(int chart, std::uint64_t timeMs);
  const Chart* chartAt(int chart) const;

  std::function<void()> _ask;
  SignalsRange _range;
  SignalsPage _page;
  QVariantList _charts;
  RowsModel _neighbours;
  QVariantMap _readOff;
  std::uint64_t _readMs = 0;
};

}  // namespace qel
