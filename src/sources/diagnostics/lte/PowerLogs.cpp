#include "sources/diagnostics/lte/PowerLogs.h"

#include <algorithm>

#include "sources/Metrics.h"
#include "sources/diagnostics/lte/LteRead.h"

namespace qel::diagnostics {
namespace {

Outcome readPower(const LogPacket& packet, LteTransmissions& transmissions, Told& told) {
  return readWhole(packet, [&](const Reading& reading) {
    LteTransmissions found;
    found.timeMs = packet.timeMs;
    for (const Values& values : reading.records) {
      const std::uint32_t subframe = values.number(Field::subframe);
      if (subframe > 9) return Outcome::damaged;
      found.list.push_back({subframe, static_cast<std::int32_t>(values[Field::txPower])});
    }
    if (found.list.empty()) return Outcome::understood;
    transmissions = std::move(found);
    told.tell(metric::kLteTxPower);
    return Outcome::understood;
  });
}

}  // namespace

Outcome readLtePusch(const LogPacket& packet, Picture& picture, Told& told) {
  return readPower(packet, picture.lte.pusch, told);
}

Outcome readLtePucch(const LogPacket& packet, Picture& picture, Told& told) {
  return readPower(packet, picture.lte.pucch, told);
}

}  // namespace qel::diagnostics
