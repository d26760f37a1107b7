// What is known of the modem on UMTS.
#pragma once

#include <cstdint>

namespace qel::diagnostics {

struct UmtsPicture {};

}  // namespace qel::diagnostics
