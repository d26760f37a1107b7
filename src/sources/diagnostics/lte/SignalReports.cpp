#include "sources/diagnostics/lte/SignalReports.h"

#include <memory>

#include "messages/lte_serving.h"
#include "messages/runtime/MessageReader.h"
#include "radio/Levels.h"
#include "sources/Filling.h"

namespace qel::diagnostics {
namespace {

using sources::set;

// The list's places are the antennas: one that received nothing keeps its place, empty.
void addReceivers(const LteAntennas& antennas, KCellularLteServingCellMeasurement& message) {
  std::size_t count = antennas.size();
  while (count > 0 && !antennas[count - 1]) --count;
  for (std::size_t i = 0; i < count; ++i) {
    auto receiver = makeMessage<RxInfo>();
    if (const auto& antenna = antennas[i]) {
      receiver->setRssi(rounded(antenna->rssiDbm));
      receiver->setRsrpRange(rsrpIndex(antenna->rsrpDbm));
      receiver->setRsrqRange(rsrqIndex(antenna->rsrqDb));
      if (antenna->snrDb) receiver->setSnr(rounded(*antenna->snrDb));
    }
    message.addRxInfo(receiver);
  }
}

// All antennas as one receiver.
void addTogether(const LteLevel& level, KCellularLteServingCellMeasurement& message) {
  auto receiver = makeMessage<RxInfo>();
  if (level.rssiDbm) receiver->setRssi(rounded(*level.rssiDbm));
  receiver->setRsrpRange(rsrpIndex(level.rsrpDbm));
  receiver->setRsrqRange(rsrqIndex(level.rsrqDb));
  message.addRxInfo(receiver);
}

// Nothing while the phone leaves LTE or comes to it.
std::optional<bool> isConnected(const LtePicture& lte) {
  constexpr std::int32_t kEnding = 4;  // the last state that has anything to do with a connection
  const auto state = lte.connection.rrc.state;
  if (!state || *state > kEnding) return std::nullopt;
  return *state >= LteRrcState::kConnected;
}

std::shared_ptr<RsrpRsrqSinr> sampleOf(const LteSignal& signal) {
  auto sample = makeMessage<RsrpRsrqSinr>();
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

void addPower(const LteTransmissions& transmissions, void (TxPowerInfo::*setPower)(std::int32_t),
              KCellularLteTxPower& message) {
  for (const LteTransmission& transmission : transmissions.list) {
    auto entry = makeMessage<TxPowerInfo>();
    ((*entry).*setPower)(transmission.powerDbm);
    entry->setSubframeIndex(transmission.subframe);
    message.addTxPowerInfo(entry);
  }
}

}  // namespace

std::optional<Bytes> lteMeasurement(const Picture& picture, std::uint64_t timeMs) {
  const LtePicture& lte = picture.lte;
  if (!lte.signal && !lte.level) return std::nullopt;
  KCellularLteServingCellMeasurement message;
  message.setTimestamp(timeMs);
  set(message, &KCellularLteServingCellMeasurement::setIsConnectedMode, isConnected(lte));
  if (lte.signal) {
    addReceivers(lte.signal->antennas, message);
  } else {
    addTogether(*lte.level, message);
  }
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
