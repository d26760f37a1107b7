#include "sources/diagnostics/gsm/RestOctets.h"

namespace qel::diagnostics {

bool RestOctets::high() {
  constexpr unsigned kPadding = 0x2B;
  if (_failed || _position >= _octets.size() * 8) return false;
  const bool padding = (kPadding >> (7 - _position % 8) & 1U) != 0;
  return raw(_position++) != padding;
}

std::uint32_t RestOctets::bits(std::size_t count) {
  const std::size_t end = _octets.size() * 8;
  if (_failed || count > end - _position) {
    _failed = true;
    return 0;
  }
  std::uint32_t value = 0;
  for (std::size_t i = 0; i < count; ++i) value = value << 1 | (raw(_position++) ? 1U : 0U);
  return value;
}

void RestOctets::skip(std::size_t count) {
  if (_failed || count > _octets.size() * 8 - _position) {
    _failed = true;
  } else {
    _position += count;
  }
}

}  // namespace qel::diagnostics
