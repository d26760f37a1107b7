// What the phone measures and sends on LTE.
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/runtime/MessageReader.h"
#include "sources/simulated/Random.h"
#include "sources/simulated/Reports.h"

namespace qel::sources {
namespace {

constexpr std::size_t kMostNeighbours = 8;
constexpr std::size_t kMostOfOthers = 6;
constexpr std::uint32_t kSampleMs = 200;

// The uplink's subframes that a report covers, two of each half frame.
constexpr std::array<std::uint32_t, 4> kSubframes = {2, 3, 7, 8};

// Power control (36.213, clause 5.1): the target at the mast for one resource block, the part of
// the path loss that is made up for, and what the mast says it sends its reference signal with.
constexpr double kPuschTargetDbm = -86;
constexpr double kPuschPart = 0.8;
constexpr double kPucchTargetDbm = -112;
constexpr double kReferenceSignalDbm = 15;

double clampedPower(double dbm) { return std::clamp(dbm, kLeastPowerDbm, kMostPowerDbm); }

// SINR in half dB.
std::shared_ptr<RsrpRsrqSinr> sampleOf(const QualitySample& sample) {
  auto message = makeMessage<RsrpRsrqSinr>();
  const CellSignal& signal = sample.signal;
  message->setPhyCellId(sample.code);
  message->setRsrp0(std::max(-140, rounded(signal.antennaDbm[0])));
  message->setRsrp1(std::max(-140, rounded(signal.antennaDbm[1])));
  message->setRsrq0(std::max(-30, rounded(signal.antennaQualityDb[0])));
  message->setRsrq1(std::max(-30, rounded(signal.antennaQualityDb[1])));
  message->setSinr0(std::clamp(rounded(signal.antennaSinrDb[0] * 2), -40, 60));
  message->setSinr1(std::clamp(rounded(signal.antennaSinrDb[1] * 2), -40, 60));
  return message;
}

std::shared_ptr<RsrpRsrqSinr> averageOf(const std::vector<QualitySample>& samples) {
  QualitySample average{samples.back().code, {}};
  const auto count = static_cast<double>(samples.size());
  for (const QualitySample& sample : samples) {
    for (std::size_t i = 0; i < kAntennas; ++i) {
      average.signal.antennaDbm[i] += sample.signal.antennaDbm[i] / count;
      average.signal.antennaQualityDb[i] += sample.signal.antennaQualityDb[i] / count;
      average.signal.antennaSinrDb[i] += sample.signal.antennaSinrDb[i] / count;
    }
  }
  return sampleOf(average);
}

std::shared_ptr<SecondaryComponentCarrier> carrierOf(const PhoneView& view, std::size_t number) {
  const SecondaryCell& secondary = view.phone.aggregation().cells()[number];
  const Cell& cell = cells()[secondary.cell];
  const CellSignal& signal = view.scene.of(secondary.cell);
  const Layer& layer = layerOf(cell);
  const auto hundredths = [](double value) { return rounded(value * 100); };
  auto carrier = makeMessage<SecondaryComponentCarrier>();
  carrier->setIndex(static_cast<std::uint32_t>(number + 1));
  carrier->setState(secondary.activated ? kSccActivated : kSccDeactivated);
  carrier->setPci(cell.code);
  carrier->setDlEarfcn(cell.channel);
  carrier->setDlRfBand(layer.band);
  carrier->setDlBandwidth(layer.bandwidthCode);
  carrier->setHasUplink(false);
  carrier->setRsrp(hundredths(signal.levelDbm));
  carrier->setRsrq(hundredths(signal.qualityDb));
  carrier->setSnr(hundredths(view.scene.sinrDb(secondary.cell)));
  carrier->setRssi(hundredths(signal.antennaRssiDbm[0]));
  return carrier;
}

}  // namespace

std::optional<Bytes> lteServingMeasurement(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte)) return std::nullopt;
  KCellularLteServingCellMeasurement message;
  message.setTimestamp(timeMs);
  message.setIsConnectedMode(view.phone.connection().connected());
  for (std::size_t i = 0; i < kAntennas; ++i) {
    auto receiver = makeMessage<RxInfo>();
    receiver->setRssi(rounded(view.signal().antennaRssiDbm[i]));
    receiver->setRsrpRange(rsrpIndex(view.signal().antennaDbm[i]));
    receiver->setRsrqRange(rsrqIndex(view.signal().antennaQualityDb[i]));
    receiver->setSnr(std::clamp(rounded(view.signal().antennaSinrDb[i]), -20, 30));
    message.addRxInfo(receiver);
  }
  return message.data();
}

std::optional<Bytes> lteTxPower(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte) || !view.phone.connection().connected()) return std::nullopt;
  const double pathLossDb = kReferenceSignalDbm - view.signal().levelDbm;
  KCellularLteTxPower message;
  message.setTimestamp(timeMs);
  for (const std::uint32_t subframe : kSubframes) {
    // Each subframe has another share of the carrier.
    const auto blocks = static_cast<double>(1 + scramble(timeMs, subframe) % 24);
    auto power = makeMessage<TxPowerInfo>();
    power->setPucchTxPower(rounded(clampedPower(kPucchTargetDbm + pathLossDb)));
    power->setPuschTxPower(
        rounded(clampedPower(kPuschTargetDbm + 10 * std::log10(blocks) + kPuschPart * pathLossDb)));
    power->setSubframeIndex(subframe);
    message.addTxPowerInfo(power);
  }
  return message.data();
}

std::optional<Bytes> lteRsrpRsrqSinr(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte)) return std::nullopt;
  // Screens take the first sample for granted.
  std::vector<QualitySample> samples = view.samples;
  if (samples.empty()) samples.push_back({view.cell().code, view.signal()});
  KCellularLteRsrpRsrqSinr message;
  message.setTimestamp(timeMs);
  message.setSamplePeriodMs(kSampleMs);
  message.setDurationMs(static_cast<std::uint32_t>(samples.size()) * kSampleMs);
  message.setNumSamples(static_cast<std::uint32_t>(samples.size()));
  message.setAvgValues(averageOf(samples));
  for (const QualitySample& sample : samples) message.addInstValues(sampleOf(sample));
  return message.data();
}

std::optional<Bytes> lteComponentCarriers(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte)) return std::nullopt;
  const auto& secondary = view.phone.aggregation().cells();
  KCellularLteComponentCarrierInfo message;
  message.setTimestamp(timeMs);
  message.setPccEarfcn(view.cell().channel);
  message.setPccBandwidth(layerOf(view.cell()).bandwidthCode);
  if (!secondary.empty()) {
    message.setScc0Earfcn(cells()[secondary[0].cell].channel);
    message.setScc0Bandwidth(layerOf(cells()[secondary[0].cell]).bandwidthCode);
  }
  if (secondary.size() > 1) {
    message.setScc1Earfcn(cells()[secondary[1].cell].channel);
    message.setScc1Bandwidth(layerOf(cells()[secondary[1].cell]).bandwidthCode);
  }
  return message.data();
}

std::optional<Bytes> lteCarrierAggregation(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte)) return std::nullopt;
  KCellularLteCarrierAggregationStatus message;
  message.setTimestamp(timeMs);
  for (std::size_t i = 0; i < view.phone.aggregation().cells().size(); ++i) {
    message.addSccList(carrierOf(view, i));
  }
  return message.data();
}

std::optional<Bytes> lteNeighbours(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte)) return std::nullopt;
  KCellularLteNbrEutraCellMeas message;
  message.setTimestamp(timeMs);
  for (const std::size_t cell : neighbours(view, Technology::lte, kMostNeighbours)) {
    auto entry = makeMessage<EgwErrcNbrEutraMeas>();
    entry->setNbrEarfcn(cells()[cell].channel);
    entry->setNbrPhysCellId(cells()[cell].code);
    entry->setFreqBandInd(layerOf(cells()[cell]).band);
    entry->setNbrRsrp(static_cast<std::int32_t>(rsrpIndex(view.scene.of(cell).levelDbm)));
    entry->setNbrRsrq(static_cast<std::int32_t>(rsrqIndex(view.scene.of(cell).qualityDb)));
    message.addMeasNbrEutra(entry);
  }
  return message.data();
}

std::optional<Bytes> lteInterRat(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte)) return std::nullopt;
  KCellularLteNbrInterRatCellMeas message;
  message.setTimestamp(timeMs);
  for (const std::size_t cell : neighbours(view, Technology::umts, kMostOfOthers)) {
    auto entry = makeMessage<EgwErrcNbrUtraMeas>();
    entry->setUarfcn(cells()[cell].channel);
    entry->setPsc(cells()[cell].code);
    entry->setRscp(static_cast<std::int32_t>(rscpIndex(view.scene.of(cell).levelDbm)));
    entry->setEcno(ecnoIndex(view.scene.of(cell).qualityDb));
    message.addMeasNbrUtra(entry);
  }
  for (const std::size_t cell : neighbours(view, Technology::gsm, kMostOfOthers)) {
    auto entry = makeMessage<EgwErrcNbrGeranMeas>();
    entry->setArfcn(cells()[cell].channel);
    entry->setBsic(cells()[cell].code);
    entry->setRxlev(rxlevIndex(view.scene.of(cell).levelDbm));
    message.addMeasNbrGeran(entry);
  }
  return message.data();
}

CellList neighbours(const PhoneView& view, Technology technology, std::size_t most) {
  CellList found;
  for (std::size_t cell = 0; cell < view.scene.size(); ++cell) {
    if (cell == view.phone.servingIndex() || !view.scene.of(cell).detected) continue;
    if (layerOf(cells()[cell]).technology == technology) found.push_back(cell);
  }
  std::ranges::sort(found, [&](std::size_t a, std::size_t b) {
    const double levelOfA = view.scene.of(a).levelDbm;
    const double levelOfB = view.scene.of(b).levelDbm;
    return levelOfA > levelOfB || (levelOfA == levelOfB && a < b);
  });
  found.resize(std::min(found.size(), most));
  return found;
}

}  // namespace qel::sources
