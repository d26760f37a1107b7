// A client's sink that keeps its events, from whatever thread they come.
#pragma once

#include <chrono>
#include <condition_variable>
#include <functional>
#include <mutex>
#include <string>
#include <vector>

#include "base/Value.h"
#include "tesk/Constants.h"
#include "tesk/Transport.h"

namespace qel::testing {

class EventLog {
 public:
  struct Event {
    std::string stream;
    Dictionary entries;
  };

  tesk::EventSink sink() {
    return [this](std::string_view stream, tesk::Message event) {
      {
        const std::lock_guard lock(_mutex);
        _events.push_back({std::string(stream), event.entries()});
      }
      _changed.notify_all();
      if (whileDelivered) whileDelivered();
    };
  }

  // Runs on the delivering thread, inside the delivery.
  std::function<void()> whileDelivered;

  std::vector<Event> events() const {
    const std::lock_guard lock(_mutex);
    return _events;
  }
  std::size_t count() const { return events().size(); }

  // The 16-bit identifiers of the metric events.
  std::vector<std::int64_t> metrics() const {
    std::vector<std::int64_t> all;
    for (const Event& event : events()) {
      if (event.stream != tesk::kEventMetric) continue;
      all.push_back(*event.entries.find(tesk::kKeyMetricID)->asInt64() - 0x3C0000);
    }
    return all;
  }

  bool waitFor(std::size_t count) const {
    std::unique_lock lock(_mutex);
    return _changed.wait_for(lock, std::chrono::seconds(30),
                             [&] { return _events.size() >= count; });
  }

 private:
  mutable std::mutex _mutex;
  mutable std::condition_variable _changed;
  std::vector<Event> _events;
};

}  // namespace qel::testing
