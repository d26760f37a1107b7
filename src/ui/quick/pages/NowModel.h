// The answer at a glance, as the first screen shows it.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QVariantList>
#include <QtCore/QVariantMap>

#include "ui/pages/NowPage.h"

namespace qel {

// GUI thread only. Every text comes ready from the page.
class NowModel : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Pages")
  Q_PROPERTY(QString reason READ reason NOTIFY changed)
  Q_PROPERTY(QString advice READ advice NOTIFY changed)
  Q_PROPERTY(QString badge READ badge NOTIFY changed)
  Q_PROPERTY(QString spoken READ spoken NOTIFY changed)
  Q_PROPERTY(QVariantList lines READ lines NOTIFY changed)
  Q_PROPERTY(QVariant level READ level NOTIFY changed)
  Q_PROPERTY(QVariantList others READ others NOTIFY changed)

 public:
  using QObject::QObject;

  void take(NowPage page);
  const NowPage& page() const { return _page; }

  QString reason() const;
  QString advice() const;
  QString badge() const;
  QString spoken() const;
  QVariantList lines() const { return _lines; }    // text, spoken, known
  QVariant level() const { return _level; }        // name, figure, unit, grade, word, step, …
  QVariantList others() const { return _others; }  // quality and signal to noise, alike

 signals:
  void changed();
  // Other points than before, or the same at other places.
  void runsChanged();

 private:
  NowPage _page;
  QVariantList _lines;
  QVariantMap _level;
  QVariantList _others;
};

}  // namespace qel
