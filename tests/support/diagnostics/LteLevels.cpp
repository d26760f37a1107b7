#include "support/diagnostics/LteLevels.h"

namespace qel::diagnostics::test {

WrittenLteAntenna heard(double rsrpDbm, double rssiDbm, unsigned blocks, double snrDb) {
  return {rsrpDbm, rsrpDbm - rssiDbm + 10 * std::log10(blocks), rssiDbm, snrDb};
}

WrittenLteAntenna deaf() { return {-180, -30, -110, -20}; }

Bytes ofParts(std::uint8_t otherId, std::uint8_t id, unsigned version, ByteView data) {
  BodyWriter body;
  body.u8(1).u8(2).u16(0);
  body.u8(otherId).u8(2).u16(12).u64(0);
  body.u8(id).u8(version).u16(4 + data.size()).bytes(data);
  return body;
}

}  // namespace qel::diagnostics::test
