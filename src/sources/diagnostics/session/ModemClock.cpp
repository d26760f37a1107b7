#include "sources/diagnostics/session/ModemClock.h"

#include <algorithm>
#include <limits>

namespace qel::diagnostics {

std::uint64_t ModemClock::hostMs(std::uint64_t deviceMs, std::uint64_t nowMs) {
  const Packet packet{static_cast<std::int64_t>(deviceMs), static_cast<std::int64_t>(nowMs)};
  if (jumps(packet)) beginAnew();
  _last = packet;
  const std::int64_t slot = packet.host / kSlotMs;
  const std::int64_t offset = packet.host - packet.device;
  Least& least = _least[static_cast<std::size_t>(slot) % kSlots];
  least = least.slot == slot ? Least{slot, std::min(least.offset, offset)} : Least{slot, offset};
  return static_cast<std::uint64_t>(std::max<std::int64_t>(packet.device + leastOffset(slot), 0));
}

// Packets may come late, and a little out of order. What is further ahead than time has gone on, or
// further back, is a clock that was set.
bool ModemClock::jumps(const Packet& packet) const {
  constexpr std::int64_t kMostMs = 5000;
  if (!_last) return false;
  const std::int64_t ahead = packet.device - _last->device;
  const std::int64_t passed = std::max<std::int64_t>(packet.host - _last->host, 0);
  return ahead > passed + kMostMs || ahead < -kMostMs;
}

std::int64_t ModemClock::leastOffset(std::int64_t slot) const {
  std::int64_t offset = std::numeric_limits<std::int64_t>::max();
  for (const Least& least : _least) {
    const bool isOfLastMinute = least.slot > slot - static_cast<std::int64_t>(kSlots);
    if (isOfLastMinute && least.slot <= slot && least.slot >= 0) {
      offset = std::min(offset, least.offset);
    }
  }
  return offset;
}

}  // namespace qel::diagnostics
