// The time of day of what a modem sends, by the host's clock.
#pragma once

#include <array>
#include <cstdint>
#include <optional>

namespace qel::diagnostics {

// The modem's clock tells distances well and the time of day badly: it may go by GPS time, or from
// 1980 on until a network has told it. So its stamps are moved by what they were behind the host at
// least within the last minute: by the delay of the quickest packet. Begins anew when the modem's
// clock jumps. Milliseconds since 1970; one thread.
class ModemClock {
 public:
  // What the host's clock said at that stamp. Never later than now.
  std::uint64_t hostMs(std::uint64_t deviceMs, std::uint64_t nowMs);
  void beginAnew() { *this = {}; }

 private:
  struct Packet {
    std::int64_t device;
    std::int64_t host;
  };
  struct Least {
    std::int64_t slot = -1;  // counted in kSlotMs of the host
    std::int64_t offset = 0;
  };
  static constexpr std::int64_t kSlotMs = 5000;
  static constexpr std::size_t kSlots = 12;

  bool jumps(const Packet& packet) const;
  std::int64_t leastOffset(std::int64_t slot) const;

  std::optional<Packet> _last;
  std::array<Least, kSlots> _least;
};

}  // namespace qel::diagnostics
