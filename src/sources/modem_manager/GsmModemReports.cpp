// The metrics of a modem on GSM.
#include "messages/gsm.h"
#include "messages/runtime/MessageReader.h"
#include "radio/Bands.h"
#include "radio/Levels.h"
#include "sources/Filling.h"
#include "sources/modem_manager/CellFilling.h"
#include "sources/modem_manager/ModemReports.h"

namespace qel::sources {
namespace {

void addGsm(const CellReading& cell, KCellularGsmGrrEventMeasCr& message) {
  auto entry = makeMessage<GsmNcellMeas>();
  if (cell.network) {
    entry->setMcc(cell.network->mcc);
    entry->setMnc(cell.network->mnc);
  }
  set(*entry, &GsmNcellMeas::setLac, cell.area);
  set(*entry, &GsmNcellMeas::setCi, cell.cellId);
  set(*entry, &GsmNcellMeas::setBsic, cell.code);
  set(*entry, &GsmNcellMeas::setArfcn, cell.channel);
  set(*entry, &GsmNcellMeas::setRxlev, cell.levelDbm, rxlevIndex);
  message.addGsmNcellMeas(entry);
}

void addUmts(const CellReading& cell, KCellularGsmGrrEventMeasCr& message) {
  auto entry = makeMessage<UmtsNcellMeas>();
  set(*entry, &UmtsNcellMeas::setCpichSc, cell.code);
  set(*entry, &UmtsNcellMeas::setDlUarfcn, cell.channel);
  set(*entry, &UmtsNcellMeas::setCpichRscp, cell.levelDbm, rscpIndex);
  set(*entry, &UmtsNcellMeas::setCpichEcn0, cell.qualityDb, ecnoIndex);
  message.addUmtsNcellMeas(entry);
}

void addLte(const CellReading& cell, KCellularGsmGrrEventMeasCr& message) {
  auto entry = makeMessage<LteNcellMeas>();
  set(*entry, &LteNcellMeas::setPhysicalCellId, cell.code);
  set(*entry, &LteNcellMeas::setRsrp, cell.levelDbm, rsrpIndex);
  set(*entry, &LteNcellMeas::setEarfcn, cell.channel);
  set(*entry, &LteNcellMeas::setRsrq, cell.qualityDb, rsrqIndex);
  message.addLteNcellMeas(entry);
}

}  // namespace

std::optional<Bytes> modemGsmCell(const ModemPicture& modem, std::uint64_t timeMs) {
  const CellReading* cell = servingOn(Technology::gsm, modem);
  if (!cell) return std::nullopt;
  KCellularGsmScellInfo message;
  message.setTimestamp(timeMs);
  if (cell->network) {
    message.setMcc(cell->network->mcc);
    message.setMnc(cell->network->mnc);
    message.setNumMncDigits(cell->network->mncDigits);
  }
  set(message, &KCellularGsmScellInfo::setLac, cell->area);
  set(message, &KCellularGsmScellInfo::setCellId, cell->cellId);
  const auto mcc = cell->network ? std::optional(cell->network->mcc) : std::nullopt;
  if (cell->channel) {
    set(message, &KCellularGsmScellInfo::setGsmBand, gsmBandOf(*cell->channel, mcc));
  }
  set(message, &KCellularGsmScellInfo::setArfcn, cell->channel);
  set(message, &KCellularGsmScellInfo::setBsic, cell->code);
  return message.data();
}

std::optional<Bytes> modemGsmMeasurement(const ModemPicture& modem, std::uint64_t timeMs) {
  if (modem.technology != Technology::gsm) return std::nullopt;
  // Signal strength is what GSM calls the received level; the list of cells has it as an index.
  const auto levelDbm = modem.levels.rssiDbm ? modem.levels.rssiDbm : modem.levels.levelDbm;
  if (!levelDbm) return std::nullopt;
  KCellularGsmIdleScellMeasurement message;
  message.setTimestamp(timeMs);
  if (modem.serving) {
    set(message, &KCellularGsmIdleScellMeasurement::setScellArfcn, modem.serving->channel);
  }
  message.setIdleRxlevDBm(rounded(*levelDbm));
  return message.data();
}

std::optional<Bytes> modemGsmNeighbours(const ModemPicture& modem, std::uint64_t timeMs) {
  if (modem.technology != Technology::gsm || !modem.cellsKnown) return std::nullopt;
  KCellularGsmGrrEventMeasCr message;
  message.setTimestamp(timeMs);
  addNeighbours(modem, message, {addLte, addUmts, addGsm});
  return message.data();
}

}  // namespace qel::sources
