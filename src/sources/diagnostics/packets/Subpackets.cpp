#include "sources/diagnostics/packets/Subpackets.h"

#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {

Subpacket findSubpacket(ByteView body, std::uint8_t id) {
  constexpr std::size_t kHead = 4;  // of the packet, and of each part
  if (body.size() < kHead) return {};
  if (body[0] != 1) return {Outcome::unknownVersion, 0, {}};
  std::size_t left = body[1];
  ByteView rest = body.subspan(kHead);
  for (; left > 0; --left) {
    if (rest.size() < kHead) return {};
    const std::size_t length = u16At(rest, 2);
    if (length < kHead || length > rest.size()) return {};
    if (rest[0] == id) {
      return {Outcome::understood, rest[1], rest.subspan(kHead, length - kHead)};
    }
    rest = rest.subspan(length);
  }
  return {Outcome::notOurs, 0, {}};
}

}  // namespace qel::diagnostics
