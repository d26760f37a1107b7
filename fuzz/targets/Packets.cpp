// Packets of the event stream, as they come from a service that may be any.

#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "tesk/Constants.h"
#include "tesk/bus/EventPacket.h"

namespace qel::fuzz {
namespace {

using tesk::bus::decodeEvent;
using tesk::bus::encodeEvent;

void tryPacket(const Bytes& packet) {
  const auto event = decodeEvent(packet);
  if (!event) return;
  const auto encoded = encodeEvent(event->name, event->message);
  law(encoded.has_value(), "what came in a packet fits into one");
  const auto again = decodeEvent(*encoded);
  law(again && again->name == event->name, "a packet that was made can be read");
  law(again->message.entries() == event->message.entries(), "a packet says what was put in");
}

// Integers beyond what travels, floats, nulls and what is nested stay behind.
bool travels(const Value& value) {
  if (value.asBoolean() || value.asBytes() || value.asText()) return true;
  return value.kind() != Value::Kind::floating && value.asInt64();
}

void tryEvent(std::string_view stream, const Dictionary& entries) {
  const auto packet = encodeEvent(stream, tesk::Message(entries));
  if (!packet) return;
  law(packet->size() <= tesk::bus::kLargestPacket, "no packet is too large");
  const auto event = decodeEvent(*packet);
  law(event && event->name == stream, "every packet that is made can be read");
  Dictionary expected;
  for (const auto& [key, value] : entries) {
    if (travels(value)) expected.set(key, value);
  }
  law(event->message.entries() == expected, "what travels arrives");
}

}  // namespace

void tryInput(Input input) {
  if ((input.byte() & 1) != 0) {
    tryEvent((input.byte() & 1) != 0 ? tesk::kEventTrigger : tesk::kEventMetric, input.entries());
  } else {
    tryPacket(input.rest());
  }
}

}  // namespace qel::fuzz
