// Message fields from readings: a field is set when there is a value for it.
#pragma once

#include <optional>

#include "service/sources/modem_manager/ModemPicture.h"

namespace qel::service {

template <class Message, class Field, class Value>
void set(Message& message, void (Message::*setter)(Field), const std::optional<Value>& value) {
  if (value) (message.*setter)(static_cast<Field>(*value));
}

// Of an index of the reports, from a value in dBm or dB.
template <class Message, class Field>
void set(Message& message, void (Message::*setter)(Field), const std::optional<double>& value,
         std::uint32_t (*indexOf)(double)) {
  if (value) (message.*setter)(static_cast<Field>(indexOf(*value)));
}

// The serving cell, when the phone is on that technology and it is known.
inline const CellReading* servingOn(Technology technology, const ModemPicture& modem) {
  return modem.technology == technology && modem.serving ? &*modem.serving : nullptr;
}

// Whether there is anything by which to tell the cell.
inline bool isNamed(const CellReading& cell) { return cell.channel || cell.code || cell.cellId; }

}  // namespace qel::service
