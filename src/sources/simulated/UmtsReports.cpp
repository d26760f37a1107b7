// What the phone reports on UMTS.
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/runtime/MessageReader.h"
#include "messages/wcdma.h"
#include "sources/simulated/Reports.h"

namespace qel::sources {
namespace {

constexpr std::size_t kMostNeighbours = 6;
constexpr int kLeastQualityDb = -18;    // Qqualmin (25.304, clause 5.2.3.1.2)
constexpr int kUmtsSearchIntraDb = 16;  // 25.304, clause 5.2.6.1.1
constexpr int kUmtsSearchInterDb = 14;
constexpr int kUmtsSearchTechnologyDb = 8;
constexpr std::uint32_t kPagingCycleMs = 640;
// Open-loop power control (25.331, clause 8.5.3): transmit power plus RSCP.
constexpr double kPowerOverRscpDbm = -88;

bool connected(const PhoneView& view) { return view.phone.connection().connected(); }

}  // namespace

std::optional<Bytes> umtsRrcState(const PhoneView& view, std::uint64_t timeMs) {
  const UmtsRrcRecord& record = view.phone.connection().umts();
  KCellularWcdmaRrcConnectionState message;
  message.setTimestamp(timeMs);
  message.setState(record.state);
  message.setEstablishmentCause(record.establishmentCause);
  message.setReleaseCause(record.releaseCause);
  return message.data();
}

std::optional<Bytes> umtsRrcConfig(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::umts)) return std::nullopt;
  KCellularWcdmaRrcConfiguration message;
  message.setTimestamp(timeMs);
  message.setDrxCycleLengthMs(kPagingCycleMs);
  message.setIsMimoConfigured(false);
  message.setIsDcConfigured(connected(view) && view.phone.connection().purpose() == Purpose::data);
  return message.data();
}

std::optional<Bytes> umtsCellInfo(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::umts)) return std::nullopt;
  const Cell& cell = view.cell();
  KCellularWcdmaCellInfo message;
  message.setTimestamp(timeMs);
  message.setMcc(kMcc);
  message.setMnc(kMnc);
  message.setLac(cell.area);
  message.setCellId(cell.cellId);
  message.setWcdmaBand(static_cast<std::int32_t>(layerOf(cell).systemBand));
  message.setDlUarfcn(cell.channel);
  message.setPsc(cell.code);
  message.setNumMncDigits(kMncDigits);
  message.setHspa(kHspaBoth);
  return message.data();
}

// The entries carry LTE's names: here RSCP and Ec/No stand in them, as their own indexes.
std::optional<Bytes> umtsServingMeasurement(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::umts)) return std::nullopt;
  KCellularWcdmaScellMeasurement message;
  message.setTimestamp(timeMs);
  message.setConnectedMode(connected(view));
  for (std::size_t i = 0; i < kAntennas; ++i) {
    auto receiver = makeMessage<RxInfo>();
    receiver->setRssi(rounded(view.signal().antennaRssiDbm[i]));
    receiver->setRsrpRange(rscpIndex(view.signal().antennaDbm[i]));
    receiver->setRsrqRange(ecnoIndex(view.signal().antennaQualityDb[i]));
    receiver->setSnr(rounded(view.signal().antennaSinrDb[i]));
    message.addRxInfo(receiver);
  }
  return message.data();
}

std::optional<Bytes> umtsTxPower(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::umts) || !connected(view)) return std::nullopt;
  const double powerDbm = kPowerOverRscpDbm - view.signal().levelDbm;
  auto power = makeMessage<TxPowerInfo>();
  power->setPuschTxPower(rounded(std::clamp(powerDbm, kLeastPowerDbm, kMostPowerDbm)));
  KCellularWcdmaTxPower message;
  message.setTimestamp(timeMs);
  message.addTxPowerInfo(power);
  return message.data();
}

std::optional<Bytes> umtsSelRes(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::umts)) return std::nullopt;
  const Layer& own = layerOf(view.cell());
  KCellularWcdmaSelReselCellInfo message;
  message.setTimestamp(timeMs);
  message.setHsdpaCapable(1);
  message.setEdchCapable(1);
  message.setDuplexMode(kFrameFdd);
  message.addMultiBandInfo(own.band);
  message.setImsEmergencySupport(0);
  message.setCellBarred(0);
  message.setFachMeasOccInfoPresent(1);
  message.setSRxlev(rounded(view.scene.marginDb(view.phone.servingIndex())));
  message.setSQual(rounded(view.signal().qualityDb - kLeastQualityDb));
  message.setSIntrasearch(kUmtsSearchIntraDb);
  message.setSIntersearch(kUmtsSearchInterDb);
  message.setSSearchRat(kUmtsSearchTechnologyDb);
  message.setSCellPrio(own.priority);
  for (const Layer& layer : layers()) {
    if (layer.technology == Technology::lte) {
      auto frequency = makeMessage<EutraFreqInfo>();
      frequency->setEarfcn(layer.channel);
      frequency->setPrio(layer.priority);
      message.addEutraPrioInfo(frequency);
    } else if (layer.technology == Technology::umts && &layer != &own) {
      auto frequency = makeMessage<UtraFreqInfo>();
      frequency->setUarfcn(layer.channel);
      frequency->setPrio(layer.priority);
      message.addUtraPrioInfo(frequency);
    }
  }
  for (const Cell& cell : cells()) {
    if (layerOf(cell).technology != Technology::gsm || cell.area != view.cell().area) continue;
    auto frequency = makeMessage<GsmFreqInfo>();
    frequency->setArfcn(cell.channel);
    frequency->setPrio(layerOf(cell).priority);
    message.addGsmPrioInfo(frequency);
  }
  return message.data();
}

std::optional<Bytes> umtsNeighbours(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::umts)) return std::nullopt;
  KCellularWcdmaNbrCellMeas message;
  message.setTimestamp(timeMs);
  for (const std::size_t cell : neighbours(view, Technology::umts, kMostNeighbours)) {
    auto entry = makeMessage<UtraCellMeasResult>();
    entry->setUarfcn(cells()[cell].channel);
    entry->setBand(layerOf(cells()[cell]).band);
    entry->setPsc(cells()[cell].code);
    entry->setEcno(ecnoIndex(view.scene.of(cell).qualityDb));
    entry->setRscp(static_cast<std::int32_t>(rscpIndex(view.scene.of(cell).levelDbm)));
    message.addMeasUtraResult(entry);
  }
  for (const std::size_t cell : neighbours(view, Technology::gsm, kMostNeighbours)) {
    auto entry = makeMessage<GsmCellMeasResult>();
    entry->setArfcn(cells()[cell].channel);
    entry->setBsic(cells()[cell].code);
    entry->setRxlev(rxlevIndex(view.scene.of(cell).levelDbm));
    message.addMeasGsmResult(entry);
  }
  for (const std::size_t cell : neighbours(view, Technology::lte, kMostNeighbours)) {
    auto entry = makeMessage<LteCellMeasResult>();
    entry->setEarfcn(cells()[cell].channel);
    entry->setPhyCellId(cells()[cell].code);
    entry->setEutraBand(layerOf(cells()[cell]).band);
    entry->setRsrp(static_cast<std::int32_t>(rsrpIndex(view.scene.of(cell).levelDbm)));
    entry->setRsrq(static_cast<std::int32_t>(rsrqIndex(view.scene.of(cell).qualityDb)));
    message.addMeasLteResult(entry);
  }
  return message.data();
}

}  // namespace qel::sources
