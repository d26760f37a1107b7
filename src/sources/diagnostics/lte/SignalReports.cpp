#include "sources/diagnostics/lte/SignalReports.h"

#include <memory>

#include "messages/lte_serving.h"
#include "sources/Filling.h"
#include "sources/Levels.h"

namespace qel::diagnostics {
namespace {

using sources::rounded;

// The list's places are the antennas: one that received nothing keeps its place, empty.
void addReceivers(const LteAntennas& antennas, KCellularLteServingCellMeasurement& message) {
  std::size_t count = antennas.size();
  while (count > 0 && !antennas[count - 1]) --count;
  for (std::size_t i = 0; i < count; ++i) {
    auto receiver = std::make_shared<RxInfo>();
    if (const auto& antenna = antennas[i]) {
      receiver->setRssi(rounded(antenna->rssiDbm));
      receiver->setRsrpRange(sources::rsrpIndex(antenna->rsrpDbm));
      receiver->setRsrqRange(sources::rsrqIndex(antenna->rsrqDb));
      if (antenna->snrDb) receiver->setSnr(rounded(*antenna->snrDb));
    }
    message.addRxInfo(receiver);
  }
}

std::shared_ptr<RsrpRsrqSinr> sampleOf(const LteSignal& signal) {
  auto sample = std::make_shared<RsrpRsrqSinr>();
  sample->setPhyCellId(signal.cell.pci);
  if (const auto& antenna = signal.antennas[0]) {
    sample->setRsrp0(rounded(antenna->rsrpDbm));
    sample->setRsrq0(rounded(antenna->rsrqDb));
    if (antenna->snrDb) sample->setSinr0(rounded(*antenna->snrDb * 2));  // half dB
  }
  if (const auto& antenna = signal.antennas[1]) {
    sample->setRsrp1(rounded(antenna->rsrpDbm));
    sample->setRsrq1(rounded(antenna->rsrqDb));
    if (antenna->snrDb) sample->setSinr1(rounded(*antenna->snrDb * 2));
  }
  return sample;
}

void addPower(const LteTransmissions& transmissions, void (TxPowerInfo::*set)(std::int32_t),
              KCellularLteTxPower& message) {
  for (const LteTransmission& transmission : transmissions.list) {
    auto entry = std::make_shared<TxPowerInfo>();
    ((*entry).*set)(transmission.powerDbm);
    entry->setSubframeIndex(transmission.subframe);
    message.addTxPowerInfo(entry);
  }
}

}  // namespace

std::optional<Bytes> lteMeasurement(const Picture& picture, std::uint64_t timeMs) {
  const auto& signal = picture.lte.signal;
  if (!signal) return std::nullopt;
  KCellularLteServingCellMeasurement message;
  message.setTimestamp(timeMs);
  if (const auto& state = picture.lte.connection.rrc.state) {
    message.setIsConnectedMode(*state == LteRrcState::kConnected);
  }
  addReceivers(signal->antennas, message);
  return message.data();
}

// One sample, which is its own average.
std::optional<Bytes> lteQuality(const Picture& picture, std::uint64_t timeMs) {
  const auto& signal = picture.lte.signal;
  if (!signal) return std::nullopt;
  KCellularLteRsrpRsrqSinr message;
  message.setTimestamp(timeMs);
  message.setNumSamples(1);
  message.setAvgValues(sampleOf(*signal));
  message.addInstValues(sampleOf(*signal));
  return message.data();
}

std::optional<Bytes> lteTxPower(const Picture& picture, std::uint64_t timeMs) {
  const LtePicture& lte = picture.lte;
  if (lte.pusch.list.empty() && lte.pucch.list.empty()) return std::nullopt;
  KCellularLteTxPower message;
  message.setTimestamp(timeMs);
  addPower(lte.pusch, &TxPowerInfo::setPuschTxPower, message);
  addPower(lte.pucch, &TxPowerInfo::setPucchTxPower, message);
  return message.data();
}

}  // namespace qel::diagnostics
