#include "sources/modem_manager/CellList.h"

#include <algorithm>
#include <iterator>
#include <utility>

#include "sources/modem_manager/CellReadings.h"

namespace qel::sources {
namespace {

constexpr std::size_t kMostCells = 256;

}  // namespace

// Cell by cell: a dictionary as the bus library holds it is a hundred times what is kept of it.
std::vector<CellReading> cellsIn(sdbus::Message& reply) {
  std::vector<CellReading> serving;
  std::vector<CellReading> others;
  reply.enterContainer("a{sv}");
  for (BusProperties cell; reply >> cell; cell.clear()) {
    auto reading = cellReading(cell);
    if (!reading) continue;
    auto& list = reading->serving || reading->secondary ? serving : others;
    if (list.size() < kMostCells) list.push_back(std::move(*reading));
  }
  reply.clearFlags();
  reply.exitContainer();
  others.resize(std::min(others.size(), kMostCells - serving.size()));
  std::ranges::move(others, std::back_inserter(serving));
  return serving;
}

}  // namespace qel::sources
