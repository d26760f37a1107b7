// What cell identities and codes are made of.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "radio/Technology.h"

namespace qel {

// Of LTE, 28 bits: a base station and its sector (36.413, clause 9.2.1.38; 36.331, clause 6.3.4).
struct LteCellIdentity {
  std::uint32_t eNodeB = 0;  // 20 bits
  std::uint32_t sector = 0;  // 8 bits
};
std::optional<LteCellIdentity> lteCellIdentity(std::uint32_t eci);

// Of UMTS, 28 bits: a controller and its cell (25.401, clause 6.1.5).
struct UmtsCellIdentity {
  std::uint32_t rnc = 0;   // 12 bits
  std::uint32_t cell = 0;  // 16 bits
};
std::optional<UmtsCellIdentity> umtsCellIdentity(std::uint32_t cellId);

// Of GSM, 6 bits: the colours of the network and of the base station (23.003, clause 4.3.2).
struct StationCode {
  std::uint32_t network = 0;
  std::uint32_t station = 0;
};
std::optional<StationCode> stationCode(std::uint32_t bsic);

// "95231·4" of eNodeB and sector, "201·17" of controller and cell, "5312" of GSM. A number that has
// too many bits stands whole.
std::string cellIdText(Technology technology, std::uint32_t cellId);

}  // namespace qel
