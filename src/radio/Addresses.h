// Internet addresses as reports carry them.
#pragma once

#include <string>
#include <vector>

#include "base/Bytes.h"

namespace qel {

// As people write them: "192.0.2.17", "2001:db8::17". Four bytes are one of IPv4, sixteen one of
// IPv6, eight the end of one of IPv6 ("::1:2:3:4"), twelve and twenty one of IPv6 (or its end) and
// one of IPv4 (24.301, clause 9.9.4.9). Any other number is none.
std::vector<std::string> addressTexts(ByteView bytes);

}  // namespace qel
