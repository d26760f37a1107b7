#include "rrc/lte/SystemInformation.h"

#include "rrc/lte/Readers.h"
#include "rrc/lte_schema.h"

namespace qel::rrc::lte {
namespace {

Plmn plmnFrom(const Node& element, std::optional<unsigned> mccBefore) {
  Plmn plmn{.mcc = mccBefore};
  const std::vector<unsigned> mcc = numbersOf(element[mark::mcc]);
  if (mcc.size() == 3) plmn.mcc = mcc[0] * 100 + mcc[1] * 10 + mcc[2];
  for (const unsigned digit : numbersOf(element[mark::mnc])) {
    plmn.mnc = plmn.mnc * 10 + digit;
    ++plmn.mncDigits;
  }
  plmn.reservedForOperator = element[mark::cellReservedForOperatorUse].index() == 0;
  return plmn;
}

TddConfiguration tddFrom(const Node& node) {
  TddConfiguration tdd;
  take(node[mark::subframeAssignment], tdd.subframeAssignment);
  take(node[mark::specialSubframePatterns], tdd.specialSubframePattern);
  return tdd;
}

// The bands of a list, each replaced by the wider one where the other list says one.
std::vector<unsigned> bandsFrom(const Node& list, const Node& wider) {
  std::vector<unsigned> bands = numbersOf(list);
  std::size_t place = 0;
  wider.each([&](const Node& element) {
    if (place < bands.size()) take(element[mark::freqBandIndicatorV9e0], bands[place]);
    ++place;
  });
  return bands;
}

AccessBarring barringFrom(const Node& node) {
  AccessBarring barring;
  const Node factor = node[mark::acBarringFactor];
  const Node time = node[mark::acBarringTime];
  barring.factorIndex = static_cast<unsigned>(factor.index().value_or(0));
  barring.timeIndex = static_cast<unsigned>(time.index().value_or(0));
  take(factor, barring.factorPercent);
  take(time, barring.timeS);
  take(node[mark::acBarringForSpecialAC], barring.specialClasses);
  return barring;
}

}  // namespace

std::vector<unsigned> numbersOf(const Node& list) {
  std::vector<unsigned> numbers;
  list.each([&](const Node& element) {
    if (const auto number = element.number()) numbers.push_back(static_cast<unsigned>(*number));
  });
  return numbers;
}

MasterInformationBlock mibFrom(const Node& node) {
  MasterInformationBlock mib;
  take(node[mark::dlBandwidth], mib.dlBandwidthBlocks);
  take(node[mark::systemFrameNumber], mib.sfnHigh);
  return mib;
}

Sib1 sib1From(const Node& node) {
  Sib1 sib;
  node[mark::plmnIdentityList].each([&](const Node& element) {
    sib.plmns.push_back(plmnFrom(element, sib.plmns.empty() ? std::nullopt : sib.plmns.back().mcc));
  });
  take(node[mark::trackingAreaCode], sib.trackingAreaCode);
  take(node[mark::cellIdentity], sib.cellIdentity);
  sib.barred = node[mark::cellBarred].index() == 0;
  sib.intraFrequencyReselection = node[mark::intraFreqReselection].index() == 0;
  take(node[mark::csgIdentity], sib.csgIdentity);
  take(node[mark::qRxLevMin], sib.qRxLevMin);
  take(node[mark::qRxLevMinOffset], sib.qRxLevMinOffset);
  take(node[mark::pMax], sib.pMaxDbm);
  take(node[mark::freqBandIndicator], sib.band);
  take(node[mark::freqBandIndicatorV9e0], sib.band);
  sib.furtherBands = bandsFrom(node[mark::multiBandInfoList], node[mark::multiBandInfoListV9e0]);
  if (const Node tdd = node[mark::tddConfig]) sib.tdd = tddFrom(tdd);
  if (const Node release9 = node[mark::nonCriticalExtension]) {
    sib.imsEmergencySupport = static_cast<bool>(release9[mark::imsEmergencySupportR9]);
    take(release9[mark::qQualMinR9], sib.qQualMinDb);
    take(release9[mark::qQualMinOffsetR9], sib.qQualMinOffsetDb);
    if (sib.tdd) {
      take(release9[mark::specialSubframePatternsV1130], sib.tdd->specialSubframePattern);
    }
  }
  return sib;
}

Sib2 sib2From(const Node& node) {
  Sib2 sib;
  if (const Node info = node[mark::acBarringInfo]) {
    take(info[mark::acBarringForEmergency], sib.barredForEmergency);
    const Node signalling = info[mark::acBarringForMOSignalling];
    const Node data = info[mark::acBarringForMOData];
    if (signalling) sib.forSignalling = barringFrom(signalling);
    if (data) sib.forData = barringFrom(data);
  }
  take(node[mark::ulCarrierFreq], sib.ulEarfcn);
  take(node[mark::ulCarrierFreqV9e0], sib.ulEarfcn);
  take(node[mark::ulBandwidth], sib.ulBandwidthBlocks);
  return sib;
}

Sib3 sib3From(const Node& node) {
  Sib3 sib;
  take(node[mark::qHyst], sib.qHystDb);
  take(node[mark::sNonIntraSearch], sib.sNonIntraSearch);
  take(node[mark::sNonIntraSearchPR9], sib.sNonIntraSearch);
  take(node[mark::sNonIntraSearchQR9], sib.sNonIntraSearchQDb);
  take(node[mark::sIntraSearch], sib.sIntraSearch);
  take(node[mark::sIntraSearchPR9], sib.sIntraSearch);
  take(node[mark::sIntraSearchQR9], sib.sIntraSearchQDb);
  take(node[mark::threshServingLow], sib.threshServingLow);
  take(node[mark::threshServingLowQR9], sib.threshServingLowQDb);
  take(node[mark::cellReselectionPriority], sib.priority);
  take(node[mark::qRxLevMin], sib.qRxLevMin);
  take(node[mark::qQualMinR9], sib.qQualMinDb);
  take(node[mark::pMax], sib.pMaxDbm);
  take(node[mark::allowedMeasBandwidth], sib.measuredBandwidthBlocks);
  take(node[mark::tReselectionEUTRA], sib.tReselectionS);
  return sib;
}

}  // namespace qel::rrc::lte
