// What the service counts itself.
#pragma once

#include <chrono>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

#include "tesk/bus/ServiceStatus.h"

namespace prometheus {
struct MetricFamily;
}

namespace qel::fleet {

// Of a service that has answered so, or has not.
std::vector<prometheus::MetricFamily> serviceFamilies(
    const std::optional<tesk::bus::ServiceStatus>& status);

// Asks the service once a second at most, however often it is asked itself. Any thread; waits a few
// seconds at most for an answer.
class ServiceCounts {
 public:
  explicit ServiceCounts(std::string bus);
  ~ServiceCounts();

  void addTo(std::vector<prometheus::MetricFamily>& families);

 private:
  using Clock = std::chrono::steady_clock;

  const std::string _bus;
  std::mutex _mutex;
  Clock::time_point _next;
  std::vector<prometheus::MetricFamily> _newest;
};

}  // namespace qel::fleet
