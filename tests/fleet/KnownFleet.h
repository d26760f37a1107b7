// Three phones of which everything is known, as they send it.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace qel::testing {

struct PhoneMessages {
  std::string topic;
  std::string lines;
};

// From that time on, in seconds since 1970: phones "a" and "b" go from cell 1217 (PCI 217) to 1218
// (PCI 218) after three minutes, "a" while it is connected and "b" of its own choice, and "a" is
// rejected; "c" sends one report at `nowS`. Those that came twice are told apart by their numbers.
std::vector<PhoneMessages> knownFleet(std::int64_t startS, std::int64_t nowS);
inline constexpr long kKnownEvents = 18;

}  // namespace qel::testing
