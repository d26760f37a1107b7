#include "sources/simulated/Aggregation.h"

#include "sources/Metrics.h"

namespace qel::sources {
namespace {

constexpr std::size_t kMostCells = 2;
constexpr std::uint64_t kConfigureAfterMs = 400;
constexpr std::uint64_t kActivateAfterMs = 400;
constexpr std::uint64_t kDeactivateAfterMs = 1280;  // sCellDeactivationTimer (36.331, 6.3.2)
constexpr double kLeastDbm = -116;

void tell(Changes& changes) {
  changes.triggers.push_back(Trigger::carriersChanged);
  changes.report(metric::kLteCarrierAggregation);
  changes.report(metric::kLteComponentCarriers);
}

}  // namespace

void Aggregation::drop(Changes& changes) {
  _dataSinceMs = 0;
  if (_cells.empty()) return;
  _cells.clear();
  tell(changes);
}

void Aggregation::configure(std::size_t primary, const RadioScene& scene, std::uint64_t timeMs) {
  const Cell& own = sources::cells()[primary];
  for (std::size_t i = 0; i < scene.size() && _cells.size() < kMostCells; ++i) {
    const Cell& cell = sources::cells()[i];
    if (i == primary || cell.site != own.site || cell.sector != own.sector) continue;
    if (layerOf(cell).technology != Technology::lte || scene.of(i).levelDbm < kLeastDbm) continue;
    _cells.push_back({i, false, timeMs});
  }
}

void Aggregation::step(std::size_t primary, bool connected, bool dataFlows, const RadioScene& scene,
                       std::uint64_t timeMs, Changes& changes) {
  if (!connected) {
    drop(changes);
    return;
  }
  if (dataFlows) {
    _dataUntilMs = timeMs;
    if (_dataSinceMs == 0) _dataSinceMs = timeMs;
  } else {
    _dataSinceMs = 0;
  }
  if (_cells.empty()) {
    if (!dataFlows || timeMs - _dataSinceMs < kConfigureAfterMs) return;
    configure(primary, scene, timeMs);
    if (!_cells.empty()) tell(changes);
    return;
  }
  for (SecondaryCell& cell : _cells) {
    const bool wake = !cell.activated && dataFlows && timeMs - cell.sinceMs >= kActivateAfterMs;
    const bool rest = cell.activated && timeMs - _dataUntilMs >= kDeactivateAfterMs;
    if (!wake && !rest) continue;
    cell.activated = wake;
    cell.sinceMs = timeMs;
    tell(changes);
  }
}

}  // namespace qel::sources
