// What a modem answers to requests, each from a packet that Request::answerIn has found good.
#pragma once

#include <optional>
#include <string>

#include "base/Bytes.h"
#include "sources/diagnostics/requests/LogMask.h"

namespace qel::diagnostics {

// Texts are printable ASCII of at most 64 characters; nothing in them tells one modem from another
// of its kind. Nothing from a packet that is too short.
struct ModemVersion {
  std::string compiled;  // date and time
  std::string model;
};
std::optional<ModemVersion> versionIn(ByteView answer);

struct ModemBuild {
  std::uint32_t chip = 0;  // the maker's number of the chip and its revision
  std::string build;
  std::string model;
};
std::optional<ModemBuild> buildIn(ByteView answer);

std::optional<LogRanges> rangesIn(ByteView answer);

// Whether that mask is set, as far as the answer goes.
bool saysMask(ByteView answer, const LogMask& mask);

}  // namespace qel::diagnostics
