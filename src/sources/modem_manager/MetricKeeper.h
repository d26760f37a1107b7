// Which metrics a modem has now, and which of them are to be sent.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <optional>

#include "sources/EventSource.h"
#include "sources/SourceEvent.h"
#include "sources/modem_manager/ModemPicture.h"

namespace qel::sources {

// A metric is due when its value has changed, and again after each period for as long as it has
// one. update() from one thread, query() from any.
class MetricKeeper {
 public:
  using Clock = std::chrono::steady_clock;
  using Send = std::function<void(const SourceEvent& event)>;

  explicit MetricKeeper(std::chrono::milliseconds period) : _period(period) {}

  // Without a modem no metric has a value. Sends what is due; no lock is held meanwhile.
  void update(const std::optional<ModemPicture>& modem, std::uint64_t timeMs, Clock::time_point now,
              const Send& send);
  // All that have a value are due.
  void sendAll();
  // When the first of them is due again.
  Clock::time_point due() const;

  SourceAnswer query(std::uint32_t metric) const;

 private:
  struct Kept {
    Bytes value;  // the payload without its time
    std::optional<Clock::time_point> sentAt;
    SourceEvent event;
  };

  const std::chrono::milliseconds _period;
  mutable std::mutex _mutex;
  std::map<std::uint32_t, Kept> _kept;  // by the 16-bit identifier
};

}  // namespace qel::sources
