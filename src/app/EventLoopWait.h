// Waits for the service's answer without letting the window stand still.
#pragma once

#include <QtCore/QEventLoop>
#include <chrono>
#include <mutex>
#include <optional>

#include "tesk/bus/BusConnector.h"

namespace qel {

// wait() in the GUI thread: its events are handled meanwhile. The thread waits no longer once the
// application is told to quit, or when its patience, if it has an end, is over.
class EventLoopWait final : public tesk::bus::AnswerWait {
 public:
  explicit EventLoopWait(std::optional<std::chrono::milliseconds> patience = std::nullopt);

  void wait() override;
  void wake() override;

 private:
  const std::optional<std::chrono::milliseconds> _patience;
  std::mutex _mutex;
  QEventLoop* _loop = nullptr;  // while it waits
  bool _woken = false;
};

}  // namespace qel
