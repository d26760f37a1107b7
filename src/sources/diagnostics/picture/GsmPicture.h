// What is known of the modem on GSM.
#pragma once

#include <cstdint>

namespace qel::diagnostics {

struct GsmPicture {};

}  // namespace qel::diagnostics
