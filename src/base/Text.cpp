#include "base/Text.h"

#include <cstring>
#include <limits>

#include "base/FatalError.h"

namespace qel {
namespace {

std::uint32_t checkedSize(std::string_view text) {
  if (text.size() > std::numeric_limits<std::uint32_t>::max()) fatalError("text longer than 4 GiB");
  return static_cast<std::uint32_t>(text.size());
}

}  // namespace

Text::Text(std::string_view copied) : _size(checkedSize(copied)) {
  if (_size == 0) return;
  char* characters = new char[_size];
  std::memcpy(characters, copied.data(), _size);
  _data = characters;
  _owned = true;
}

Text Text::borrowed(std::string_view text) {
  Text result;
  result._size = checkedSize(text);
  if (result._size != 0) result._data = text.data();
  return result;
}

Text::Text(const Text& other) {
  Text copy = other._owned ? Text(other.view()) : borrowed(other.view());
  swap(copy);
}

void Text::release() {
  if (_owned) delete[] _data;
}

}  // namespace qel
