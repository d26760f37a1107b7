// Metrics as people name them on a command line.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace qel::tools {

// Catalogue identifiers have 16 bits; the form in events, with 0x3C0000 on top, is accepted too.
// Empty for a number that is neither.
std::optional<std::uint32_t> catalogueIdentifier(std::int64_t number);

// A metric by decimal or 0x-hexadecimal number, catalogue name or message class name. Throws a
// ToolError when there is none.
std::uint32_t parseMetric(const std::string& text);

}  // namespace qel::tools
