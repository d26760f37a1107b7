// Requests to the service, as its clients make them.
#pragma once

#include <map>
#include <string>

#include "base/Bytes.h"
#include "harness/Proxy.h"

namespace qel::trials {

using Request = std::map<std::string, sdbus::Variant>;

Request installRequest(std::int64_t application, const Bytes& payload);

// What the viewer asks for.
Bytes viewersConfiguration();
// A configuration with so many metrics, four at most, or triggers.
Bytes configurationOfMetrics(std::size_t count);
Bytes configurationOfTriggers(std::uint32_t count);
// A payload whose fields have the numbers of metrics.
Bytes payloadOfMetricTags(std::size_t size);

}  // namespace qel::trials
