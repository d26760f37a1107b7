// Numbers as text: of OpenMetrics, or of the older form that came before it.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace prometheus {
struct MetricFamily;
}

namespace qel::fleet {

enum class NumberText : std::uint8_t {
  openMetrics,  // 1.0.0
  plain,        // text/plain, version 0.0.4
};

// What a client that says so, in the header Accept of HTTP, is to be answered with: OpenMetrics
// unless it likes text/plain better or knows no version of OpenMetrics that we do.
NumberText acceptedText(std::string_view accept);
std::string_view contentType(NumberText form);

// Gauges and counters. Each counter's name ends with _total; a gauge whose name ends with _info is
// what OpenMetrics calls an info.
std::string numberText(const std::vector<prometheus::MetricFamily>& families, NumberText form);

}  // namespace qel::fleet
