// What must hold of LTE's plain values, whatever the bits were that they were read of.
#pragma once

#include <string>

#include "rrc/lte/Messages.h"

namespace qel::testing {

// Empty, or what no message can say.
std::string implausible(const rrc::LteMessage& message);

}  // namespace qel::testing
