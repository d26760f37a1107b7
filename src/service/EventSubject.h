// What an event of a source is about.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "sources/SourceEvent.h"

namespace qel::service {

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
std::optional<EventSubject> examineEvent(const sources::SourceEvent& event, EventFault& fault);

}  // namespace qel::service
