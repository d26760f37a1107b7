// What every scenario works with: its options, its dice and its figures.
#pragma once

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <optional>
#include <random>
#include <stdexcept>
#include <string>
#include <vector>

namespace qel::trials {

using Clock = std::chrono::steady_clock;
using std::chrono::milliseconds;

// A promise that was not kept; the text names it.
class BrokenPromise : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// Something that the machine does not let us try; the text says what.
class NotPossibleHere : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

inline void promise(bool kept, const std::string& what) {
  if (!kept) throw BrokenPromise(what);
}

struct Figures {
  std::uint64_t tried = 0;                   // faults done
  std::optional<milliseconds> back;          // longest until values were seen again
  std::optional<milliseconds> wait;          // longest that another client waited for its answer
  std::optional<milliseconds> busWait = {};  // of that, when only the bus was asked
  std::uint64_t memoryKb = 0;                // most that a service has had resident
  std::vector<std::string> remarks;

  void sawBack(milliseconds time) { back = std::max(back.value_or(time), time); }
  void sawWait(milliseconds time) { wait = std::max(wait.value_or(time), time); }
  void sawBusWait(milliseconds time) { busWait = std::max(busWait.value_or(time), time); }
  void sawMemory(std::uint64_t kb) { memoryKb = std::max(memoryKb, kb); }
};

// One thread's. The same seed gives the same choices, not the same timing.
struct Trial {
  Trial(std::uint64_t seed, int wantedTimes, double allowance)
      : random(seed), times(wantedTimes), slack(allowance) {}

  std::mt19937_64 random;
  const int times;
  const double slack;  // by how much every deadline is stretched, on a machine with other work
  Figures figures;

  int below(int end) { return static_cast<int>(random() % static_cast<std::uint64_t>(end)); }
  milliseconds stretched(milliseconds time) const {
    return std::chrono::duration_cast<milliseconds>(time * slack);
  }
};

struct Scenario {
  const char* name;
  const char* what;
  int times;       // in a whole round
  int quickTimes;  // in a short one; 0: not part of it
  void (*run)(Trial& trial);
};

}  // namespace qel::trials
