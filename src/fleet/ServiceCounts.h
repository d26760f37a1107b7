// What the service counts itself.
#pragma once

#include <chrono>
#include <mutex>
#include <string>
#include <vector>

namespace prometheus {
struct MetricFamily;
}

namespace qel::fleet {

// Asks the service once a second at most, however often it is asked itself. Any thread; waits a few
// seconds at most for an answer.
class ServiceCounts {
 public:
  explicit ServiceCounts(std::string bus);
  ~ServiceCounts();

  void addTo(std::vector<prometheus::MetricFamily>& families);

 private:
  using Clock = std::chrono::steady_clock;

  std::vector<prometheus::MetricFamily> ask() const;

  const std::string _bus;
  std::mutex _mutex;
  Clock::time_point _next;
  std::vector<prometheus::MetricFamily> _newest;
};

}  // namespace qel::fleet
