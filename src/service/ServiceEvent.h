// An event on its way from a source to the clients.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "base/Value.h"

namespace qel::service {

struct ServiceEvent {
  std::uint64_t timeMs = 0;  // of the source, since 1970-01-01 00:00 UTC
  std::string_view stream;   // tesk::kEventMetric or tesk::kEventTrigger
  Dictionary entries;
};

// What an event is about: a metric by its 16-bit identifier, or a trigger.
struct EventSubject {
  bool isMetric = false;
  std::int64_t identifier = 0;
};

// Why an event goes to nobody.
struct EventFault {
  bool withoutContent = false;  // a report from which a table would draw what is not in it
  std::string reason;           // one line
};

// The subject of an event that a client can make sense of and draw: identifiers in place, and the
// payload of a metric with a message class decodable and with content. A metric without a payload
// is an empty message. Else nothing, and `fault` says what is wrong.
std::optional<EventSubject> examineEvent(const ServiceEvent& event, EventFault& fault);

}  // namespace qel::service
