// Cells of a modem into messages.
#pragma once

#include <optional>
#include <type_traits>

#include "sources/modem_manager/ModemPicture.h"

namespace qel::sources {

// The serving cell, when the phone is on that technology and it is known.
inline const CellReading* servingOn(Technology technology, const ModemPicture& modem) {
  return modem.technology == technology && modem.serving ? &*modem.serving : nullptr;
}

// How a message takes a neighbour of each technology; null: not at all.
template <class Message>
struct NeighbourAdders {
  void (*lte)(const CellReading& cell, Message& message);
  void (*umts)(const CellReading& cell, Message& message);
  void (*gsm)(const CellReading& cell, Message& message);
};

template <class Message>
void addNeighbours(const ModemPicture& modem, Message& message,
                   const std::type_identity_t<NeighbourAdders<Message>>& adders) {
  for (const CellReading& cell : modem.neighbours) {
    // Without any of them there is nothing by which to tell the cell.
    if (!cell.channel && !cell.code && !cell.cellId) continue;
    const auto add = cell.technology == Technology::lte    ? adders.lte
                     : cell.technology == Technology::umts ? adders.umts
                                                           : adders.gsm;
    if (add) add(cell, message);
  }
}

}  // namespace qel::sources
