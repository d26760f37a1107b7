// Message fields from readings: a field is set when there is a value for it.
#pragma once

#include <cstdint>
#include <optional>

namespace qel::sources {

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

}  // namespace qel::sources
