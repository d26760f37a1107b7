// What is known of the modem on NAS.
#pragma once

#include <cstdint>

namespace qel::diagnostics {

struct NasPicture {};

}  // namespace qel::diagnostics
