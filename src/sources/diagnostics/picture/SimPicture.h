// What is known of the modem on SIM.
#pragma once

#include <cstdint>

namespace qel::diagnostics {

struct SimPicture {};

}  // namespace qel::diagnostics
