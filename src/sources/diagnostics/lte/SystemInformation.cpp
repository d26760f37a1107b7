#include "sources/diagnostics/lte/SystemInformation.h"

#include <algorithm>
#include <memory>

#include "messages/lte_serving.h"
#include "messages/runtime/MessageReader.h"
#include "radio/Bands.h"
#include "sources/Filling.h"
#include "sources/Metrics.h"
#include "sources/diagnostics/lte/Bandwidth.h"

namespace qel::diagnostics {
namespace {

using rrc::lte::AccessBarring;
using rrc::lte::EutraCarrier;
using rrc::lte::Sib1;
using rrc::lte::Sib2;
using rrc::lte::Sib3;
using sources::set;
using Rules = KCellularLteSelReselCellInfo;

// As many as the block's first list holds; what its second one adds is left out.
constexpr std::size_t kMostFrequencies = 8;

constexpr int kStepDb = 2;  // of levels; qualities are signalled in dB

// Of NbrEutra::FrameType.
constexpr std::int32_t kFdd = 0;
constexpr std::int32_t kTdd = 1;

std::optional<unsigned> inDb(const std::optional<unsigned>& steps) {
  return steps ? std::optional(*steps * kStepDb) : std::nullopt;
}

// As the cell's first list has them: 64 is the mark of a band that stands in a second list.
void addBands(const Sib1& sib, Rules& report) {
  constexpr unsigned kMark = 64;
  for (const unsigned band : sib.furtherBands) report.addMultiBandInfo(std::min(band, kMark));
}

void add(const Sib1& sib, Rules& report) {
  addBands(sib, report);
  set(report, &Rules::setImsEmergencySupport, sib.imsEmergencySupport);
  report.setQRxLevMin(sib.qRxLevMin * kStepDb);
  set(report, &Rules::setQQualMin, sib.qQualMinDb);
}

// What a cell does not bar it does not speak of.
void add(const Sib2& sib, Rules& report) {
  report.setAcBarringForEmergency(sib.barredForEmergency.value_or(false) ? 1 : 0);
  if (const auto& barring = sib.forSignalling) {
    report.setMoSignallingAcBarringFactor(barring->factorIndex);
    report.setMoSignallingAcBarringTime(barring->timeIndex);
    report.setMoSignallingAcBarringForSpecialAc(barring->specialClasses);
  }
  if (const auto& barring = sib.forData) {
    report.setMoDataAcBarringFactor(barring->factorIndex);
    report.setMoDataAcBarringTime(barring->timeIndex);
    report.setMoDataAcBarringForSpecialAc(barring->specialClasses);
  }
}

// Field 19, the threshold of quality for leaving the frequency, is one that no receiver can read.
void add(const Sib3& sib, Rules& report) {
  report.setQHyst(sib.qHystDb);
  set(report, &Rules::setSNonIntraSearchP, inDb(sib.sNonIntraSearch));
  set(report, &Rules::setSNonIntraSearchQ, sib.sNonIntraSearchQDb);
  set(report, &Rules::setSIntraSearchP, inDb(sib.sIntraSearch));
  set(report, &Rules::setSIntraSearchQ, sib.sIntraSearchQDb);
  report.setThreshServingLowP(sib.threshServingLow * kStepDb);
  report.setPriorityOperatingFreq(sib.priority);
}

bool isTdd(unsigned band) { return (band >= 33 && band <= 54); }

std::shared_ptr<NbrEutra> entryOf(const EutraCarrier& carrier) {
  auto entry = makeMessage<NbrEutra>();
  entry->setEarfcn(carrier.earfcn);
  entry->setQRxlevMin(carrier.qRxLevMin * kStepDb);
  set(*entry, &NbrEutra::setQQualMin, carrier.qQualMinDb);
  entry->setQOffset(carrier.qOffsetDb);
  set(*entry, &NbrEutra::setPmax, carrier.pMaxDbm);
  set(*entry, &NbrEutra::setDlBw, bandwidthCode(carrier.measuredBandwidthBlocks));
  entry->setThresXHighP(carrier.threshXHigh * kStepDb);
  entry->setThresXLowP(carrier.threshXLow * kStepDb);
  set(*entry, &NbrEutra::setThresXHighQ, carrier.threshXHighQDb);
  set(*entry, &NbrEutra::setThresXLowQ, carrier.threshXLowQDb);
  set(*entry, &NbrEutra::setPriority, carrier.priority);
  if (const auto band = lteBandOf(carrier.earfcn)) {
    entry->setFrameType(isTdd(*band) ? kTdd : kFdd);
    entry->setBand(*band);
  }
  return entry;
}

template <class Block>
bool keep(const std::optional<Block>& said, std::optional<Block>& kept) {
  if (said) kept = said;
  return said.has_value();
}

}  // namespace

void takeSystemInformation(const rrc::LteMessage& message, const LteCellName& cell,
                           Picture& picture, Told& told) {
  if (!message.sib1 && !message.sib2 && !message.sib3 && !message.sib5) return;
  auto& rules = picture.lte.rules;
  if (!rules || rules->cell != cell) rules = LteRules{cell, {}, {}, {}, {}};
  keep(message.sib1, rules->sib1);
  keep(message.sib2, rules->sib2);
  keep(message.sib3, rules->sib3);
  keep(message.sib5, rules->sib5);
  told.tell(metric::kLteSelRes);
  if (picture.lte.serverUnread()) told.tell(metric::kLteScellInfo);
}

std::optional<Bytes> lteRules(const Picture& picture, std::uint64_t timeMs) {
  const auto& rules = picture.lte.rules;
  if (!rules) return std::nullopt;
  Rules report;
  report.setTimestamp(timeMs);
  if (rules->sib1) add(*rules->sib1, report);
  if (rules->sib2) add(*rules->sib2, report);
  if (rules->sib3) add(*rules->sib3, report);
  if (rules->sib5) {
    auto carriers = rules->sib5->carriers;
    if (carriers.size() > kMostFrequencies) carriers.resize(kMostFrequencies);
    std::ranges::stable_sort(carriers, {}, &EutraCarrier::earfcn);
    for (const EutraCarrier& carrier : carriers) report.addNbrEutra(entryOf(carrier));
  }
  return report.data();
}

}  // namespace qel::diagnostics
