// What is known of the modem on LTE.
#pragma once

#include <optional>
#include <vector>

#include "sources/diagnostics/picture/LteCells.h"

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

  // A cell that somebody else measured, for instance the phone in a report to the network.
  void noteNeighbour(const LteNeighbour& neighbour) { neighbours.note(neighbour); }
};

}  // namespace qel::diagnostics
