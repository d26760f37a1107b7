#include "sources/diagnostics/nas/InformationElements.h"

#include <algorithm>
#include <array>

namespace qel::diagnostics {

std::uint8_t ElementReader::octet() {
  const ByteView one = value(1);
  return one.empty() ? std::uint8_t{0} : one[0];
}

ByteView ElementReader::value(std::size_t length) {
  if (_failed || length > _rest.size()) {
    _failed = true;
    return {};
  }
  const ByteView taken = _rest.first(length);
  _rest = _rest.subspan(length);
  return taken;
}

ByteView ElementReader::counted() { return value(octet()); }

ByteView ElementReader::longCounted() {
  const std::size_t upper = octet();
  return value(upper << 8 | octet());
}

std::optional<Element> OptionalElements::next() {
  const ByteView rest = _reader.rest();
  if (rest.empty() || _reader.failed()) return std::nullopt;
  const std::uint8_t first = _reader.octet();
  if ((first & 0x80) != 0) {
    return Element{static_cast<std::uint8_t>(first & 0xF0), rest.first(1)};
  }
  const auto fixed =
      std::ranges::find(_fixed, first, [](const FixedElement& e) { return e.identifier; });
  Element element{first, {}};
  if (fixed != _fixed.end()) {
    element.value = _reader.value(fixed->length);
  } else if (_protocol == Protocol::eps && (first & 0x70) == 0x70) {
    element.value = _reader.longCounted();
  } else {
    element.value = _reader.counted();
  }
  if (_reader.failed()) return std::nullopt;
  return element;
}

std::uint32_t timerS(std::uint8_t octet) {
  const std::uint32_t value = octet & 0x1F;
  switch (octet >> 5) {
    case 0:
      return value * 2;
    case 2:
      return value * 360;
    case 7:
      return 0;
    default:
      return value * 60;
  }
}

std::uint32_t longTimerS(std::uint8_t octet) {
  constexpr std::array<std::uint32_t, 7> kUnitS = {600, 3600, 36000, 2, 30, 60, 1152000};
  const std::size_t unit = octet >> 5;
  if (unit >= kUnitS.size()) return 0;
  return (octet & 0x1F) * kUnitS[unit];
}

}  // namespace qel::diagnostics
