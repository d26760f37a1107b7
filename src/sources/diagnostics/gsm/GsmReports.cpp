#include "sources/diagnostics/gsm/GsmReports.h"

#include "messages/gsm.h"
#include "messages/runtime/MessageReader.h"
#include "radio/Levels.h"
#include "sources/Filling.h"

namespace qel::diagnostics {
namespace {

using sources::set;

constexpr std::int32_t kDedicated = 1;
constexpr std::int32_t kNotDedicated = 2;

std::optional<Network> ownNetwork(const GsmPicture& gsm) {
  return gsm.cell ? networkOf(gsm.cell->area.plmn) : std::nullopt;
}

void addBroadcast(const GsmBroadcast& broadcast, KCellularGsmIdleConfig& message) {
  using Config = KCellularGsmIdleConfig;
  if (broadcast.controlChannel) {
    message.setT3212(broadcast.controlChannel->t3212);
    message.setBsPaMfrms(broadcast.controlChannel->pagingMultiframes);
    message.setAttachAllowed(broadcast.controlChannel->attach ? 1 : 0);
  }
  if (broadcast.options) {
    message.setDtxFromBs(broadcast.options->discontinuousTransmission);
    message.setRadioLinkTimeout(broadcast.options->radioLinkTimeout);
  }
  if (broadcast.selection) {
    message.setMsTxpwr(broadcast.selection->mostPowerLevel);
    message.setRxAccMin(broadcast.selection->leastRxlev);
    message.setHalfRateSupported(broadcast.selection->halfRate ? 1 : 0);
  }
  if (broadcast.access) {
    message.setCba(broadcast.access->barred ? 1 : 0);
    message.setAcc(broadcast.access->barredClasses);
    message.setMaxRetransCs(broadcast.access->mostRepeats);
    message.setEmergCallAllowed(broadcast.access->emergencyCalls() ? 1 : 0);
    message.setReestAllowed(broadcast.access->reestablishment ? 1 : 0);
  }
  // The offset to C2 has a field that no receiver can read, 19.
  if (broadcast.reselection) {
    message.setC2Valid(broadcast.reselection->given ? 1 : 0);
    set(message, &Config::setCbq, broadcast.reselection->qualify);
    set(message, &Config::setTmpOffset, broadcast.reselection->temporaryOffsetDb);
    set(message, &Config::setPenaltyT, broadcast.reselection->penaltyS);
  }
  set(message, &Config::setMultibRep, broadcast.multibandReporting);
  set(message, &Config::setCsPagemode, broadcast.pageMode);
  set(message, &Config::setSi78Broadcast, broadcast.moreSelection);
  set(message, &Config::setCbchSupported, broadcast.cellBroadcast);
  set(message, &Config::setEcsc, broadcast.earlyClassmark);
  set(message, &Config::setSi2TerNeeded, broadcast.secondList);
}

}  // namespace

std::optional<Bytes> gsmCellReport(const Picture& picture, std::uint64_t timeMs) {
  const GsmPicture& gsm = picture.gsm;
  if (!gsm.cell) return std::nullopt;
  KCellularGsmScellInfo message;
  message.setTimestamp(timeMs);
  if (const auto network = ownNetwork(gsm)) {
    message.setMcc(network->mcc);
    message.setMnc(network->mnc);
    message.setNumMncDigits(network->mncDigits);
  }
  message.setLac(gsm.cell->area.lac);
  message.setCellId(gsm.cell->cellId);
  if (const GsmCamp* camp = gsm.ownCamp()) {
    set(message, &KCellularGsmScellInfo::setGsmBand, camp->carrier.band);
    message.setArfcn(camp->carrier.arfcn);
    message.setBsic(camp->bsic);
  }
  if (gsm.dedicated) message.setState(*gsm.dedicated ? kDedicated : kNotDedicated);
  return message.data();
}

std::optional<Bytes> gsmIdleConfigReport(const Picture& picture, std::uint64_t timeMs) {
  const GsmPicture& gsm = picture.gsm;
  if (!gsm.cell && gsm.broadcast == GsmBroadcast{}) return std::nullopt;
  KCellularGsmIdleConfig message;
  message.setTimestamp(timeMs);
  if (const GsmCamp* camp = gsm.ownCamp()) {
    message.setArfcnBcch(camp->carrier.arfcn);
    message.setBsic(camp->bsic);
    set(message, &KCellularGsmIdleConfig::setGsmBand, camp->carrier.band);
  }
  if (const auto network = ownNetwork(gsm)) {
    message.setMcc(network->mcc);
    message.setMnc(network->mnc);
  }
  if (gsm.cell) {
    message.setLac(gsm.cell->area.lac);
    message.setCi(gsm.cell->cellId);
  }
  addBroadcast(gsm.broadcast, message);
  return message.data();
}

std::optional<Bytes> gsmIdleLevelReport(const Picture& picture, std::uint64_t timeMs) {
  const auto& level = picture.gsm.idleLevel;
  if (!level) return std::nullopt;
  KCellularGsmIdleScellMeasurement message;
  message.setTimestamp(timeMs);
  set(message, &KCellularGsmIdleScellMeasurement::setScellArfcn, level->arfcn);
  message.setIdleRxlevDBm(rounded(level->dbm));
  return message.data();
}

std::optional<Bytes> gsmCallReport(const Picture& picture, std::uint64_t timeMs) {
  const auto& level = picture.gsm.callLevel;
  if (!level) return std::nullopt;
  KCellularGsmCsRfMeasurement message;
  message.setTimestamp(timeMs);
  if (const GsmCamp* camp = picture.gsm.ownCamp()) {
    message.setScellArfcn(camp->carrier.arfcn);
    set(message, &KCellularGsmCsRfMeasurement::setScellBand, camp->carrier.band);
  }
  message.setCsRxlevSub(level->rxlevSub);
  message.setCsRxqualSub(level->rxqualSub);
  return message.data();
}

std::optional<Bytes> gsmPacketConfigReport(const Picture& picture, std::uint64_t timeMs) {
  using Config = KCellularGsmGprsConfig;
  const GsmBroadcast& broadcast = picture.gsm.broadcast;
  if (!broadcast.packetService && !broadcast.packetRules) return std::nullopt;
  Config message;
  message.setTimestamp(timeMs);
  // Its rules are sent only where there is packet service.
  message.setGprsSup(broadcast.packetService.value_or(true));
  if (broadcast.selection) set(message, &Config::setCrHyst, broadcast.selection->hysteresisDb);
  if (const auto& rules = broadcast.packetRules) {
    message.setRac(rules->routingArea);
    message.setSpPgCy(rules->splitPaging);
    message.setNco(rules->controlOrder);
    set(message, &Config::setNom, rules->operationMode);
    message.setAccThr(rules->priorityAccess);
    set(message, &Config::setExtUplTbfSupported, rules->extendedUplink);
  }
  return message.data();
}

std::optional<Bytes> gsmNeighboursReport(const Picture& picture, std::uint64_t timeMs) {
  const auto& neighbours = picture.gsm.neighbours;
  if (!neighbours) return std::nullopt;
  KCellularGsmGrrEventMeasCr message;
  message.setTimestamp(timeMs);
  for (const GsmNeighbour& cell : *neighbours) {
    auto entry = makeMessage<GsmNcellMeas>();
    entry->setArfcn(cell.arfcn);
    set(*entry, &GsmNcellMeas::setBsic, cell.bsic);
    entry->setRxlev(rxlevIndex(cell.levelDbm));
    message.addGsmNcellMeas(entry);
  }
  return message.data();
}

}  // namespace qel::diagnostics
