// The values of one quantity over time.
#pragma once

#include <array>
#include <cstdint>
#include <deque>
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
  void interrupt() { _isInterrupted = true; }

  // The runs within both times, oldest first. A silence of more than three usual distances (and of
  // five seconds) begins a run too.
  std::vector<Run> between(std::uint64_t fromMs, std::uint64_t toMs) const;
  // The newest point that is not after this time.
  std::optional<Point> last(std::uint64_t atMs) const;
  bool empty() const { return _recent.empty() && _day.empty(); }

 private:
  // A point, and whether a run begins with it.
  struct Kept {
    Kept(std::uint64_t timeMs, float itsValue, bool begins)
        : stamp(timeMs << 1U | static_cast<std::uint64_t>(begins)), value(itsValue) {}
    std::uint64_t timeMs() const { return stamp >> 1U; }
    bool begins() const { return (stamp & 1U) != 0; }
    std::uint64_t stamp;
    float value;
  };
  using Row = std::deque<Kept>;
  // The mean of a half minute that is not over.
  struct Mean {
    std::uint64_t fromMs = 0;
    std::uint64_t toMs = 0;  // of its last point
    double sum = 0;
    std::uint32_t count = 0;
    bool begins = false;

    // Stands in the middle of its time.
    Kept point() const;
  };

  static Row::const_iterator firstAfter(const Row& row, std::uint64_t timeMs);
  bool isSilence(std::uint64_t distanceMs) const;
  void dropOldest();
  void finishMean();

  Limits _limits;
  Row _recent;
  Row _day;
  Mean _mean;
  bool _isInterrupted = true;
  std::array<std::uint32_t, 8> _distancesMs{};  // the last ones
  std::uint32_t _distances = 0;                 // ever seen
};

}  // namespace qel
