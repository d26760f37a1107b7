#include "sources/diagnostics/umts/UmtsReports.h"

#include <algorithm>
#include <memory>

#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/runtime/MessageReader.h"
#include "messages/wcdma.h"
#include "radio/Bands.h"
#include "radio/Levels.h"
#include "sources/Filling.h"

namespace qel::diagnostics {
namespace {

using sources::set;

std::int32_t packetAccess(const UmtsPacketAccess& access) {
  constexpr std::int32_t kDownlink = 1;
  constexpr std::int32_t kUplink = 2;
  return (access.downlink ? kDownlink : 0) | (access.uplink ? kUplink : 0);
}

// As the entries of neighbours have it: below 0 too (25.133, clause 9.1.1.3).
std::int32_t signedRscpIndex(double dbm) { return std::clamp(rounded(dbm + 116), -5, 91); }

std::optional<double> valueOf(const std::optional<UmtsLevel>& level) {
  return level ? std::optional(level->value) : std::nullopt;
}

// RSCP and Ec/No stand, as their own indexes, where LTE has RSRP and RSRQ.
std::shared_ptr<RxInfo> receiverOf(const UmtsSignal& signal, std::size_t receiver) {
  auto info = makeMessage<RxInfo>();
  const auto& rssiDbm = signal.rssiDbm[receiver];
  if (rssiDbm) info->setRssi(rounded(rssiDbm->value));
  if (receiver != 0) return rssiDbm ? info : nullptr;
  set(*info, &RxInfo::setRsrpRange, valueOf(signal.rscpDbm), rscpIndex);
  set(*info, &RxInfo::setRsrqRange, valueOf(signal.ecnoDb), ecnoIndex);
  return info;
}

void add(const UmtsNeighbour& cell, KCellularWcdmaNbrCellMeas& message) {
  auto entry = makeMessage<UtraCellMeasResult>();
  entry->setUarfcn(cell.uarfcn);
  entry->setPsc(cell.scramblingCode);
  entry->setEcno(ecnoIndex(cell.ecnoDb));
  entry->setRscp(signedRscpIndex(cell.rscpDbm));
  message.addMeasUtraResult(entry);
}

void add(const UmtsGsmNeighbour& cell, KCellularWcdmaNbrCellMeas& message) {
  auto entry = makeMessage<GsmCellMeasResult>();
  entry->setArfcn(cell.arfcn);
  set(*entry, &GsmCellMeasResult::setBsic, cell.bsic);
  entry->setRxlev(rxlevIndex(cell.levelDbm));
  message.addMeasGsmResult(entry);
}

template <class Info>
std::shared_ptr<Info> prioritised(const UmtsFrequency& frequency,
                                  void (Info::*setChannel)(std::uint32_t)) {
  auto info = makeMessage<Info>();
  (info.get()->*setChannel)(frequency.channel);
  set(*info, &Info::setPrio, frequency.priority);
  return info;
}

void add(const UmtsPriorities& priorities, KCellularWcdmaSelReselCellInfo& message) {
  message.setSCellPrio(priorities.own);
  for (const UmtsFrequency& lte : priorities.lte)
    message.addEutraPrioInfo(prioritised(lte, &EutraFreqInfo::setEarfcn));
  for (const UmtsFrequency& umts : priorities.umts)
    message.addUtraPrioInfo(prioritised(umts, &UtraFreqInfo::setUarfcn));
  for (const UmtsFrequency& gsm : priorities.gsm)
    message.addGsmPrioInfo(prioritised(gsm, &GsmFreqInfo::setArfcn));
}

void add(const UmtsSelection& selection, KCellularWcdmaSelReselCellInfo& message) {
  constexpr std::int32_t kFdd = 0;
  constexpr std::int32_t kTdd = 1;
  message.setDuplexMode(selection.fdd ? kFdd : kTdd);
  message.setCellBarred(selection.barred ? 1 : 0);
  set(message, &KCellularWcdmaSelReselCellInfo::setSIntrasearch, selection.intraSearchDb);
  set(message, &KCellularWcdmaSelReselCellInfo::setSIntersearch, selection.interSearchDb);
  set(message, &KCellularWcdmaSelReselCellInfo::setSSearchRat, selection.gsmSearchDb);
}

}  // namespace

std::optional<Bytes> umtsRrcState(const Picture& picture, std::uint64_t timeMs) {
  const UmtsConnection& connection = picture.umts.connection;
  if (!connection.state) return std::nullopt;
  KCellularWcdmaRrcConnectionState message;
  message.setTimestamp(timeMs);
  message.setState(static_cast<std::int32_t>(*connection.state));
  set(message, &KCellularWcdmaRrcConnectionState::setEstablishmentCause,
      connection.establishmentCause);
  set(message, &KCellularWcdmaRrcConnectionState::setReleaseCause, connection.releaseCause);
  return message.data();
}

std::optional<Bytes> umtsRrcConfiguration(const Picture& picture, std::uint64_t timeMs) {
  const auto& paging = picture.umts.broadcast.paging;
  if (!paging || !paging->block.cycleMs) return std::nullopt;
  KCellularWcdmaRrcConfiguration message;
  message.setTimestamp(timeMs);
  message.setDrxCycleLengthMs(*paging->block.cycleMs);
  return message.data();
}

std::optional<Bytes> umtsCell(const Picture& picture, std::uint64_t timeMs) {
  const auto& cell = picture.umts.cell;
  if (!cell) return std::nullopt;
  KCellularWcdmaCellInfo message;
  message.setTimestamp(timeMs);
  if (cell->network) {
    message.setMcc(cell->network->mcc);
    message.setMnc(cell->network->mnc);
    message.setNumMncDigits(cell->network->mncDigits);
  }
  message.setLac(cell->areaCode);
  message.setCellId(cell->cellId);
  set(message, &KCellularWcdmaCellInfo::setWcdmaBand, umtsBandOf(cell->uarfcn));
  message.setDlUarfcn(cell->uarfcn);
  message.setPsc(cell->scramblingCode);
  if (const auto& access = picture.umts.broadcast.packetAccess)
    message.setHspa(packetAccess(access->block));
  return message.data();
}

std::optional<Bytes> umtsSignal(const Picture& picture, std::uint64_t timeMs) {
  const UmtsSignal& signal = picture.umts.signal;
  const bool first = signal.rscpDbm || signal.ecnoDb || signal.rssiDbm[0];
  if (!first && !signal.rssiDbm[1]) return std::nullopt;
  KCellularWcdmaScellMeasurement message;
  message.setTimestamp(timeMs);
  set(message, &KCellularWcdmaScellMeasurement::setConnectedMode,
      picture.umts.connection.connected());
  for (std::size_t i = 0; i < UmtsSignal::kReceivers; ++i) {
    if (const auto receiver = receiverOf(signal, i)) message.addRxInfo(receiver);
  }
  return message.data();
}

// The entry carries LTE's names: here the power of the dedicated channel stands in the shared
// one's.
std::optional<Bytes> umtsTransmitPower(const Picture& picture, std::uint64_t timeMs) {
  const auto& transmitDbm = picture.umts.transmitDbm;
  if (!transmitDbm) return std::nullopt;
  auto power = makeMessage<TxPowerInfo>();
  power->setPuschTxPower(rounded(transmitDbm->value));
  KCellularWcdmaTxPower message;
  message.setTimestamp(timeMs);
  message.addTxPowerInfo(power);
  return message.data();
}

std::optional<Bytes> umtsReselection(const Picture& picture, std::uint64_t timeMs) {
  const UmtsBroadcast& broadcast = picture.umts.broadcast;
  const auto& [paging, selection, access, fachMeasurements, priorities] = broadcast;
  if (!selection && !access && !fachMeasurements && !priorities) return std::nullopt;
  KCellularWcdmaSelReselCellInfo message;
  message.setTimestamp(timeMs);
  if (access) {
    message.setHsdpaCapable(access->block.downlink ? 1 : 0);
    message.setEdchCapable(access->block.uplink ? 1 : 0);
  }
  if (selection) add(selection->block, message);
  if (fachMeasurements) message.setFachMeasOccInfoPresent(fachMeasurements->block ? 1 : 0);
  if (priorities) add(priorities->block, message);
  return message.data();
}

std::optional<Bytes> umtsNeighbours(const Picture& picture, std::uint64_t timeMs) {
  const auto& neighbours = picture.umts.neighbours;
  if (!neighbours) return std::nullopt;
  KCellularWcdmaNbrCellMeas message;
  message.setTimestamp(timeMs);
  for (const UmtsNeighbour& cell : neighbours->umts) add(cell, message);
  for (const UmtsGsmNeighbour& cell : neighbours->gsm) add(cell, message);
  return message.data();
}

}  // namespace qel::diagnostics
