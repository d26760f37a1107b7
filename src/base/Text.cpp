#include "base/Text.h"

#include <cstring>

#include "base/FatalError.h"

namespace qel {

void Text::refuseSize() { fatalError("text longer than 4 GiB"); }

Text::Text(std::string_view copied) : _size(checkedSize(copied)) {
  if (_size == 0) return;
  char* characters = new char[_size];
  std::memcpy(characters, copied.data(), _size);
  _data = characters;
  _owned = true;
}

Text::Text(const Text& other) {
  Text copy = other._owned ? Text(other.view()) : borrowed(other.view());
  swap(copy);
}

}  // namespace qel
