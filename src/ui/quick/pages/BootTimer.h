// A timer whose time goes on while the device sleeps.
#pragma once

#include <QtCore/QObject>
#include <QtCore/QSocketNotifier>
#include <QtCore/QTimer>
#include <chrono>

namespace qel {

// One thread's. Calls once, as soon as the device is awake if the time came meanwhile; it wakes
// nobody from a sleep. Where the system has none to spare it counts the time awake alone.
class BootTimer final : public QObject {
  Q_OBJECT

 public:
  explicit BootTimer(QObject* parent = nullptr);
  ~BootTimer() override;

  void start(std::chrono::milliseconds wait);
  void stop();
  bool isActive() const { return _isActive; }

 signals:
  void timeout();

 private:
  void set(std::chrono::milliseconds wait);
  void fire();

  const int _descriptor;  // negative: none
  QSocketNotifier _notifier;
  QTimer _plain;
  bool _isActive = false;
};

}  // namespace qel
