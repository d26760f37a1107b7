#include "base/PollTimeout.h"

#include <algorithm>

namespace qel {

int pollTimeout(std::optional<std::chrono::steady_clock::time_point> moment) {
  using namespace std::chrono;
  if (!moment || *moment == steady_clock::time_point::max()) return -1;
  const auto left = ceil<milliseconds>(*moment - steady_clock::now());
  return static_cast<int>(std::clamp<milliseconds>(left, 0ms, 24h).count());
}

int shorterTimeout(int one, int other) {
  if (one < 0) return other;
  return other < 0 ? one : std::min(one, other);
}

}  // namespace qel
