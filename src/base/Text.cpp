#include "base/Text.h"

#include <cstring>
#include <limits>

#include "base/FatalError.h"

namespace qel {

Text::Text(std::string_view copied) {
  if (copied.empty()) return;
  if (copied.size() > std::numeric_limits<std::uint32_t>::max()) {
    fatalError("text longer than 4 GiB");
  }
  void* characters = SmallBlocks::take(copied.size());
  std::memcpy(characters, copied.data(), copied.size());
  _data = static_cast<const char*>(characters);
  _size = static_cast<std::uint32_t>(copied.size());
  _owned = 1;
}

}  // namespace qel
