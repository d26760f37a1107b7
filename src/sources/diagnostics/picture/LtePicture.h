// What is known of the modem on LTE.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "sources/diagnostics/picture/LteCells.h"
#include "sources/diagnostics/picture/LteConnection.h"
#include "sources/diagnostics/picture/LteRules.h"

namespace qel::diagnostics {

// Whether a log that comes can be read. A modem writes each in one version.
enum class LteLogState : std::uint8_t { notSeen, isRead, isUnread };

struct LtePicture {
  std::optional<LteServingCell> serving;
  std::optional<LteCellName> camped;  // by the latest packet that names the cell in use
  // Likewise of those that measure: a command to go elsewhere comes before the last measurements
  // here.
  std::optional<LteCellName> measuredFrom;
  std::optional<LteBroadcast> broadcast;
  std::optional<LteSignal> signal;  // of the primary carrier
  std::optional<LteLevel> level;    // likewise, by other logs
  // Where it is unread, others stand in for it as far as they can.
  LteLogState servingLog = LteLogState::notSeen;
  LteNeighbours neighbours;
  std::vector<SecondaryCarrier> carriers;
  bool carriersTold = false;  // the network has: that there are none is known
  LteTransmissions pusch;
  LteTransmissions pucch;
  LteConnection connection;
  std::optional<LteRules> rules;

  // What the serving cell says of itself, where the modem's log of it is unread; else null.
  const LteRules* serverUnread() const {
    const bool standsIn = servingLog == LteLogState::isUnread && rules && rules->sib1;
    return standsIn && rules->cell == camped ? &*rules : nullptr;
  }

  // The phone measures, and so is, on that cell.
  void measureFrom(const LteCellName& cell) {
    measuredFrom = cell;
    camp(cell);
  }

  // A cell that somebody else measured, for instance the phone in a report to the network.
  void noteNeighbour(const LteNeighbour& neighbour) { neighbours.note(neighbour); }

  // The phone is on that cell: what was known of the one before holds no longer.
  void camp(const LteCellName& cell) {
    if (camped == cell) return;
    camped = cell;
    if (serving && serving->name != cell) serving.reset();
    if (signal && signal->cell != cell) signal.reset();
    if (rules && rules->cell != cell) rules.reset();
    level.reset();
    if (carriers.empty()) carriersTold = false;
    connection.others.cells.clear();
  }
};

}  // namespace qel::diagnostics
