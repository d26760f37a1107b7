#include "sources/simulated/CellChoice.h"

namespace qel::sources {
namespace {

// Handover to another carrier or technology: the serving cell is poor and the other one good
// (events A5 and B2 of 36.331, clauses 5.5.4.6 and 5.5.4.8), as margins over the least level.
constexpr double kPoorServingDb = 12;
constexpr double kGoodCarrierDb = 17;
constexpr double kFailingServingDb = 6;
constexpr double kGoodTechnologyDb = 8;

const Layer& layerOfCell(std::size_t cell) { return layerOf(cells()[cell]); }

bool sameLayer(std::size_t a, std::size_t b) { return cells()[a].layer == cells()[b].layer; }

// Ranking of the cells of a carrier (36.304, clause 5.2.4.6).
bool ranksHigher(std::size_t cell, std::size_t serving, const RadioScene& scene) {
  return scene.of(cell).levelDbm > scene.of(serving).levelDbm + kHysteresisDb;
}

// Absolute priorities of the others (36.304, clause 5.2.4.5).
bool betterByPriority(std::size_t cell, std::size_t serving, const RadioScene& scene) {
  const Layer& to = layerOfCell(cell);
  const Layer& from = layerOfCell(serving);
  const double margin = scene.marginDb(cell);
  if (to.priority > from.priority) return margin > to.highThresholdDb;
  if (to.priority < from.priority) {
    return scene.marginDb(serving) < from.servingLowDb && margin > to.lowThresholdDb;
  }
  return margin > scene.marginDb(serving) + kHysteresisDb;
}

bool handoverDue(std::size_t cell, std::size_t serving, const RadioScene& scene) {
  if (sameLayer(cell, serving)) {
    return scene.of(cell).levelDbm > scene.of(serving).levelDbm + kHandoverOffsetDb;
  }
  const double servingMargin = scene.marginDb(serving);
  const double margin = scene.marginDb(cell);
  const Layer& to = layerOfCell(cell);
  if (to.technology == layerOfCell(serving).technology) {
    // The capacity layer, not to be camped on, is not handed over to either.
    return servingMargin < kPoorServingDb && margin > kGoodCarrierDb && margin > to.lowThresholdDb;
  }
  return to.priority < layerOfCell(serving).priority && servingMargin < kFailingServingDb &&
         margin > kGoodTechnologyDb && margin > to.lowThresholdDb;
}

}  // namespace

bool suitable(std::size_t cell, const RadioScene& scene) {
  return scene.of(cell).detected && scene.marginDb(cell) > 0;
}

CellChoice::CellChoice() : _sinceMs(cells().size()) {}

void CellChoice::restart() { _sinceMs.assign(_sinceMs.size(), std::nullopt); }

std::optional<std::size_t> CellChoice::first(const RadioScene& scene) {
  std::optional<std::size_t> best;
  for (std::size_t cell = 0; cell < scene.size(); ++cell) {
    if (!suitable(cell, scene) || scene.marginDb(cell) < layerOfCell(cell).lowThresholdDb) continue;
    const auto rank = [&](std::size_t c) { return layerOfCell(c).priority; };
    if (!best || rank(cell) > rank(*best) ||
        (rank(cell) == rank(*best) && scene.of(cell).levelDbm > scene.of(*best).levelDbm)) {
      best = cell;
    }
  }
  return best;
}

template <class Condition>
std::optional<std::size_t> CellChoice::pick(const RadioScene& scene, std::uint64_t timeMs,
                                            std::uint64_t neededMs, Condition meets) {
  std::optional<std::size_t> best;
  for (std::size_t cell = 0; cell < scene.size(); ++cell) {
    if (!suitable(cell, scene) || !meets(cell)) {
      _sinceMs[cell].reset();
      continue;
    }
    if (!_sinceMs[cell]) _sinceMs[cell] = timeMs;
    if (timeMs - *_sinceMs[cell] < neededMs) continue;
    if (!best || layerOfCell(cell).priority > layerOfCell(*best).priority ||
        (layerOfCell(cell).priority == layerOfCell(*best).priority &&
         scene.marginDb(cell) > scene.marginDb(*best))) {
      best = cell;
    }
  }
  return best;
}

std::optional<std::size_t> CellChoice::idle(std::size_t serving, const RadioScene& scene,
                                            std::uint64_t timeMs) {
  // A serving cell that is lost leaves nothing to wait for.
  const std::uint64_t neededMs = suitable(serving, scene) ? kReselectionMs : 0;
  return pick(scene, timeMs, neededMs, [&](std::size_t cell) {
    if (cell == serving) return false;
    return sameLayer(cell, serving) ? ranksHigher(cell, serving, scene)
                                    : betterByPriority(cell, serving, scene);
  });
}

std::optional<std::size_t> CellChoice::connected(std::size_t serving, const RadioScene& scene,
                                                 std::uint64_t timeMs) {
  return pick(scene, timeMs, kTimeToTriggerMs, [&](std::size_t cell) {
    return cell != serving && handoverDue(cell, serving, scene);
  });
}

}  // namespace qel::sources
