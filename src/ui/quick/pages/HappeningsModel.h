// What happened, as the window lists it, and which kinds its reader wants to see.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QString>
#include <functional>

#include "ui/pages/HappeningsPage.h"
#include "ui/quick/pages/RowsModel.h"

namespace qel {

// GUI thread only. Newest first, under the days as sections.
class HappeningsModel : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Pages")
  Q_PROPERTY(QString notice READ notice NOTIFY changed)
  Q_PROPERTY(QString older READ older NOTIFY changed)
  Q_PROPERTY(qel::RowsModel* rows READ rows CONSTANT)
  Q_PROPERTY(qel::RowsModel* kinds READ kinds CONSTANT)
  Q_PROPERTY(bool filtered READ isFiltered NOTIFY changed)

 public:
  using QObject::QObject;

  // Called when other kinds are to be shown.
  void setAsk(std::function<void()> ask) { _ask = std::move(ask); }
  const HappeningsFilter& filter() const { return _filter; }

  void take(HappeningsPage page);

  QString notice() const { return _notice; }
  QString older() const { return _older; }
  RowsModel* rows() { return &_rows; }    // time, text, record, kind, technology, spoken
  RowsModel* kinds() { return &_kinds; }  // kind, name, count, shown
  bool isFiltered() const { return !_filter.kinds.empty(); }

  // Shows this kind alone, or with those chosen before; once more takes it out again.
  Q_INVOKABLE void toggle(const QString& kind);
  Q_INVOKABLE void showAll();

 signals:
  void changed();

 private:
  std::function<void()> _ask;
  HappeningsFilter _filter;
  QString _notice;
  QString _older;
  RowsModel _rows;
  RowsModel _kinds;
};

}  // namespace qel
