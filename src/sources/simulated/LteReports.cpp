// What the LTE cell is and how it is configured.
#include "messages/lte_rrc.h"
#include "messages/lte_serving.h"
#include "messages/runtime/MessageReader.h"
#include "messages/runtime/PBDataWriter.h"
#include "sources/simulated/Reports.h"

namespace qel::sources {
namespace {

constexpr int kLeastQualityDb = -20;
constexpr std::uint32_t kCdrxConfigured = 1;
constexpr std::uint32_t kTransmissionMode = 4;  // closed-loop spatial multiplexing

std::shared_ptr<NbrEutra> otherFrequency(const Layer& layer) {
  auto other = makeMessage<NbrEutra>();
  other->setEarfcn(layer.channel);
  other->setQRxlevMin(layer.minLevelDbm);
  other->setQQualMin(kLeastQualityDb);
  other->setQOffset(0);
  other->setPmax(rounded(kMostPowerDbm));
  other->setDlBw(layer.bandwidthCode);
  other->setThresXHighP(static_cast<std::uint32_t>(layer.highThresholdDb));
  other->setThresXLowP(static_cast<std::uint32_t>(layer.lowThresholdDb));
  other->setThresXHighQ(0);
  other->setThresXLowQ(0);
  other->setPriority(layer.priority);
  other->setFrameType(kFrameFdd);
  other->setBand(layer.band);
  return other;
}

}  // namespace

std::optional<Bytes> lteRrcState(const PhoneView& view, std::uint64_t timeMs) {
  const LteRrcRecord& record = view.phone.connection().lte();
  KCellularLteRrcState message;
  message.setTimestamp(timeMs);
  message.setState(record.state);
  message.setPrevState(record.previous);
  message.setPrevStateDurMs(static_cast<std::uint32_t>(record.previousMs));
  message.setCause(record.cause);
  return message.data();
}

std::optional<Bytes> lteCdrxConfig(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte) || !view.phone.connection().connected()) return std::nullopt;
  // For voice the phone wakes up more often.
  const bool call = view.phone.inCall();
  KCellularLteCdrxConfig message;
  message.setTimestamp(timeMs);
  message.setCellStatus(0);
  message.setOnDurationMs(call ? 8 : 10);
  message.setDrxInactivityMs(call ? 40 : 200);
  message.setDrxRetxTimerMs(8);
  message.setLongDrxCycleMs(call ? 40 : 320);
  message.setShortDrxCycleMs(call ? 20 : 80);
  message.setDrxShortCycleNum(2);
  message.setRrcState(view.phone.connection().lte().state);
  message.setCdrxConfigStatus(kCdrxConfigured);
  message.setTransmissionMode(kTransmissionMode);
  return message.data();
}

// There is no schema for it: time and cause, as its relatives begin.
std::optional<Bytes> lteRadioLinkFailure(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.phone.connection().recovering()) return std::nullopt;
  PBDataWriter writer;
  PBDataWriterWriteUint64Field(writer, timeMs, 1);
  PBDataWriterWriteUint32Field(writer,
                               static_cast<std::uint32_t>(view.phone.connection().lte().cause), 2);
  return writer.takeData();
}

std::optional<Bytes> lteScellInfo(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte)) return std::nullopt;
  const Cell& cell = view.cell();
  const Layer& layer = layerOf(cell);
  KCellularLteScellInfo message;
  message.setTimestamp(timeMs);
  message.setPhyCellId(cell.code);
  message.setDlFreq(cell.channel);
  message.setUlFreq(cell.channel + kUplinkEarfcnOffset);
  message.setDlBw(layer.bandwidthCode);
  message.setUlBw(layer.bandwidthCode);
  message.setCellId(cell.cellId);
  message.setFreqBandInd(layer.band);
  message.setTrackingAreaCode(cell.area);
  message.setNumMncDigits(kMncDigits);
  message.setSelPlmnMcc(kMcc);
  message.setSelPlmnMnc(kMnc);
  return message.data();
}

// The quality threshold for leaving the frequency is not broadcast here: its field, 19, is one that
// no receiver can read.
std::optional<Bytes> lteSelRes(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte)) return std::nullopt;
  const Layer& own = layerOf(view.cell());
  KCellularLteSelReselCellInfo message;
  message.setTimestamp(timeMs);
  message.addMultiBandInfo(own.band);
  message.setImsEmergencySupport(1);
  message.setAcBarringForEmergency(0);
  message.setMoSignallingAcBarringFactor(15);  // as good as never barred
  message.setMoSignallingAcBarringTime(0);
  message.setMoSignallingAcBarringForSpecialAc(0);
  message.setMoDataAcBarringFactor(15);
  message.setMoDataAcBarringTime(0);
  message.setMoDataAcBarringForSpecialAc(0);
  message.setQRxLevMin(own.minLevelDbm);
  message.setQQualMin(kLeastQualityDb);
  message.setQHyst(kHysteresisDb);
  message.setSNonIntraSearchP(kSearchOtherDb);
  message.setSNonIntraSearchQ(0);
  message.setSIntraSearchP(kSearchIntraDb);
  message.setSIntraSearchQ(0);
  message.setThreshServingLowP(static_cast<std::uint32_t>(own.servingLowDb));
  message.setPriorityOperatingFreq(own.priority);
  for (const Layer& layer : layers()) {
    if (layer.technology == Technology::lte && &layer != &own) {
      message.addNbrEutra(otherFrequency(layer));
    }
  }
  return message.data();
}

}  // namespace qel::sources
