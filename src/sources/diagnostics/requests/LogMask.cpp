#include "sources/diagnostics/requests/LogMask.h"

#include <algorithm>

namespace qel::diagnostics {
namespace {

constexpr std::array<std::uint16_t, 9> kSecretLogs = {
    0xB0A3, 0xB0A5, 0xB0B3, 0xB0B5,  // ciphering keys of bearers
    0xB0EF,                          // the subscriber's identity
    0xB0F2, 0xB0F3, 0xB0F4,          // keys of the NAS
    0x7139,                          // identities of subscriber and phone
};

}  // namespace

bool isSecretLog(std::uint16_t code) { return std::ranges::count(kSecretLogs, code) != 0; }

LogMask::LogMask(unsigned equipment, unsigned items)
    : _equipment(equipment), _items(std::min(items, kMostItems)), _bits((_items + 7) / 8) {}

void LogMask::enable(std::uint16_t code) {
  const unsigned item = code & (kMostItems - 1);
  if (code >> 12 != _equipment || item >= _items || isSecretLog(code)) return;
  _bits[item / 8] = static_cast<std::uint8_t>(_bits[item / 8] | 1U << item % 8);
}

bool LogMask::isEmpty() const {
  return std::ranges::all_of(_bits, [](std::uint8_t byte) { return byte == 0; });
}

std::vector<LogMask> masksOf(const LogRanges& ranges,
                             const std::function<bool(std::uint16_t code)>& wanted) {
  std::vector<LogMask> masks;
  for (unsigned equipment = 0; equipment < ranges.size(); ++equipment) {
    LogMask mask(equipment, ranges[equipment]);
    for (unsigned item = 0; item < mask.items(); ++item) {
      const auto code = static_cast<std::uint16_t>(equipment << 12 | item);
      if (wanted(code)) mask.enable(code);
    }
    if (!mask.isEmpty()) masks.push_back(mask);
  }
  return masks;
}

}  // namespace qel::diagnostics
