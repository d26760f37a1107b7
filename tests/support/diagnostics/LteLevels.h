// Levels and channels of LTE cells as numbers of a modem's logs.
#pragma once

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <vector>

#include "support/diagnostics/LtePackets.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {

inline std::uint64_t sixteenths(double value, double lowest) {
  return static_cast<std::uint64_t>(std::lround((value - lowest) * 16));
}
inline std::uint64_t rsrpNumber(double dbm) { return sixteenths(dbm, -180); }
inline std::uint64_t rsrqNumber(double db) { return sixteenths(db, -30); }
inline std::uint64_t rssiNumber(double dbm) { return sixteenths(dbm, -110); }
inline std::uint64_t snrNumber(double db) {
  return static_cast<std::uint64_t>(std::lround((db + 20) * 10));
}

// A cell's antennas, those that are not there filled up, and of each quantity the greatest.
class Levels {
 public:
  explicit Levels(std::vector<WrittenLteAntenna> antennas) : _antennas(std::move(antennas)) {
    _antennas.resize(4, deaf());
  }

  std::uint64_t rsrp(std::size_t i) const { return rsrpNumber(_antennas[i].rsrpDbm); }
  std::uint64_t rsrq(std::size_t i) const { return rsrqNumber(_antennas[i].rsrqDb); }
  std::uint64_t rssi(std::size_t i) const { return rssiNumber(_antennas[i].rssiDbm); }
  std::uint64_t snr(std::size_t i) const { return snrNumber(_antennas[i].snrDb); }
  std::uint64_t rsrp() const { return rsrpNumber(greatest(&WrittenLteAntenna::rsrpDbm)); }
  std::uint64_t rsrq() const { return rsrqNumber(greatest(&WrittenLteAntenna::rsrqDb)); }
  std::uint64_t rssi() const { return rssiNumber(greatest(&WrittenLteAntenna::rssiDbm)); }
  // Where the modem writes 40 dB less than it measured.
  std::uint64_t rsrpLess40() const {
    return rsrpNumber(greatest(&WrittenLteAntenna::rsrpDbm) - 40);
  }

 private:
  double greatest(double WrittenLteAntenna::*quantity) const {
    double value = _antennas[0].*quantity;
    for (const WrittenLteAntenna& antenna : _antennas) value = std::max(value, antenna.*quantity);
    return value;
  }

  std::vector<WrittenLteAntenna> _antennas;
};

// A channel's number: of 16 bits once, of 32 since.
inline BodyWriter& channel(BodyWriter& body, bool isWide, unsigned number) {
  return isWide ? body.u32(number) : body.u16(number);
}

// Memory of that size in which nothing has been written yet: what is read of it by mistake shows.
inline BodyWriter unwritten(std::size_t size) { return BodyWriter().bytes(Bytes(size, 0x5A)); }

// A packet of parts; the first is one that is not asked for.
Bytes ofParts(std::uint8_t otherId, std::uint8_t id, unsigned version, ByteView data);

}  // namespace qel::diagnostics::test
