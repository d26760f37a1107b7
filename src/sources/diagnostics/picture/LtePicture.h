// What is known of the modem on LTE.
#pragma once

#include <cstdint>

namespace qel::diagnostics {

struct LtePicture {};

}  // namespace qel::diagnostics
