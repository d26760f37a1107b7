// What is known of the modem on LTE.
#pragma once

#include <optional>
#include <vector>

#include "sources/diagnostics/picture/LteCells.h"
#include "sources/diagnostics/picture/LteConnection.h"
#include "sources/diagnostics/picture/LteRules.h"

namespace qel::diagnostics {

struct LtePicture {
  std::optional<LteServingCell> serving;
  std::optional<LteCellName> camped;  // by the latest packet that names the cell in use
  std::optional<LteBroadcast> broadcast;
  std::optional<LteSignal> signal;  // of the primary carrier
  LteNeighbours neighbours;
  std::vector<SecondaryCarrier> carriers;
  LteTransmissions pusch;
  LteTransmissions pucch;
  LteConnection connection;
  std::optional<LteRules> rules;

  // A cell that somebody else measured, for instance the phone in a report to the network.
  void noteNeighbour(const LteNeighbour& neighbour) { neighbours.note(neighbour); }

  // The phone is on that cell: what was known of the one before holds no longer.
  void camp(const LteCellName& cell) {
    if (camped == cell) return;
    camped = cell;
    if (serving && serving->name != cell) serving.reset();
    connection.others.cells.clear();
  }
};

}  // namespace qel::diagnostics
