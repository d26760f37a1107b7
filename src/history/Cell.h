// A serving cell, as far as its report names it.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "radio/Technology.h"

namespace qel {

struct Cell {
  Technology technology = Technology::lte;
  std::optional<std::uint32_t> channel;  // EARFCN, UARFCN or ARFCN of the downlink
  std::optional<std::uint32_t> code;     // PCI, primary scrambling code or BSIC
  std::optional<std::uint32_t> cellId;   // ECI, 28 bits of UTRAN, or CI
  std::optional<std::uint32_t> area;     // TAC or LAC
  std::string mcc;                       // with all its digits; empty: not told
  std::string mnc;

  // Whether both are one cell: technology, channel, code and identity.
  bool isSameAs(const Cell& other) const;
};

}  // namespace qel
