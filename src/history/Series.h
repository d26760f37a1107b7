// The values of one quantity over time.
#pragma once

#include <algorithm>
#include <array>
#include <cstdint>
#include <deque>
#include <optional>
#include <utility>
#include <vector>

namespace qel {

struct Point {
  std::uint64_t timeMs = 0;
  float value = 0;
};

// Points that belong together: a line may be drawn through them, and from run to run none.
using Run = std::vector<Point>;

// Keeps every point of ten minutes and one (the mean) for every half minute of a day, or every
// point of a whole recording; what is older goes, 64 points at a time. Times that go back are taken
// as the last one.
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
  Series(Series&&) = default;
  Series& operator=(Series&&) = default;

  void add(std::uint64_t timeMs, float value) {
    const bool isUsual = timeMs - _lastMs <= kShortestSilenceMs && timeMs < _mean.endMs;
    if (!isUsual) [[unlikely]]
      return addAnew(timeMs, value);
    _lastMs = timeMs;
    push({timeMs, value, false});
  }
  // Nothing is known from here on: the next point begins a run, and a mean of its own.
  void interrupt() {
    _isInterrupted = true;
    _mean.endMs = 0;
  }

  // The runs within both times, oldest first. A silence of more than three usual distances (and of
  // five seconds) begins a run too.
  std::vector<Run> between(std::uint64_t fromMs, std::uint64_t toMs) const;
  // The newest point that is not after this time.
  std::optional<Point> last(std::uint64_t atMs) const;
  bool empty() const { return _recent.size() == 0 && _day.size() == 0; }

 private:
  // A point, and whether a run begins with it.
  struct Kept {
    Kept() = default;
    Kept(std::uint64_t timeMs, float itsValue, bool begins)
        : stamp(timeMs << 1U | static_cast<std::uint64_t>(begins)), value(itsValue) {}
    std::uint64_t timeMs() const { return stamp >> 1U; }
    bool begins() const { return (stamp & 1U) != 0; }
    std::uint64_t stamp = 0;
    float value = 0;
  };
  // Points in chunks, all of which but the last one are full.
  class Row {
   public:
    static constexpr std::size_t kChunk = 64;
    using Chunk = std::array<Kept, kChunk>;

    std::size_t size() const {
      return _chunks.size() * kChunk - static_cast<std::size_t>(_end - _next);
    }
    const Kept& operator[](std::size_t i) const { return _chunks[i / kChunk][i % kChunk]; }
    const Chunk& firstChunk() const { return _chunks.front(); }
    // Answers whether a chunk was begun.
    bool push(const Kept& point) {
      const bool isFull = _next == _end;
      if (isFull) beginChunk();
      *_next++ = point;
      return isFull;
    }
    void dropFirstChunk() { _chunks.pop_front(); }
    // How many are not after this time.
    std::size_t until(std::uint64_t timeMs) const;

   private:
    void beginChunk();

    std::deque<Chunk> _chunks;
    Kept* _next = nullptr;  // within the last chunk
    Kept* _end = nullptr;
  };
  // The mean of a half minute that is not over.
  struct Mean {
    std::uint64_t fromMs = 0;
    std::uint64_t endMs = 0;  // of the half minute; 0: of an interrupted one
    double sum = 0;
    std::uint32_t count = 0;
    bool begins = false;

    // Stands in the middle of its points' time.
    Kept point(std::uint64_t lastMs) const;
  };

  static constexpr std::uint64_t kShortestSilenceMs = 5000;

  // A point that is not one of many.
  void addAnew(std::uint64_t timeMs, float value);
  void push(const Kept& point) {
    if (_recent.push(point)) [[unlikely]]
      dropOld();
    _mean.sum += point.value;
    ++_mean.count;
  }
  bool isSilence(std::uint64_t distanceMs) const;
  void dropOld();
  bool isCutOffFromMeans() const;
  void beginMean(std::uint64_t timeMs);

  Limits _limits;
  Row _recent;
  Row _day;  // of all points, those above too
  Mean _mean;
  std::uint64_t _lastMs = 0;
  bool _isInterrupted = true;
};

}  // namespace qel
