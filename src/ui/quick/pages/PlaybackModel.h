// An opened recording, as the scrubber shows it.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtCore/QString>
#include <QtCore/QStringList>
#include <memory>

#include "ui/pages/Playback.h"
#include "ui/quick/pages/TickTimer.h"

namespace qel {

// GUI thread only. Live until a recording is opened.
class PlaybackModel : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Pages")
  Q_PROPERTY(bool opening READ isOpening NOTIFY changed)
  Q_PROPERTY(bool opened READ isOpen NOTIFY changed)
  Q_PROPERTY(bool playing READ isPlaying NOTIFY changed)
  Q_PROPERTY(bool hasNext READ hasNext NOTIFY changed)
  Q_PROPERTY(bool hasPrevious READ hasPrevious NOTIFY changed)
  Q_PROPERTY(qreal progress READ progress NOTIFY changed)
  Q_PROPERTY(qreal position READ position NOTIFY changed)
  Q_PROPERTY(QString title READ title NOTIFY changed)
  Q_PROPERTY(QString progressText READ progressText NOTIFY changed)
  Q_PROPERTY(QString positionText READ positionText NOTIFY changed)
  Q_PROPERTY(QString momentText READ momentText NOTIFY changed)
  Q_PROPERTY(QString speedText READ speedText NOTIFY changed)
  Q_PROPERTY(QString notes READ notes NOTIFY changed)
  Q_PROPERTY(QString error READ error NOTIFY changed)

 public:
  PlaybackModel(std::shared_ptr<MetricValidator> validator, History& live, QObject* parent);

  const Playback& playback() const { return _playback; }

  bool isOpening() const { return view().state == PlaybackView::State::opening; }
  bool isOpen() const { return _playback.isOpen(); }
  bool isPlaying() const { return view().isPlaying; }
  bool hasNext() const { return view().hasNext; }
  bool hasPrevious() const { return view().hasPrevious; }
  qreal progress() const { return view().progress; }
  qreal position() const { return view().position; }
  QString title() const;
  QString progressText() const;
  QString positionText() const;
  QString momentText() const;
  QString speedText() const;
  QString notes() const;
  QString error() const;

  void open(const std::string& path);
  Q_INVOKABLE void close();
  Q_INVOKABLE void giveUpOpening();
  Q_INVOKABLE void playOrPause();
  // The next of the speeds, and from the last to the first.
  Q_INVOKABLE void nextSpeed();
  Q_INVOKABLE void jumpTo(qreal share);
  Q_INVOKABLE void jumpToMs(qreal timeMs);
  Q_INVOKABLE void step(qreal seconds);
  Q_INVOKABLE void toNext();
  Q_INVOKABLE void toPrevious();

 signals:
  void changed();

 private:
  const PlaybackView& view() const { return _playback.view(); }

  Playback _playback;
  TickTimer<Playback> _timer{_playback};
};

}  // namespace qel
