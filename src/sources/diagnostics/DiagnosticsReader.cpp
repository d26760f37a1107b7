#include "sources/diagnostics/DiagnosticsReader.h"

#include "sources/diagnostics/PacketTable.h"
#include "sources/diagnostics/gsm/GsmTables.h"
#include "sources/diagnostics/lte/LteTables.h"
#include "sources/diagnostics/nas/NasTables.h"
#include "sources/diagnostics/sim/SimTables.h"
#include "sources/diagnostics/umts/UmtsTables.h"

namespace qel::diagnostics {

const Told& DiagnosticsReader::take(const LogPacket& packet) {
  const LogRow* row = findLog(packet.code);
  const auto version = row && row->version ? row->version(packet.body) : std::nullopt;
  return take(packet, row, {false, packet.code, version});
}

const Told& DiagnosticsReader::take(const ModemEvent& event) {
  return take(event, findEvent(event.id), {true, event.id, std::nullopt});
}

template <class Packet, class Row>
const Told& DiagnosticsReader::take(const Packet& packet, const Row* row,
                                    const PacketCounts::Kind& kind) {
  _told.clear();
  if (packet.radio != 0 && packet.radio != _radio) return _told;
  age(packet.timeMs);
  const Outcome outcome = row ? row->read(packet, _picture, _told) : Outcome::notOurs;
  _counts.count(kind, outcome);
  for (const std::uint32_t metric : _told) _everTold.tell(metric);
  return _told;
}

void DiagnosticsReader::age(std::uint64_t nowMs) {
  diagnostics::age(_picture.lte, nowMs);
  diagnostics::age(_picture.umts, nowMs);
  diagnostics::age(_picture.gsm, nowMs);
  diagnostics::age(_picture.nas, nowMs);
  diagnostics::age(_picture.sim, nowMs);
}

std::optional<Bytes> DiagnosticsReader::report(std::uint32_t metric, std::uint64_t timeMs) const {
  const ReportRow* row = _everTold.contains(metric) ? findReport(metric) : nullptr;
  return row ? row->build(_picture, timeMs) : std::nullopt;
}

void DiagnosticsReader::forget() {
  _picture = {};
  _everTold.clear();
}

}  // namespace qel::diagnostics
