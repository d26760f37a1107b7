// The values of one quantity over time.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

namespace qel {

struct Point {
  std::uint64_t timeMs = 0;
  float value = 0;
};

// Points that belong together: a line may be drawn through them, and from run to run none.
using Run = std::vector<Point>;

// Keeps every point of ten minutes and one (the mean) for every half minute of a day, or every
// point of a whole recording; what is older goes. Times that go back are taken as the last one.
class Series {
 public:
  struct Limits {
    std::uint64_t recentMs = 10 * 60 * 1000;
    std::size_t mostRecent = 65536;  // points; beyond them the oldest go to the thinned day
    std::uint64_t dayMs = 24 * 60 * 60 * 1000;
    std::uint64_t dayStepMs = 30 * 1000;
  };

  Series() = default;
  explicit Series(const Limits& limits) : _limits(limits) {}

  void add(std::uint64_t timeMs, float value);
  // Nothing is known from here on: the next point begins a run.
  void interrupt();

  // The runs within both times, oldest first. A silence of more than three usual distances (and of
  // five seconds) begins a run too.
  std::vector<Run> between(std::uint64_t fromMs, std::uint64_t toMs) const;
  // The newest point that is not after this time.
  std::optional<Point> last(std::uint64_t atMs) const;
  bool empty() const;

 private:
  Limits _limits;
};

}  // namespace qel
