// The newest numbers, as they are told to whoever asks.
#pragma once

#include <chrono>
#include <cstdint>
#include <map>
#include <mutex>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace prometheus {
struct MetricFamily;
}

namespace qel::fleet {

// Times are of a clock that does not jump. Any thread.
class NumberBoard {
 public:
  using Labels = std::vector<std::pair<std::string, std::string>>;  // name and value
  using Numbers = std::map<Labels, double>;

  static constexpr std::size_t kMostSeries = 64;    // of a family; more are left out and counted
  static constexpr std::size_t kMostMetrics = 256;  // counted by name; the others as "other"

  // A family whose newest report is older is told no more.
  explicit NumberBoard(std::chrono::milliseconds stale);
  ~NumberBoard();

  // What the report of that time says of the family, in the place of what was said before.
  void set(std::string_view family, std::string_view help, Numbers numbers, std::uint64_t timeMs);
  void drop(std::string_view family);

  void countReport(std::string_view metric, std::uint64_t timeMs);
  void countHappening(std::string_view kind);
  void countUndecodable();
  void countDropped();

  std::vector<prometheus::MetricFamily> families(std::uint64_t nowMs) const;

 private:
  struct Family {
    std::string help;
    Numbers numbers;
    std::uint64_t timeMs = 0;
  };
  struct Reports {
    std::uint64_t count = 0;
    std::uint64_t lastMs = 0;
  };

  const std::uint64_t _staleMs;
  mutable std::mutex _mutex;
  std::map<std::string, Family, std::less<>> _families;
  std::map<std::string, Reports, std::less<>> _reports;
  std::map<std::string, std::uint64_t, std::less<>> _happenings;
  std::uint64_t _undecodable = 0;
  std::uint64_t _dropped = 0;
  std::uint64_t _leftOut = 0;
};

}  // namespace qel::fleet
