// The scales by which the quantities of reception are judged. Their numbers stand in the schemas.
#pragma once

#include <cstdint>

#include "messages/catalogue/FieldFacts.h"

namespace qel {

enum class Scale : std::uint8_t { rsrp, rsrq, sinr, rscp, ecno, rxlev };

const QualityScale& scaleOf(Scale scale);

}  // namespace qel
