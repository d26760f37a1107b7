#include "sources/diagnostics/PacketTable.h"

#include <initializer_list>
#include <span>

#include "sources/diagnostics/gsm/GsmTables.h"
#include "sources/diagnostics/lte/LteTables.h"
#include "sources/diagnostics/nas/NasTables.h"
#include "sources/diagnostics/sim/SimTables.h"
#include "sources/diagnostics/umts/UmtsTables.h"

namespace qel::diagnostics {
namespace {

template <class Row, class Key>
const Row* find(std::initializer_list<std::span<const Row>> tables, Key Row::*key, Key wanted) {
  for (const auto table : tables) {
    for (const Row& row : table) {
      if (row.*key == wanted) return &row;
    }
  }
  return nullptr;
}

}  // namespace

const LogRow* findLog(std::uint16_t code) {
  return find({lteLogs(), umtsLogs(), gsmLogs(), nasLogs(), simLogs()}, &LogRow::code, code);
}

const EventRow* findEvent(std::uint16_t id) {
  return find({lteEvents(), umtsEvents(), gsmEvents(), nasEvents(), simEvents()}, &EventRow::id,
              id);
}

const ReportRow* findReport(std::uint32_t metric) {
  return find({lteReports(), umtsReports(), gsmReports(), nasReports(), simReports()},
              &ReportRow::metric, metric);
}

}  // namespace qel::diagnostics
