#include "app/BatchedOutput.h"

#include <unistd.h>

#include <chrono>

#include "base/DispatchQueue.h"

namespace qel {

BatchedOutput::BatchedOutput() : _self(std::make_shared<BatchedOutput*>(this)) {
  _timer.setSingleShot(true);
  QObject::connect(&_timer, &QTimer::timeout, &_timer, [this] { flushWhenDue(); });
  const auto lineWaits = [weak = std::weak_ptr(_self)] {
    MainQueue::shared().async([weak] {
      if (const auto output = weak.lock()) (*output)->flushWhenDue();
    });
  };
  _sink = std::make_shared<BatchingSink>(STDOUT_FILENO, lineWaits,
                                         BatchingSink::SlowReader::losesLines);
  setStandardOutput(_sink);
}

// Lines that come later are written when the process ends.
BatchedOutput::~BatchedOutput() { _sink->flush(); }

void BatchedOutput::flushWhenDue() {
  using std::chrono::milliseconds;
  const auto now = BatchingSink::Clock::now();
  const auto due = _sink->flushWhenDue(now);
  if (due) _timer.start(std::chrono::ceil<milliseconds>(*due - now));
}

}  // namespace qel
