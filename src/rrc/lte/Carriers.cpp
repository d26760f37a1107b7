// SIB5, SIB6 and SIB7: the carriers that a cell names for reselection.

#include "rrc/lte/Readers.h"
#include "rrc/lte_schema.h"

namespace qel::rrc::lte {
namespace {

EutraCarrier carrierFrom(const Node& node) {
  EutraCarrier carrier;
  take(node[mark::dlCarrierFreq], carrier.earfcn);
  take(node[mark::qRxLevMin], carrier.qRxLevMin);
  take(node[mark::qQualMinR9], carrier.qQualMinDb);
  take(node[mark::pMax], carrier.pMaxDbm);
  take(node[mark::tReselectionEUTRA], carrier.tReselectionS);
  take(node[mark::threshXHigh], carrier.threshXHigh);
  take(node[mark::threshXLow], carrier.threshXLow);
  take(node[mark::threshXHighQR9], carrier.threshXHighQDb);
  take(node[mark::threshXLowQR9], carrier.threshXLowQDb);
  take(node[mark::allowedMeasBandwidth], carrier.measuredBandwidthBlocks);
  take(node[mark::cellReselectionPriority], carrier.priority);
  take(node[mark::qOffsetFreq], carrier.qOffsetDb);
  return carrier;
}

// One of the second list, which release 12 added.
EutraCarrier furtherCarrierFrom(const Node& node) {
  EutraCarrier carrier;
  take(node[mark::dlCarrierFreqR12], carrier.earfcn);
  take(node[mark::qRxLevMinR12], carrier.qRxLevMin);
  take(node[mark::qQualMinR12], carrier.qQualMinDb);
  take(node[mark::pMaxR12], carrier.pMaxDbm);
  take(node[mark::tReselectionEUTRAR12], carrier.tReselectionS);
  take(node[mark::threshXHighR12], carrier.threshXHigh);
  take(node[mark::threshXLowR12], carrier.threshXLow);
  take(node[mark::threshXHighQR12], carrier.threshXHighQDb);
  take(node[mark::threshXLowQR12], carrier.threshXLowQDb);
  take(node[mark::allowedMeasBandwidthR12], carrier.measuredBandwidthBlocks);
  take(node[mark::cellReselectionPriorityR12], carrier.priority);
  take(node[mark::qOffsetFreqR12], carrier.qOffsetDb);
  carrier.furtherBands = numbersOf(node[mark::multiBandInfoListR12]);
  return carrier;
}

// What later releases say of the carriers of the first list stands in lists beside it.
void widen(const Node& sib, std::vector<EutraCarrier>& carriers) {
  std::size_t place = 0;
  sib[mark::interFreqCarrierFreqListV8h0].each([&](const Node& element) {
    if (place < carriers.size()) {
      carriers[place].furtherBands = numbersOf(element[mark::multiBandInfoList]);
    }
    ++place;
  });
  place = 0;
  sib[mark::interFreqCarrierFreqListV9e0].each([&](const Node& element) {
    if (place >= carriers.size()) return;
    EutraCarrier& carrier = carriers[place++];
    take(element[mark::dlCarrierFreqV9e0], carrier.earfcn);
    std::size_t band = 0;
    element[mark::multiBandInfoListV9e0].each([&](const Node& wider) {
      if (band >= carrier.furtherBands.size()) return;
      take(wider[mark::freqBandIndicatorV9e0], carrier.furtherBands[band++]);
    });
  });
}

UtraCarrier utraFrom(const Node& node) {
  UtraCarrier carrier;
  take(node[mark::carrierFreq], carrier.uarfcn);
  take(node[mark::cellReselectionPriority], carrier.priority);
  take(node[mark::threshXHigh], carrier.threshXHigh);
  take(node[mark::threshXLow], carrier.threshXLow);
  take(node[mark::threshXHighQR9], carrier.threshXHighQDb);
  take(node[mark::threshXLowQR9], carrier.threshXLowQDb);
  take(node[mark::qRxLevMin], carrier.qRxLevMin);
  take(node[mark::pMaxUTRA], carrier.pMaxDbm);
  take(node[mark::qQualMin], carrier.qQualMinDb);
  return carrier;
}

GeranCarriers geranFrom(const Node& node) {
  constexpr unsigned kArfcns = 1024;
  GeranCarriers carriers;
  take(node[mark::startingARFCN], carriers.startingArfcn);
  carriers.pcs1900 = node[mark::bandIndicator].index() == 1;
  carriers.furtherArfcns = numbersOf(node[mark::explicitListOfARFCNs]);
  unsigned spacing = 0;
  unsigned count = 0;
  take(node[mark::arfcnSpacing], spacing);
  take(node[mark::numberOfFollowingARFCNs], count);
  for (unsigned i = 1; i <= count; ++i) {
    carriers.furtherArfcns.push_back((carriers.startingArfcn + i * spacing) % kArfcns);
  }
  take(node[mark::cellReselectionPriority], carriers.priority);
  take(node[mark::nccPermitted], carriers.nccPermitted);
  take(node[mark::qRxLevMin], carriers.qRxLevMin);
  take(node[mark::pMaxGERAN], carriers.pMaxDbm);
  take(node[mark::threshXHigh], carriers.threshXHigh);
  take(node[mark::threshXLow], carriers.threshXLow);
  return carriers;
}

}  // namespace

Sib5 sib5From(const Node& node) {
  Sib5 sib;
  node[mark::interFreqCarrierFreqList].each(
      [&](const Node& element) { sib.carriers.push_back(carrierFrom(element)); });
  widen(node, sib.carriers);
  node[mark::interFreqCarrierFreqListExtR12].each(
      [&](const Node& element) { sib.carriers.push_back(furtherCarrierFrom(element)); });
  return sib;
}

Sib6 sib6From(const Node& node) {
  Sib6 sib;
  node[mark::carrierFreqListUTRAFDD].each(
      [&](const Node& element) { sib.fdd.push_back(utraFrom(element)); });
  node[mark::carrierFreqListUTRATDD].each(
      [&](const Node& element) { sib.tdd.push_back(utraFrom(element)); });
  take(node[mark::tReselectionUTRA], sib.tReselectionS);
  return sib;
}

Sib7 sib7From(const Node& node) {
  Sib7 sib;
  node[mark::carrierFreqsInfoList].each(
      [&](const Node& element) { sib.carriers.push_back(geranFrom(element)); });
  take(node[mark::tReselectionGERAN], sib.tReselectionS);
  return sib;
}

}  // namespace qel::rrc::lte
