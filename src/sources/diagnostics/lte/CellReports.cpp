#include "sources/diagnostics/lte/CellReports.h"

#include <memory>

#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/runtime/MessageReader.h"
#include "radio/Bands.h"
#include "radio/Levels.h"
#include "sources/Filling.h"
#include "sources/diagnostics/lte/Bandwidth.h"

namespace qel::diagnostics {
namespace {

using sources::set;

// Of SecondaryCarrierState.
constexpr std::int32_t kConfigured = 1;
constexpr std::int32_t kActivated = 2;

std::int32_t hundredths(double value) { return rounded(value * 100); }

// Of each quantity by itself the best antenna's, as the modem combines them.
void setLevels(const LteAntennas& antennas, SecondaryComponentCarrier& entry) {
  std::optional<double> rsrp, rsrq, rssi, snr;
  const auto take = [](std::optional<double>& best, std::optional<double> value) {
    if (value && (!best || *value > *best)) best = value;
  };
  for (const auto& antenna : antennas) {
    if (!antenna) continue;
    take(rsrp, antenna->rsrpDbm);
    take(rsrq, antenna->rsrqDb);
    take(rssi, antenna->rssiDbm);
    take(snr, antenna->snrDb);
  }
  if (rsrp) entry.setRsrp(hundredths(*rsrp));
  if (rsrq) entry.setRsrq(hundredths(*rsrq));
  if (rssi) entry.setRssi(hundredths(*rssi));
  if (snr) entry.setSnr(hundredths(*snr));
}

std::shared_ptr<SecondaryComponentCarrier> entryOf(const SecondaryCarrier& carrier) {
  auto entry = makeMessage<SecondaryComponentCarrier>();
  entry->setIndex(carrier.index);
  entry->setState(carrier.active.value_or(false) ? kActivated : kConfigured);
  set(*entry, &SecondaryComponentCarrier::setPci, carrier.pci);
  set(*entry, &SecondaryComponentCarrier::setDlEarfcn, carrier.earfcn);
  set(*entry, &SecondaryComponentCarrier::setDlRfBand, carrier.band);
  set(*entry, &SecondaryComponentCarrier::setDlBandwidth, carrier.bandwidth);
  entry->setHasUplink(carrier.hasUplink);
  set(*entry, &SecondaryComponentCarrier::setUlEarfcn, carrier.ulEarfcn);
  set(*entry, &SecondaryComponentCarrier::setUlRfBand, carrier.ulBand);
  set(*entry, &SecondaryComponentCarrier::setUlBandwidth, carrier.ulBandwidth);
  if (carrier.signal) setLevels(carrier.signal->antennas, *entry);
  return entry;
}

void add(const LteServingCell& cell, KCellularLteScellInfo& message) {
  message.setPhyCellId(cell.name.pci);
  message.setDlFreq(cell.name.earfcn);
  message.setUlFreq(cell.ulEarfcn);
  set(message, &KCellularLteScellInfo::setDlBw, cell.dlBandwidth);
  set(message, &KCellularLteScellInfo::setUlBw, cell.ulBandwidth);
  message.setCellId(cell.cellId);
  message.setFreqBandInd(cell.band);
  message.setTrackingAreaCode(cell.area);
  message.setNumMncDigits(cell.mncDigits);
  message.setSelPlmnMcc(cell.mcc);
  message.setSelPlmnMnc(cell.mnc);
}

// Of several networks that share the cell it does not say which one was selected.
void addNetwork(const std::vector<rrc::lte::Plmn>& networks, KCellularLteScellInfo& message) {
  if (networks.size() != 1 || !networks[0].mcc) return;
  message.setNumMncDigits(networks[0].mncDigits);
  message.setSelPlmnMcc(*networks[0].mcc);
  message.setSelPlmnMnc(networks[0].mnc);
}

void addBroadcast(const LteRules& rules, const std::optional<LteBroadcast>& bandwidth,
                  KCellularLteScellInfo& message) {
  message.setPhyCellId(rules.cell.pci);
  message.setDlFreq(rules.cell.earfcn);
  if (bandwidth && bandwidth->name == rules.cell) {
    set(message, &KCellularLteScellInfo::setDlBw, bandwidth->dlBandwidth);
  }
  message.setCellId(rules.sib1->cellIdentity);
  message.setFreqBandInd(rules.sib1->band);
  message.setTrackingAreaCode(rules.sib1->trackingAreaCode);
  addNetwork(rules.sib1->plmns, message);
  if (!rules.sib2) return;
  set(message, &KCellularLteScellInfo::setUlFreq, rules.sib2->ulEarfcn);
  if (rules.sib2->ulBandwidthBlocks) {
    set(message, &KCellularLteScellInfo::setUlBw, bandwidthCode(*rules.sib2->ulBandwidthBlocks));
  }
}

// That there are none is told as well, once the network has said so in that cell.
bool knowsCarriers(const LtePicture& lte) { return lte.carriersTold || !lte.carriers.empty(); }

}  // namespace

std::optional<Bytes> lteCell(const Picture& picture, std::uint64_t timeMs) {
  const LtePicture& lte = picture.lte;
  const LteRules* broadcast = lte.serverUnread();
  if (!lte.serving && !broadcast) return std::nullopt;
  KCellularLteScellInfo message;
  message.setTimestamp(timeMs);
  if (lte.serving) {
    add(*lte.serving, message);
  } else {
    addBroadcast(*broadcast, lte.broadcast, message);
  }
  const auto& rules = lte.rules;
  if (rules && rules->cell == lte.camped && rules->sib1 && rules->sib1->tdd) {
    message.setTddSfAssignment(rules->sib1->tdd->subframeAssignment);
    message.setTddSsfPatterns(rules->sib1->tdd->specialSubframePattern);
  }
  return message.data();
}

std::optional<Bytes> lteNeighbours(const Picture& picture, std::uint64_t timeMs) {
  KCellularLteNbrEutraCellMeas message;
  message.setTimestamp(timeMs);
  bool any = false;
  for (const LteNeighbour& neighbour : picture.lte.neighbours.cells()) {
    if (neighbour.cell == picture.lte.measuredFrom) continue;
    auto entry = makeMessage<EgwErrcNbrEutraMeas>();
    entry->setNbrPhysCellId(neighbour.cell.pci);
    if (neighbour.cell.earfcn != kUnknownEarfcn) {
      entry->setNbrEarfcn(neighbour.cell.earfcn);
      set(*entry, &EgwErrcNbrEutraMeas::setFreqBandInd, lteBandOf(neighbour.cell.earfcn));
    }
    set(*entry, &EgwErrcNbrEutraMeas::setNbrRsrp, neighbour.rsrpDbm, rsrpIndex);
    set(*entry, &EgwErrcNbrEutraMeas::setNbrRsrq, neighbour.rsrqDb, rsrqIndex);
    message.addMeasNbrEutra(entry);
    any = true;
  }
  return any ? std::optional(message.data()) : std::nullopt;
}

std::optional<Bytes> lteCarriers(const Picture& picture, std::uint64_t timeMs) {
  if (!knowsCarriers(picture.lte)) return std::nullopt;
  KCellularLteCarrierAggregationStatus message;
  message.setTimestamp(timeMs);
  for (const SecondaryCarrier& carrier : picture.lte.carriers) message.addSccList(entryOf(carrier));
  return message.data();
}

std::optional<Bytes> lteComponents(const Picture& picture, std::uint64_t timeMs) {
  const LtePicture& lte = picture.lte;
  if (!knowsCarriers(lte)) return std::nullopt;
  KCellularLteComponentCarrierInfo message;
  message.setTimestamp(timeMs);
  if (lte.camped) message.setPccEarfcn(lte.camped->earfcn);
  if (lte.serving && lte.serving->name == lte.camped) {
    set(message, &KCellularLteComponentCarrierInfo::setPccBandwidth, lte.serving->dlBandwidth);
  }
  if (!lte.carriers.empty()) {
    const SecondaryCarrier& first = lte.carriers.front();
    set(message, &KCellularLteComponentCarrierInfo::setScc0Earfcn, first.earfcn);
    set(message, &KCellularLteComponentCarrierInfo::setScc0Bandwidth, first.bandwidth);
  }
  if (lte.carriers.size() > 1) {
    const SecondaryCarrier& second = lte.carriers[1];
    set(message, &KCellularLteComponentCarrierInfo::setScc1Earfcn, second.earfcn);
    set(message, &KCellularLteComponentCarrierInfo::setScc1Bandwidth, second.bandwidth);
  }
  return message.data();
}

}  // namespace qel::diagnostics
