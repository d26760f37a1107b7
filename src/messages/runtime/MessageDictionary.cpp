#include "messages/runtime/MessageDictionary.h"

#include <string>

namespace qel {

Text unknownEnumText(std::int32_t value) { return "(unknown: " + std::to_string(value) + ")"; }

}  // namespace qel
