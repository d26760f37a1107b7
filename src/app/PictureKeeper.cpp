#include "app/PictureKeeper.h"

#include <QtCore/QSaveFile>
#include <chrono>
#include <utility>

#include "base/TerminalText.h"

namespace qel {
namespace {

constexpr std::chrono::seconds kShortestInterval{1};

}  // namespace

PictureKeeper::PictureKeeper(QQuickWindow& window, QString file)
    : _window(window), _file(std::move(file)) {
  _timer.setSingleShot(true);
  connect(&_timer, &QTimer::timeout, this, [this] { keep(); });
  connect(
      &_window, &QQuickWindow::frameSwapped, this, [this] { frameShown(); }, Qt::QueuedConnection);
}

void PictureKeeper::frameShown() {
  if (_grabbing || _timer.isActive()) return;
  _timer.start(_kept.isNull() ? std::chrono::seconds(0) : kShortestInterval);
}

void PictureKeeper::keep() {
  _grabbing = true;
  QImage picture = _window.grabWindow();
  _grabbing = false;
  if (picture.isNull() || picture == _kept) return;
  QSaveFile file(_file);
  const bool written =
      file.open(QIODevice::WriteOnly) && picture.save(&file, "PNG") && file.commit();
  if (!written && !std::exchange(_complained, true)) {
    complain("qelwatch", (_file + ": " + file.errorString()).toStdString());
  }
  _kept = std::move(picture);
}

}  // namespace qel
