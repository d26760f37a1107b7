// What an LTE cell's system information says of access and of reselection.
#pragma once

#include <optional>

#include "rrc/lte/SystemInformation.h"
#include "sources/diagnostics/picture/LteCells.h"

namespace qel::diagnostics {

// Of one cell: what another one said is gone when it speaks.
struct LteRules {
  LteCellName cell;
  std::optional<rrc::lte::Sib1> sib1;
  std::optional<rrc::lte::Sib2> sib2;
  std::optional<rrc::lte::Sib3> sib3;
  std::optional<rrc::lte::Sib5> sib5;
};

}  // namespace qel::diagnostics
