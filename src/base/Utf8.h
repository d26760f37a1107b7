// Text from outside may be any bytes; text that leaves must be valid UTF-8.
#pragma once

#include <string>
#include <string_view>

namespace qel {

bool isValidUtf8(std::string_view text);

// Each byte run that is no UTF-8 (the longest start of a sequence, as Unicode recommends) becomes
// one U+FFFD.
std::string withReplacements(std::string_view text);

}  // namespace qel
