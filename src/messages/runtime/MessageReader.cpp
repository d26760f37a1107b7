#include "messages/runtime/MessageReader.h"

#include <cstdio>

namespace qel {

void logUnknownTag(std::uint32_t fieldNumber, std::uint32_t value) {
  std::array<char, 48> line;
  const int length =
      std::snprintf(line.data(), line.size(), "Unknown tag: %x:%u", fieldNumber, value);
  systemLog().write({line.data(), static_cast<std::size_t>(length)});
}

}  // namespace qel
