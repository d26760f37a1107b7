#include "ui/quick/pages/RecorderModel.h"

#include <utility>

#include "ui/quick/pages/Words.h"

namespace qel {

void RecorderModel::setControl(std::unique_ptr<RecordingControl> control) {
  _timer.reset();
  _control = std::move(control);
  _timer = std::make_unique<TickTimer<RecordingControl>>(*_control);
  _view = _control->view();
  _control->setOnChanged([this] {
    _view = _control->view();
    emit changed();
  });
  emit changed();
}

QString RecorderModel::text() const { return shown(_view.text); }
QString RecorderModel::hiddenText() const { return shown(_view.hiddenText); }
QString RecorderModel::markText() const { return shown(_view.markText); }
QString RecorderModel::outcome() const { return shown(_view.outcome); }

void RecorderModel::start() {
  if (_control) _control->start();
  arm();
}

void RecorderModel::mark() {
  if (_control) _control->mark();
  arm();
}

void RecorderModel::stop() {
  if (_control) _control->stop();
  arm();
}

void RecorderModel::arm() {
  if (_timer) _timer->arm();
}

}  // namespace qel
