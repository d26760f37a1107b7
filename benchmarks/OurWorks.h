// What is measured of our own code.
#pragma once

#include "Works.h"
#include "base/Value.h"

namespace qel::bench {

Step decodeOurs(const std::vector<Payload>& payloads);
Step dictionaryOurs(const std::vector<Payload>& payloads);
Step encodeOurs(const std::vector<Payload>& payloads);
Step textOurs(const std::vector<Payload>& payloads);
Step timeOurs(const std::vector<Payload>& payloads);
Step eventOurs(const std::vector<Payload>& payloads);
// The same, and every list of the screens is looked at after each event.
Step eventLookedAt(const std::vector<Payload>& payloads);
// The first with a history that listens, at 100 events a second.
Step eventWithHistory(const std::vector<Payload>& payloads);

// When each was reported, in milliseconds; those that do not say so, at the start of a drawn mix.
std::vector<std::uint64_t> timesOf(const std::vector<Payload>& payloads);

// A metric event as the service sends it.
Dictionary eventOf(const Payload& payload);

}  // namespace qel::bench
