// Which cell the phone should use: reselection when idle, handover when connected.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "sources/simulated/RadioScene.h"

namespace qel::sources {

// The reselection rules that all cells broadcast besides those of the layers.
inline constexpr int kHysteresisDb = 4;    // 36.304, clause 5.2.4.6
inline constexpr int kSearchIntraDb = 62;  // measured always, in effect
inline constexpr int kSearchOtherDb = 62;
inline constexpr std::uint64_t kReselectionMs = 1000;  // Treselection
inline constexpr int kHandoverOffsetDb = 3;            // event A3 (36.331, clause 5.5.4.4)
inline constexpr std::uint64_t kTimeToTriggerMs = 480;

// Remembers since when each cell has met its condition. One thread.
class CellChoice {
 public:
  CellChoice();

  // The cell to camp on after switching on: the strongest of the highest priority.
  static std::optional<std::size_t> first(const RadioScene& scene);

  // A better cell than the serving one, when one has been better for long enough.
  std::optional<std::size_t> idle(std::size_t serving, const RadioScene& scene,
                                  std::uint64_t timeMs);
  std::optional<std::size_t> connected(std::size_t serving, const RadioScene& scene,
                                       std::uint64_t timeMs);
  // A new serving cell: all conditions begin anew.
  void restart();

 private:
  template <class Condition>
  std::optional<std::size_t> pick(const RadioScene& scene, std::uint64_t timeMs,
                                  std::uint64_t neededMs, Condition meets);

  std::vector<std::optional<std::uint64_t>> _sinceMs;
};

// A cell that the phone may camp on (36.304, clause 5.2.3.2).
bool suitable(std::size_t cell, const RadioScene& scene);

}  // namespace qel::sources
