// Recording from the bar: begin, mark, stop.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QString>
#include <memory>

#include "ui/pages/RecordingControl.h"
#include "ui/quick/pages/TickTimer.h"

namespace qel {

// GUI thread only. Can nothing until it is given a control.
class RecorderModel : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Pages")
  Q_PROPERTY(bool available READ isAvailable NOTIFY changed)
  Q_PROPERTY(bool recording READ isRecording NOTIFY changed)
  Q_PROPERTY(QString text READ text NOTIFY changed)
  Q_PROPERTY(QString hiddenText READ hiddenText NOTIFY changed)
  Q_PROPERTY(QString markText READ markText NOTIFY changed)
  Q_PROPERTY(QString outcome READ outcome NOTIFY changed)

 public:
  using QObject::QObject;

  void setControl(std::unique_ptr<RecordingControl> control);
  RecordingControl* control() const { return _control.get(); }

  bool isAvailable() const { return _control != nullptr; }
  bool isRecording() const { return _view.isRecording; }
  QString text() const;
  QString hiddenText() const;
  QString markText() const;
  QString outcome() const;

  Q_INVOKABLE void start();
  Q_INVOKABLE void mark();
  Q_INVOKABLE void stop();

 signals:
  void changed();

 private:
  void arm();

  std::unique_ptr<RecordingControl> _control;
  std::unique_ptr<TickTimer<RecordingControl>> _timer;
  RecordingControlView _view;
};

}  // namespace qel
