// Where the values come from and how that is doing, as the bar and the first screen show it.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QString>

#include "ui/pages/Freshness.h"

namespace qel {

// GUI thread only.
class FreshnessModel : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Pages")
  Q_PROPERTY(QString source READ source NOTIFY changed)
  Q_PROPERTY(QString state READ state NOTIFY changed)
  Q_PROPERTY(QString bar READ bar NOTIFY changed)
  Q_PROPERTY(QString loss READ loss NOTIFY changed)

 public:
  using QObject::QObject;

  void take(Freshness freshness);

  QString source() const;
  QString state() const;
  QString bar() const;
  QString loss() const;

 signals:
  void changed();

 private:
  Freshness _freshness;
};

}  // namespace qel
