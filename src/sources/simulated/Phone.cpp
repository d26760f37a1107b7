#include "sources/simulated/Phone.h"

#include <array>

#include "sources/Metrics.h"

namespace qel::sources {
namespace {

constexpr double kLeastSinrDb = -8;

// What a new serving cell makes the phone report, by technology.
constexpr std::array kLteCellMetrics = {metric::kLteScellInfo, metric::kLteSelRes,
                                        metric::kLteCarrierAggregation,
                                        metric::kLteComponentCarriers};
constexpr std::array kUmtsCellMetrics = {metric::kUmtsCellInfo, metric::kUmtsSelRes,
                                         metric::kUmtsRrcConfig};
constexpr std::array kGsmCellMetrics = {metric::kGsmScellInfo, metric::kGsmIdleConfig,
                                        metric::kGsmGprsConfig};

std::span<const std::uint32_t> cellMetrics(Technology technology) {
  switch (technology) {
    case Technology::lte:
      return kLteCellMetrics;
    case Technology::umts:
      return kUmtsCellMetrics;
    case Technology::gsm:
      return kGsmCellMetrics;
  }
  return {};
}

}  // namespace

bool radioUsable(std::size_t cell, const RadioScene& scene) {
  if (!suitable(cell, scene)) return false;
  return layerOf(cells()[cell]).technology != Technology::lte || scene.sinrDb(cell) > kLeastSinrDb;
}

Phone::Phone(std::uint64_t seed, const RadioScene& scene, std::uint64_t timeMs)
    : _serving(CellChoice::first(scene).value_or(0)),
      _traffic(seed, timeMs),
      _connection(technology(), timeMs),
      _registration(seed, serving()) {}

void Phone::change(std::size_t cell, std::uint64_t timeMs, Changes& changes) {
  const Technology before = technology();
  const bool wasConnected = _connection.connected();
  _aggregation.drop(changes);
  _serving = cell;
  _choice.restart();
  changes.triggers.push_back(wasConnected ? Trigger::handover : Trigger::cellChange);
  if (technology() != before) {
    changes.triggers.push_back(Trigger::technologyChange);
    _connection.moveTo(technology(), timeMs, changes);
    changes.report(metric::kBearers);
  } else if (wasConnected && technology() == Technology::lte) {
    changes.report(metric::kLteCdrxConfig);
  }
  for (const std::uint32_t metric : cellMetrics(technology())) changes.report(metric);
  _registration.camp(serving(), changes);
}

void Phone::chooseCell(const RadioScene& scene, std::uint64_t timeMs, Changes& changes) {
  if (_connection.connected()) {
    if (const auto target = _choice.connected(_serving, scene, timeMs)) {
      change(*target, timeMs, changes);
    }
  } else if (_connection.recovering() && !suitable(_serving, scene)) {
    const auto target = CellChoice::first(scene);
    const bool onLte = target && layerOf(cells()[*target]).technology == Technology::lte;
    if (onLte && *target != _serving) change(*target, timeMs, changes);
  } else if (_connection.idle()) {
    if (const auto target = _choice.idle(_serving, scene, timeMs)) change(*target, timeMs, changes);
  }
}

void Phone::step(const RadioScene& scene, std::uint64_t timeMs, Changes& changes) {
  const Technology before = technology();
  chooseCell(scene, timeMs, changes);
  // A change of technology is what happens to the connection in this step.
  if (technology() != before) return;
  Demand demand = _traffic.at(timeMs, scene.carM());
  const bool dataFlows = demand.purpose == Purpose::data;
  if (demand.purpose == Purpose::none && _registration.wantsConnection()) {
    demand = {Purpose::signalling, false};
  }
  const bool wasConnected = _connection.connected();
  const bool wasInCall = inCall();
  _connection.step(demand, radioUsable(_serving, scene), timeMs, changes);
  if (!wasConnected && _connection.connected()) _registration.serviceRequested(changes);
  if (wasConnected && !_connection.connected()) _registration.released(changes);
  if (wasInCall != inCall()) changes.report(metric::kBearers);
  _registration.step(_connection.connected(), timeMs, changes);
  const bool onLte = technology() == Technology::lte;
  _aggregation.step(_serving, onLte && _connection.connected(), dataFlows, scene, timeMs, changes);
}

}  // namespace qel::sources
