#include "ui/quick/pages/PlaybackModel.h"

#include <algorithm>
#include <chrono>
#include <utility>

#include "ui/quick/pages/Words.h"

namespace qel {

PlaybackModel::PlaybackModel(std::shared_ptr<MetricValidator> validator, History& live,
                             QObject* parent)
    : QObject(parent), _playback(std::move(validator), live) {
  _playback.setOnChanged([this] {
    _timer.arm();
    emit changed();
  });
}

QString PlaybackModel::title() const { return shown(view().title); }
QString PlaybackModel::progressText() const { return shown(view().progressText); }
QString PlaybackModel::positionText() const { return shown(view().positionText); }
QString PlaybackModel::momentText() const { return shown(view().momentText); }
QString PlaybackModel::speedText() const { return shown(view().speedText); }
QString PlaybackModel::error() const { return shown(view().error); }

QString PlaybackModel::notes() const {
  QStringList notes;
  for (const std::string& note : view().notes) notes << shown(note);
  return notes.join(u' ');
}

void PlaybackModel::open(const std::string& path) {
  _playback.open(path);
  _timer.arm();
}

void PlaybackModel::close() {
  _playback.close();
  _timer.arm();
}

void PlaybackModel::giveUpOpening() {
  _playback.giveUpOpening();
  _timer.arm();
}

void PlaybackModel::playOrPause() {
  if (view().isPlaying) {
    _playback.pause();
  } else {
    _playback.play();
  }
  _timer.arm();
}

void PlaybackModel::nextSpeed() {
  const auto& speeds = Playback::kSpeeds;
  const auto* now = std::ranges::find(speeds, view().speed);
  const bool isLast = now == speeds.end() || now + 1 == speeds.end();
  _playback.setSpeed(isLast ? speeds.front() : now[1]);
  _timer.arm();
}

void PlaybackModel::jumpTo(qreal share) {
  _playback.jumpToShare(static_cast<float>(std::clamp(share, 0.0, 1.0)));
  _timer.arm();
}

void PlaybackModel::jumpToMs(qreal timeMs) {
  _playback.jumpTo(static_cast<std::uint64_t>(std::max(0.0, timeMs)));
  _timer.arm();
}

void PlaybackModel::step(qreal seconds) {
  _playback.step(std::chrono::milliseconds(static_cast<std::int64_t>(seconds * 1000)));
  _timer.arm();
}

void PlaybackModel::toNext() {
  _playback.toNextHappening();
  _timer.arm();
}

void PlaybackModel::toPrevious() {
  _playback.toPreviousHappening();
  _timer.arm();
}

}  // namespace qel
