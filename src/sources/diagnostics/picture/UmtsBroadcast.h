// What a UMTS cell says of itself in its system information (25.331, clause 10.2.48.8).
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

namespace qel::diagnostics {

struct UmtsFrequency {
  std::uint32_t channel = 0;  // UARFCN, EARFCN or ARFCN
  std::optional<std::uint32_t> priority;
};

// Block 1.
struct UmtsPaging {
  std::optional<std::uint32_t> cycleMs;  // the shortest of the core network's domains
};

// Block 3. Of a cell with one frequency for both directions only the access is known.
struct UmtsSelection {
  std::uint32_t cellId = 0;
  bool barred = false;
  bool fdd = true;
  std::optional<std::int32_t> intraSearchDb;
  std::optional<std::int32_t> interSearchDb;
  std::optional<std::int32_t> gsmSearchDb;
};

// Block 5.
struct UmtsPacketAccess {
  bool downlink = false;
  bool uplink = false;

  friend bool operator==(const UmtsPacketAccess&, const UmtsPacketAccess&) = default;
};

// Block 19.
struct UmtsPriorities {
  std::uint32_t own = 0;
  std::vector<UmtsFrequency> umts;
  std::vector<UmtsFrequency> gsm;
  std::vector<UmtsFrequency> lte;
};

// A block and when it was read.
template <class Block>
struct UmtsBlock {
  Block block;
  std::uint64_t timeMs = 0;
};

struct UmtsBroadcast {
  std::optional<UmtsBlock<UmtsPaging>> paging;
  std::optional<UmtsBlock<UmtsSelection>> selection;
  std::optional<UmtsBlock<UmtsPacketAccess>> packetAccess;
  std::optional<UmtsBlock<bool>> fachMeasurements;  // block 11: occasions for them are defined
  std::optional<UmtsBlock<UmtsPriorities>> priorities;
};

}  // namespace qel::diagnostics
