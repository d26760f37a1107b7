// The metrics of a modem on UMTS.
#include "messages/lte_serving.h"
#include "messages/runtime/MessageReader.h"
#include "messages/wcdma.h"
#include "radio/Bands.h"
#include "radio/Levels.h"
#include "sources/Filling.h"
#include "sources/modem_manager/CellFilling.h"
#include "sources/modem_manager/ModemReports.h"
#include "sources/modem_manager/Names.h"

namespace qel::sources {
namespace {

// From the technology in use; plain UMTS leaves open what else the cell offers.
std::optional<std::int32_t> packetAccess(std::uint32_t technologies) {
  if (technologies == mm::kAnyTechnology) return std::nullopt;
  constexpr std::int32_t kDownlink = 1;
  constexpr std::int32_t kUplink = 2;
  const bool both = (technologies & mm::kHspa) != 0;
  const std::int32_t hspa = (both || (technologies & mm::kHsdpa) != 0 ? kDownlink : 0) |
                            (both || (technologies & mm::kHsupa) != 0 ? kUplink : 0);
  return hspa == 0 ? std::nullopt : std::optional(hspa);
}

void addUmts(const CellReading& cell, KCellularWcdmaNbrCellMeas& message) {
  auto entry = makeMessage<UtraCellMeasResult>();
  set(*entry, &UtraCellMeasResult::setUarfcn, cell.channel);
  set(*entry, &UtraCellMeasResult::setPsc, cell.code);
  set(*entry, &UtraCellMeasResult::setEcno, cell.qualityDb, ecnoIndex);
  set(*entry, &UtraCellMeasResult::setRscp, cell.levelDbm, rscpIndex);
  message.addMeasUtraResult(entry);
}

void addGsm(const CellReading& cell, KCellularWcdmaNbrCellMeas& message) {
  auto entry = makeMessage<GsmCellMeasResult>();
  set(*entry, &GsmCellMeasResult::setArfcn, cell.channel);
  set(*entry, &GsmCellMeasResult::setBsic, cell.code);
  set(*entry, &GsmCellMeasResult::setRxlev, cell.levelDbm, rxlevIndex);
  message.addMeasGsmResult(entry);
}

void addLte(const CellReading& cell, KCellularWcdmaNbrCellMeas& message) {
  auto entry = makeMessage<LteCellMeasResult>();
  set(*entry, &LteCellMeasResult::setEarfcn, cell.channel);
  set(*entry, &LteCellMeasResult::setPhyCellId, cell.code);
  if (cell.channel) set(*entry, &LteCellMeasResult::setEutraBand, lteBandOf(*cell.channel));
  set(*entry, &LteCellMeasResult::setRsrp, cell.levelDbm, rsrpIndex);
  set(*entry, &LteCellMeasResult::setRsrq, cell.qualityDb, rsrqIndex);
  message.addMeasLteResult(entry);
}

}  // namespace

std::optional<Bytes> modemUmtsCell(const ModemPicture& modem, std::uint64_t timeMs) {
  const CellReading* cell = servingOn(Technology::umts, modem);
  if (!cell) return std::nullopt;
  KCellularWcdmaCellInfo message;
  message.setTimestamp(timeMs);
  if (cell->network) {
    message.setMcc(cell->network->mcc);
    message.setMnc(cell->network->mnc);
    message.setNumMncDigits(cell->network->mncDigits);
  }
  set(message, &KCellularWcdmaCellInfo::setLac, cell->area);
  set(message, &KCellularWcdmaCellInfo::setCellId, cell->cellId);
  if (cell->channel)
    set(message, &KCellularWcdmaCellInfo::setWcdmaBand, umtsBandOf(*cell->channel));
  set(message, &KCellularWcdmaCellInfo::setDlUarfcn, cell->channel);
  set(message, &KCellularWcdmaCellInfo::setPsc, cell->code);
  set(message, &KCellularWcdmaCellInfo::setHspa, packetAccess(modem.accessTechnologies));
  return message.data();
}

// The entry carries LTE's names: here RSCP and Ec/No stand in them, as their own indexes.
std::optional<Bytes> modemUmtsMeasurement(const ModemPicture& modem, std::uint64_t timeMs) {
  const LevelReading& levels = modem.levels;
  if (modem.technology != Technology::umts) return std::nullopt;
  if (!levels.rssiDbm && !levels.levelDbm && !levels.qualityDb) return std::nullopt;
  auto receiver = makeMessage<RxInfo>();
  if (levels.rssiDbm) receiver->setRssi(rounded(*levels.rssiDbm));
  set(*receiver, &RxInfo::setRsrpRange, levels.levelDbm, rscpIndex);
  set(*receiver, &RxInfo::setRsrqRange, levels.qualityDb, ecnoIndex);
  KCellularWcdmaScellMeasurement message;
  message.setTimestamp(timeMs);
  message.addRxInfo(receiver);
  return message.data();
}

std::optional<Bytes> modemUmtsNeighbours(const ModemPicture& modem, std::uint64_t timeMs) {
  if (modem.technology != Technology::umts || !modem.cellsKnown) return std::nullopt;
  KCellularWcdmaNbrCellMeas message;
  message.setTimestamp(timeMs);
  addNeighbours(modem, message, {addLte, addUmts, addGsm});
  return message.data();
}

}  // namespace qel::sources
