// Which metrics a modem has now, and which of them are to be sent.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <optional>
#include <span>
#include <vector>

#include "base/Bytes.h"
#include "sources/EventSource.h"
#include "sources/SourceEvent.h"

namespace qel::sources {

// A metric is due when its value has changed, and again after each period for as long as it has
// one. One that changes more often than it may be sent is due once it may, with the value it has
// then. update() and clear() from one thread, query() from any.
class MetricKeeper {
 public:
  using Clock = std::chrono::steady_clock;
  using Send = std::function<void(const SourceEvent& event)>;
  // The payload of a metric with that time stamp; nothing when it has no value.
  using Build = std::function<std::optional<Bytes>(std::uint32_t metric, std::uint64_t timeMs)>;

  struct Row {
    std::uint32_t metric = 0;
    unsigned mostPerSecond = 0;  // 0: at every change
  };

  MetricKeeper(std::vector<Row> rows, std::chrono::milliseconds period)
      : _rows(std::move(rows)), _period(period) {}

  // Sends what is due, of all metrics or of some; no lock is held meanwhile.
  void update(const Build& build, std::uint64_t timeMs, Clock::time_point now, const Send& send);
  void update(std::span<const std::uint32_t> metrics, const Build& build, std::uint64_t timeMs,
              Clock::time_point now, const Send& send);
  // No metric has a value.
  void clear();
  // All that have a value are due.
  void sendAll();
  // When the first of them is due again.
  Clock::time_point due() const;
  // When the first of those may be sent that have changed too often.
  Clock::time_point waitingUntil() const;

  SourceAnswer query(std::uint32_t metric) const;

 private:
  struct Kept {
    Bytes value;  // the payload without its time
    std::optional<Clock::time_point> sentAt;
    SourceEvent event;
  };
  struct Rate {
    Clock::time_point since;
    unsigned sent = 0;  // within the second from then on
    bool waits = false;
  };

  std::optional<SourceEvent> dueOf(const Row& row, const Build& build, std::uint64_t timeMs,
                                   Clock::time_point now);
  bool maySend(const Row& row, Clock::time_point now);

  const std::vector<Row> _rows;
  const std::chrono::milliseconds _period;
  mutable std::mutex _mutex;
  std::map<std::uint32_t, Kept> _kept;  // by the 16-bit identifier
  std::map<std::uint32_t, Rate> _rates;
};

}  // namespace qel::sources
