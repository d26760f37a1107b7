// Points in time for people, spreadsheets and databases.
#pragma once

#include <cstdint>
#include <string>

namespace qel {

// "2017-07-14T02:40:00.000Z" (ISO 8601, UTC) from milliseconds since 1970-01-01 00:00 UTC. Beyond
// the year 9999 the number as it is.
std::string isoTime(std::uint64_t milliseconds);

}  // namespace qel
