// Carrier aggregation: the secondary cells of an LTE connection.
#pragma once

#include <cstdint>
#include <vector>

#include "sources/simulated/Changes.h"
#include "sources/simulated/RadioScene.h"

namespace qel::sources {

struct SecondaryCell {
  std::size_t cell;
  bool activated;
  std::uint64_t sinceMs;  // of the state
};

// At most two, those of the same mast and direction as the primary cell: configured after a second
// of data, active while data flows, gone with the connection or the primary cell.
class Aggregation {
 public:
  void step(std::size_t primary, bool connected, bool dataFlows, const RadioScene& scene,
            std::uint64_t timeMs, Changes& changes);
  void drop(Changes& changes);
  const std::vector<SecondaryCell>& cells() const { return _cells; }

 private:
  void configure(std::size_t primary, const RadioScene& scene, std::uint64_t timeMs);

  std::vector<SecondaryCell> _cells;
  std::uint64_t _dataSinceMs = 0;  // 0: no data flows
  std::uint64_t _dataUntilMs = 0;
};

}  // namespace qel::sources
