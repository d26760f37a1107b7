// What setup, reconfiguration and re-establishment change of a connection.

#include <array>

#include "rrc/lte/Readers.h"
#include "rrc/lte_schema.h"

namespace qel::rrc::lte {
namespace {

constexpr std::array<unsigned, 16> kLongCyclesMs = {10,  20,  32,  40,  64,   80,   128,  160,
                                                    256, 320, 512, 640, 1024, 1280, 2048, 2560};
constexpr std::array<unsigned, 2> kLongCyclesOfRelease11Ms = {60, 70};

template <std::size_t size>
void takeCycle(const Node& node, const std::array<unsigned, size>& cyclesMs, Drx& drx) {
  const auto index = node.index();
  if (!index || static_cast<std::size_t>(*index) >= size) return;
  drx.longCycleMs = cyclesMs[static_cast<std::size_t>(*index)];
  take(node.first(), drx.startOffsetMs);
}

Drx drxFrom(const Node& node, const Node& message) {
  Drx drx;
  take(node[mark::onDurationTimer], drx.onDurationMs);
  take(node[mark::drxInactivityTimer], drx.inactivityMs);
  take(node[mark::drxRetransmissionTimer], drx.retransmissionMs);
  takeCycle(node[mark::longDRXCycleStartOffset], kLongCyclesMs, drx);
  take(node[mark::shortDRXCycle], drx.shortCycleMs);
  take(node[mark::drxShortCycleTimer], drx.shortCycles);

  const Node release11 = message[mark::drxConfigV1130];
  take(release11[mark::drxRetransmissionTimerV1130], drx.retransmissionMs);
  takeCycle(release11[mark::longDRXCycleStartOffsetV1130], kLongCyclesOfRelease11Ms, drx);
  if (drx.shortCycleMs) take(release11[mark::shortDRXCycleV1130], drx.shortCycleMs);
  if (const Node offset = message[mark::drxConfigV1310][mark::sf60V1310]) {
    drx.longCycleMs = kLongCyclesOfRelease11Ms.front();
    take(offset, drx.startOffsetMs);
  }
  const Node release13 = message[mark::drxConfigR13];
  take(release13[mark::onDurationTimerV1310], drx.onDurationMs);
  take(release13[mark::drxRetransmissionTimerV1310], drx.retransmissionMs);
  return drx;
}

SecondaryCell secondaryCellFrom(const Node& node) {
  SecondaryCell cell;
  take(node[mark::sCellIndexR10], cell.index);
  take(node[mark::physCellIdR10], cell.pci);
  take(node[mark::dlCarrierFreqR10], cell.dlEarfcn);
  take(node[mark::dlCarrierFreqV1090], cell.dlEarfcn);
  take(node[mark::dlBandwidthR10], cell.dlBandwidthBlocks);
  take(node[mark::transmissionModeR10], cell.transmissionMode);
  const Node uplink = node[mark::ulConfigurationR10];
  cell.uplink = static_cast<bool>(uplink);
  take(uplink[mark::ulCarrierFreqR10], cell.ulEarfcn);
  take(node[mark::ulCarrierFreqV1090], cell.ulEarfcn);
  take(uplink[mark::ulBandwidthR10], cell.ulBandwidthBlocks);
  return cell;
}

Handover handoverFrom(const Node& node) {
  Handover handover;
  take(node[mark::targetPhysCellId], handover.pci);
  take(node[mark::dlCarrierFreq], handover.dlEarfcn);
  take(node[mark::ulCarrierFreq], handover.ulEarfcn);
  take(node[mark::dlCarrierFreqV9e0], handover.dlEarfcn);
  take(node[mark::ulCarrierFreqV9e0], handover.ulEarfcn);
  take(node[mark::dlBandwidth], handover.dlBandwidthBlocks);
  take(node[mark::ulBandwidth], handover.ulBandwidthBlocks);
  return handover;
}

}  // namespace

std::optional<RadioConfiguration> radioFrom(const Node& message) {
  constexpr std::int64_t kSetup = 1;
  constexpr std::int64_t kDefault = 1;
  const Node drx = message[mark::drxConfig];
  const Node later = message[mark::antennaInfoR10];
  const Node antenna = later ? later : message[mark::antennaInfo];
  if (!drx && !antenna) return std::nullopt;
  RadioConfiguration radio;
  if (drx) {
    radio.drx.emplace();
    if (drx.index() == kSetup) radio.drx->setup = drxFrom(drx, message);
  }
  radio.defaultTransmissionMode = antenna.index() == kDefault;
  take(antenna[mark::transmissionMode], radio.transmissionMode);
  take(antenna[mark::transmissionModeR10], radio.transmissionMode);
  return radio;
}

Reconfiguration reconfigurationFrom(const Node& message) {
  Reconfiguration result;
  if (const Node node = message[mark::measConfig]) result.measurements = measurementsFrom(node);
  if (const Node node = message[mark::mobilityControlInfo]) result.handover = handoverFrom(node);
  result.removedSecondaryCells = numbersOf(message[mark::sCellToReleaseListR10]);
  message[mark::sCellToAddModListR10].each(
      [&](const Node& element) { result.secondaryCells.push_back(secondaryCellFrom(element)); });
  result.fullConfiguration = static_cast<bool>(message[mark::fullConfigR9]);
  return result;
}

}  // namespace qel::rrc::lte
