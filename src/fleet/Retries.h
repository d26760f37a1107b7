// When to try somebody again.
#pragma once

#include <algorithm>
#include <chrono>
#include <random>

namespace qel::fleet {

// After a second, then after twice as long each time up to the longest pause; each time some of it
// less, by chance, so that phones that lost a broker together do not come back together.
class Retries {
 public:
  using Clock = std::chrono::steady_clock;

  explicit Retries(std::chrono::seconds longest = std::chrono::minutes(5)) : _longest(longest) {}

  void failed(Clock::time_point now) {
    std::uniform_real_distribution<double> share(0.5, 1.0);
    _next = now + std::chrono::duration_cast<Clock::duration>(_pause * share(_random));
    _pause = std::min(_pause * 2, _longest);
  }
  void succeeded() { _pause = kFirst; }
  Clock::time_point next() const { return _next; }

 private:
  using Seconds = std::chrono::duration<double>;
  static constexpr Seconds kFirst{1};

  const Seconds _longest;
  std::mt19937 _random{std::random_device()()};
  Seconds _pause = kFirst;
  Clock::time_point _next;
};

}  // namespace qel::fleet
