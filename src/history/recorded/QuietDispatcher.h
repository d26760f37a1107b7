// A dispatcher of recorded events, aside of the one of the process.
#pragma once

#include <cstdint>
#include <memory>

#include "base/Clock.h"
#include "metrics/MetricValidator.h"

namespace qel {

// Main thread only. Has a store of its own and says nothing, neither on standard output nor in the
// system log.
class QuietDispatcher final : private Clock {
 public:
  // The observer is told of what is stored, with the time of reception as given.
  explicit QuietDispatcher(MetricObserver* observer = nullptr);

  // Whether the dispatcher can take the event: its payload can be decoded, or nobody wants it.
  static bool isReadable(const Dictionary& event);
  // Takes a metric event that is readable. Whether there is a handler for it.
  bool take(const Dictionary& event, std::uint64_t receivedMs);
  void setObserver(MetricObserver* observer) { _validator->setObserver(observer, *this); }

  const MetricStore& store() const { return *_validator; }
  void setStore(const MetricStore& store) { static_cast<MetricStore&>(*_validator) = store; }

 private:
  std::uint64_t nowMs() const override { return _receivedMs; }

  const std::shared_ptr<MetricValidator> _validator;
  std::uint64_t _receivedMs = 0;
};

}  // namespace qel
