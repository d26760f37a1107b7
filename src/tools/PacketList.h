// What was in a raw log, for people and for programs.
#pragma once

#include <string>
#include <vector>

#include "sources/diagnostics/files/RawLogEvents.h"

namespace qel::tools {

// Such as "B193/36", "event 1606".
std::string nameInShort(const diagnostics::PacketCounts::Kind& kind);

// A few lines: frames, and which packets were understood and which not.
std::vector<std::string> summaryOf(const diagnostics::RawLogEvents& events);

// The packets by code and version, each with what became of it.
std::vector<std::string> packetsAsTable(const diagnostics::RawLogEvents& events);
std::string packetsAsJson(const diagnostics::RawLogEvents& events);

}  // namespace qel::tools
