// Lets the application's event loop do the work of the main queue and the main run loop.
#pragma once

#include <QtCore/QObject>
#include <QtCore/QTimer>
#include <memory>

namespace qel {

// One, made in the GUI thread after the application object and gone before it. Work posted from
// any thread is done in the GUI thread, in bursts short enough to keep the window alive.
class QuickRunLoop final : public QObject {
  Q_OBJECT

 public:
  QuickRunLoop();
  ~QuickRunLoop() override;

 signals:
  // Work of the main queue was done.
  void worked();

 protected:
  void customEvent(QEvent* event) override;

 private:
  class Doorbell;

  void arm();
  void fire();

  std::shared_ptr<Doorbell> _doorbell;
  QTimer _timer;
};

}  // namespace qel
