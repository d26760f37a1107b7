// The numbers of a live service, from its events onto the board.
#pragma once

#include <cstdint>
#include <optional>

#include "fleet/FieldNumbers.h"
#include "fleet/NumberBoard.h"
#include "history/History.h"
#include "history/recorded/QuietDispatcher.h"
#include "recording/RecordedEvent.h"

namespace qel::fleet {

// Main thread. What is told, besides the fields of reports: qelwatch_lte_rsrp_dbm{pci, earfcn} and
// its like of the serving cell, qelwatch_lte_neighbour_rsrp_dbm of the others, each of the cell
// that was when it was measured; qelwatch_serving_cell_info; and counts of reports and happenings.
class LatestNumbers final : private MetricObserver {
 public:
  explicit LatestNumbers(NumberBoard& board);
  ~LatestNumbers() override;

  // Its time is of a clock that does not jump.
  void take(const RecordedEvent& event);

 private:
  void metricWasStored(const StoredMetric& metric) override;
  void metricWasPassedOver(const PassedMetric& metric) override;
  void tellServing(std::uint64_t timeMs, bool hasLevels);
  void tellNeighbours(std::uint64_t timeMs);
  void countHappenings();

  NumberBoard& _board;
  const FieldNumbers _fields;
  History _history;
  QuietDispatcher _dispatcher;
  std::optional<Cell> _cell;
  std::uint64_t _happeningsTold = 0;
};

}  // namespace qel::fleet
