// The metrics of a modem on LTE.
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/runtime/MessageReader.h"
#include "radio/Bands.h"
#include "radio/Levels.h"
#include "sources/Filling.h"
#include "sources/modem_manager/CellFilling.h"
#include "sources/modem_manager/ModemReports.h"

namespace qel::sources {
namespace {

std::shared_ptr<RsrpRsrqSinr> sampleOf(const ModemPicture& modem) {
  const LevelReading& levels = modem.levels;
  auto sample = makeMessage<RsrpRsrqSinr>();
  if (modem.serving) set(*sample, &RsrpRsrqSinr::setPhyCellId, modem.serving->code);
  if (levels.levelDbm) sample->setRsrp0(rounded(*levels.levelDbm));
  if (levels.qualityDb) sample->setRsrq0(rounded(*levels.qualityDb));
  if (levels.snrDb) sample->setSinr0(rounded(*levels.snrDb * 2));  // half dB
  return sample;
}

void addLte(const CellReading& cell, KCellularLteNbrEutraCellMeas& message) {
  auto entry = makeMessage<EgwErrcNbrEutraMeas>();
  set(*entry, &EgwErrcNbrEutraMeas::setNbrEarfcn, cell.channel);
  set(*entry, &EgwErrcNbrEutraMeas::setNbrPhysCellId, cell.code);
  if (cell.channel) set(*entry, &EgwErrcNbrEutraMeas::setFreqBandInd, lteBandOf(*cell.channel));
  set(*entry, &EgwErrcNbrEutraMeas::setNbrRsrp, cell.levelDbm, rsrpIndex);
  set(*entry, &EgwErrcNbrEutraMeas::setNbrRsrq, cell.qualityDb, rsrqIndex);
  message.addMeasNbrEutra(entry);
}

void addUmts(const CellReading& cell, KCellularLteNbrInterRatCellMeas& message) {
  auto entry = makeMessage<EgwErrcNbrUtraMeas>();
  set(*entry, &EgwErrcNbrUtraMeas::setUarfcn, cell.channel);
  set(*entry, &EgwErrcNbrUtraMeas::setPsc, cell.code);
  set(*entry, &EgwErrcNbrUtraMeas::setRscp, cell.levelDbm, rscpIndex);
  set(*entry, &EgwErrcNbrUtraMeas::setEcno, cell.qualityDb, ecnoIndex);
  message.addMeasNbrUtra(entry);
}

void addGsm(const CellReading& cell, KCellularLteNbrInterRatCellMeas& message) {
  auto entry = makeMessage<EgwErrcNbrGeranMeas>();
  set(*entry, &EgwErrcNbrGeranMeas::setArfcn, cell.channel);
  set(*entry, &EgwErrcNbrGeranMeas::setBsic, cell.code);
  set(*entry, &EgwErrcNbrGeranMeas::setRxlev, cell.levelDbm, rxlevIndex);
  message.addMeasNbrGeran(entry);
}

}  // namespace

std::optional<Bytes> modemLteCell(const ModemPicture& modem, std::uint64_t timeMs) {
  const CellReading* cell = servingOn(Technology::lte, modem);
  if (!cell) return std::nullopt;
  KCellularLteScellInfo message;
  message.setTimestamp(timeMs);
  set(message, &KCellularLteScellInfo::setPhyCellId, cell->code);
  set(message, &KCellularLteScellInfo::setDlFreq, cell->channel);
  set(message, &KCellularLteScellInfo::setDlBw, cell->bandwidthCode);
  set(message, &KCellularLteScellInfo::setCellId, cell->cellId);
  if (cell->channel)
    set(message, &KCellularLteScellInfo::setFreqBandInd, lteBandOf(*cell->channel));
  set(message, &KCellularLteScellInfo::setTrackingAreaCode, cell->area);
  if (cell->network) {
    message.setNumMncDigits(cell->network->mncDigits);
    message.setSelPlmnMcc(cell->network->mcc);
    message.setSelPlmnMnc(cell->network->mnc);
  }
  return message.data();
}

std::optional<Bytes> modemLteMeasurement(const ModemPicture& modem, std::uint64_t timeMs) {
  const LevelReading& levels = modem.levels;
  if (modem.technology != Technology::lte) return std::nullopt;
  if (!levels.rssiDbm && !levels.levelDbm && !levels.qualityDb && !levels.snrDb) {
    return std::nullopt;
  }
  auto receiver = makeMessage<RxInfo>();
  if (levels.rssiDbm) receiver->setRssi(rounded(*levels.rssiDbm));
  set(*receiver, &RxInfo::setRsrpRange, levels.levelDbm, rsrpIndex);
  set(*receiver, &RxInfo::setRsrqRange, levels.qualityDb, rsrqIndex);
  if (levels.snrDb) receiver->setSnr(rounded(*levels.snrDb));
  KCellularLteServingCellMeasurement message;
  message.setTimestamp(timeMs);
  message.addRxInfo(receiver);
  return message.data();
}

// One sample, which is its own average.
std::optional<Bytes> modemLteQuality(const ModemPicture& modem, std::uint64_t timeMs) {
  const LevelReading& levels = modem.levels;
  if (modem.technology != Technology::lte) return std::nullopt;
  if (!levels.levelDbm && !levels.qualityDb && !levels.snrDb) return std::nullopt;
  KCellularLteRsrpRsrqSinr message;
  message.setTimestamp(timeMs);
  message.setNumSamples(1);
  message.setAvgValues(sampleOf(modem));
  message.addInstValues(sampleOf(modem));
  return message.data();
}

std::optional<Bytes> modemLteCarriers(const ModemPicture& modem, std::uint64_t timeMs) {
  if (modem.technology != Technology::lte || !modem.carriers) return std::nullopt;
  KCellularLteCarrierAggregationStatus message;
  message.setTimestamp(timeMs);
  for (const CellReading& cell : *modem.carriers) {
    auto entry = makeMessage<SecondaryComponentCarrier>();
    set(*entry, &SecondaryComponentCarrier::setPci, cell.code);
    set(*entry, &SecondaryComponentCarrier::setDlEarfcn, cell.channel);
    if (cell.channel) {
      set(*entry, &SecondaryComponentCarrier::setDlRfBand, lteBandOf(*cell.channel));
    }
    set(*entry, &SecondaryComponentCarrier::setDlBandwidth, cell.bandwidthCode);
    if (cell.levelDbm) entry->setRsrp(rounded(*cell.levelDbm * 100));  // hundredths
    if (cell.qualityDb) entry->setRsrq(rounded(*cell.qualityDb * 100));
    message.addSccList(entry);
  }
  return message.data();
}

std::optional<Bytes> modemLteNeighbours(const ModemPicture& modem, std::uint64_t timeMs) {
  if (modem.technology != Technology::lte || !modem.cellsKnown) return std::nullopt;
  KCellularLteNbrEutraCellMeas message;
  message.setTimestamp(timeMs);
  addNeighbours(modem, message, {addLte, nullptr, nullptr});
  return message.data();
}

std::optional<Bytes> modemLteOthers(const ModemPicture& modem, std::uint64_t timeMs) {
  if (modem.technology != Technology::lte || !modem.cellsKnown) return std::nullopt;
  KCellularLteNbrInterRatCellMeas message;
  message.setTimestamp(timeMs);
  addNeighbours(modem, message, {nullptr, addUmts, addGsm});
  return message.data();
}

}  // namespace qel::sources
