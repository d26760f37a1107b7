// The answer at a glance, as the first screen shows it.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QVariantMap>

#include "ui/pages/NowPage.h"
#include "ui/quick/pages/RowsModel.h"

namespace qel {

// GUI thread only. Every text comes ready from the page; what a new page says as the one before did
// is not announced.
class NowModel : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Pages")
  Q_PROPERTY(QString reason READ reason NOTIFY changed)
  Q_PROPERTY(QString advice READ advice NOTIFY changed)
  Q_PROPERTY(QString badge READ badge NOTIFY changed)
  Q_PROPERTY(QString spoken READ spoken NOTIFY changed)
  Q_PROPERTY(qel::RowsModel* lines READ lines CONSTANT)
  Q_PROPERTY(QVariant level READ level NOTIFY levelChanged)
  Q_PROPERTY(qel::RowsModel* others READ others CONSTANT)

 public:
  using QObject::QObject;

  void take(NowPage page);
  const NowPage& page() const { return _page; }

  QString reason() const;
  QString advice() const;
  QString badge() const;
  QString spoken() const;
  RowsModel* lines() { return &_lines; }     // text, spoken, known
  QVariant level() const { return _level; }  // name, figure, unit, grade, word, step, …
  RowsModel* others() { return &_others; }   // quality and signal to noise, alike

 signals:
  void changed();
  void levelChanged();
  // Other points than before, or the same at other places.
  void runsChanged();

 private:
  NowPage _page;
  RowsModel _lines;
  QVariantMap _level;
  RowsModel _others;
};

}  // namespace qel
