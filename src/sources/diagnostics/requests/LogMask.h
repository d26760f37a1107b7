// Which logs of one of the modem's equipments are to be sent.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <vector>

#include "base/Bytes.h"

namespace qel::diagnostics {

inline constexpr std::size_t kEquipments = 16;  // bits 12-15 of a log's code
inline constexpr unsigned kMostItems = 4096;    // bits 0-11

// How many items each equipment has; a code beyond that does not exist there.
using LogRanges = std::array<std::uint32_t, kEquipments>;

// Logs that hold keys or say who the user is. They stay off whatever is asked for.
bool isSecretLog(std::uint16_t code);

// Bit i stands for item i, lowest bit of the first byte first.
class LogMask {
 public:
  // At most kMostItems of them.
  LogMask(unsigned equipment, unsigned items);

  // No effect for a code of another equipment, beyond the items, or of a secret log.
  void enable(std::uint16_t code);

  unsigned equipment() const { return _equipment; }
  unsigned items() const { return _items; }
  ByteView bits() const { return _bits; }
  bool isEmpty() const;

  friend bool operator==(const LogMask&, const LogMask&) = default;

 private:
  unsigned _equipment;
  unsigned _items;
  Bytes _bits;
};

// One of each equipment that has a wanted log within its range.
std::vector<LogMask> masksOf(const LogRanges& ranges,
                             const std::function<bool(std::uint16_t code)>& wanted);

}  // namespace qel::diagnostics
