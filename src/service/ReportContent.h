// Whether a report has what its table draws.
#pragma once

#include <cstdint>

#include "messages/catalogue/MetricMessages.h"

namespace qel::service {

enum class ReportContent : std::uint8_t { drawable, missing, undecodable };

// Most tables ask how many rows there are. Some draw the first row of a report, or of a list in it,
// without asking: a report without it would end the viewer. An absent payload is an empty one.
ReportContent reportContent(const MetricMessage& message, ByteView payload);

}  // namespace qel::service
