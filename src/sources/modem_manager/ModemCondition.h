// How it is with the modem, from what ModemManager tells.
#pragma once

#include <optional>

#include "sources/SourceCondition.h"
#include "sources/modem_manager/BusValues.h"
#include "sources/modem_manager/ObjectTree.h"

namespace qel::sources {

SourceCondition noBusCondition();

// Without a modem: why there is none. `wished`: a certain one is watched for. Nothing while
// ModemManager has not answered yet.
std::optional<SourceCondition> conditionWithoutModem(ObjectTree::Manager manager, bool wished);

SourceCondition conditionOf(const BusInterfaces& modem);

}  // namespace qel::sources
