#include "sources/diagnostics/lte/CellLogs.h"

#include "sources/Metrics.h"
#include "sources/diagnostics/lte/Bandwidth.h"
#include "sources/diagnostics/lte/LevelCheck.h"
#include "sources/diagnostics/lte/LteRead.h"
#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {
namespace {

LteServingCell servingCellOf(const Values& values) {
  LteServingCell cell;
  cell.name = nameOf(values);
  cell.ulEarfcn = values.number(Field::ulEarfcn);
  cell.dlBandwidth = bandwidthCode(values.number(Field::dlBlocks));
  cell.ulBandwidth = bandwidthCode(values.number(Field::ulBlocks));
  cell.cellId = values.number(Field::cellId);
  cell.area = values.number(Field::area);
  cell.band = values.number(Field::band);
  cell.mcc = values.number(Field::mcc);
  cell.mnc = values.number(Field::mnc);
  cell.mncDigits = values.number(Field::mncDigits);
  return cell;
}

bool canBe(const LteServingCell& cell) {
  return isCell(cell.name) && cell.ulEarfcn <= kLastEarfcn && cell.cellId < 1U << 28U &&
         cell.band >= 1 && cell.band <= 256 && cell.mcc <= 999 &&
         cell.mnc <= (cell.mncDigits == 2 ? 99U : 999U) &&
         (cell.mncDigits == 2 || cell.mncDigits == 3);
}

}  // namespace

Outcome readLteServingCell(const LogPacket& packet, Picture& picture, Told& told) {
  const Outcome outcome = readWhole(packet, [&](const Reading& reading) {
    const LteServingCell cell = servingCellOf(reading.head);
    if (!canBe(cell)) return Outcome::damaged;
    changeTo(picture, Technology::lte);
    picture.lte.serving = cell;
    picture.lte.measureFrom(cell.name);
    told.tell(metric::kLteScellInfo);
    return Outcome::understood;
  });
  follow(picture.lte.servingLog, outcome);
  if (picture.lte.serverUnread()) told.tell(metric::kLteScellInfo);
  return outcome;
}

Outcome readLteBroadcast(const LogPacket& packet, Picture& picture, Told& /*told*/) {
  return readWhole(packet, [&](const Reading& reading) {
    const LteBroadcast cell{nameOf(reading.head),
                            bandwidthCode(reading.head.number(Field::dlBlocks))};
    if (!isCell(cell.name) || !cell.dlBandwidth) return Outcome::damaged;
    picture.lte.broadcast = cell;
    return Outcome::understood;
  });
}

Outcome readLteNewCell(const ModemEvent& event, Picture& picture, Told& /*told*/) {
  constexpr std::size_t kBytes = 5;
  if (event.payload.size() != kBytes) return Outcome::damaged;
  const LteCellName name{u16At(event.payload, 1), u16At(event.payload, 3)};
  if (!isCell(name)) return Outcome::damaged;
  picture.lte.camp(name);
  return Outcome::understood;
}

}  // namespace qel::diagnostics
