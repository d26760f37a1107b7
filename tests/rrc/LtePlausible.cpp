#include "rrc/LtePlausible.h"

#include <algorithm>
#include <optional>

namespace qel::testing {

using namespace rrc::lte;

namespace {

constexpr std::int64_t kLastEarfcn = 262143;
constexpr std::int64_t kLastPci = 503;

class Check {
 public:
  template <class Number>
  void within(const char* what, Number number, std::int64_t low, std::int64_t high) {
    const auto value = static_cast<std::int64_t>(number);
    if (value < low || value > high) fail(what);
  }
  template <class Number>
  void within(const char* what, const std::optional<Number>& number, std::int64_t low,
              std::int64_t high) {
    if (number) within(what, *number, low, high);
  }
  void blocks(const char* what, const std::optional<unsigned>& blocks) {
    constexpr unsigned kBlocks[] = {6, 15, 25, 50, 75, 100};
    if (blocks && std::find(std::begin(kBlocks), std::end(kBlocks), *blocks) == std::end(kBlocks)) {
      fail(what);
    }
  }

  std::string failure;

 private:
  void fail(const char* what) {
    if (failure.empty()) failure = what;
  }
};

void checkSib1(const Sib1& sib, Check& check) {
  check.within("PLMNs", sib.plmns.size(), 1, 6);
  for (const Plmn& plmn : sib.plmns) {
    check.within("MCC", plmn.mcc, 0, 999);
    check.within("MNC digits", plmn.mncDigits, 2, 3);
    check.within("MNC", plmn.mnc, 0, plmn.mncDigits == 2 ? 99 : 999);
  }
  check.within("tracking area", sib.trackingAreaCode, 0, 0xFFFF);
  check.within("cell identity", sib.cellIdentity, 0, 0xFFFFFFF);
  check.within("q-RxLevMin", sib.qRxLevMin, -70, -22);
  check.within("q-QualMin", sib.qQualMinDb, -34, -3);
  check.within("band", sib.band, 1, 256);
  check.within("bands", sib.furtherBands.size(), 0, 8);
  if (sib.tdd) {
    check.within("subframes", sib.tdd->subframeAssignment, 0, 6);
    check.within("special subframes", sib.tdd->specialSubframePattern, 0, 9);
  }
}

void checkSystemInformation(const rrc::LteMessage& message, Check& check) {
  if (message.mib) check.blocks("MIB's bandwidth", message.mib->dlBandwidthBlocks);
  if (message.sib1) checkSib1(*message.sib1, check);
  if (message.sib2) check.within("uplink", message.sib2->ulEarfcn, 0, kLastEarfcn);
  if (message.sib3) {
    check.within("q-Hyst", message.sib3->qHystDb, 0, 24);
    check.within("priority", message.sib3->priority, 0, 7);
  }
  if (message.sib5) {
    check.within("carriers", message.sib5->carriers.size(), 1, 16);
    for (const EutraCarrier& carrier : message.sib5->carriers) {
      check.within("carrier", carrier.earfcn, 0, kLastEarfcn);
      check.within("q-OffsetFreq", carrier.qOffsetDb, -24, 24);
      check.blocks("measured bandwidth", carrier.measuredBandwidthBlocks);
    }
  }
  if (message.sib6) check.within("UTRA carriers", message.sib6->fdd.size(), 0, 16);
  if (message.sib7) {
    check.within("GERAN carriers", message.sib7->carriers.size(), 0, 16);
    for (const GeranCarriers& carriers : message.sib7->carriers) {
      check.within("ARFCNs", carriers.furtherArfcns.size(), 0, 31);
      for (const unsigned arfcn : carriers.furtherArfcns) check.within("ARFCN", arfcn, 0, 1023);
    }
  }
}

void checkReconfiguration(const Reconfiguration& message, Check& check) {
  check.within("secondary cells", message.secondaryCells.size(), 0, 4);
  for (const SecondaryCell& cell : message.secondaryCells) {
    check.within("secondary cell", cell.index, 1, 7);
    check.within("its identity", cell.pci, 0, kLastPci);
    check.within("its carrier", cell.dlEarfcn, 0, kLastEarfcn);
    check.blocks("its bandwidth", cell.dlBandwidthBlocks);
  }
  if (message.handover) {
    check.within("handover's cell", message.handover->pci, 0, kLastPci);
    check.blocks("handover's bandwidth", message.handover->dlBandwidthBlocks);
  }
  if (!message.measurements) return;
  check.within("objects", message.measurements->objects.size(), 0, 32);
  check.within("identities", message.measurements->identities.size(), 0, 64);
  for (const MeasurementIdentity& identity : message.measurements->identities) {
    check.within("identity", identity.id, 1, 64);
    check.within("object", identity.object, 1, 32);
  }
}

void checkConnection(const rrc::LteMessage& message, Check& check) {
  if (message.request) check.within("cause", message.request->cause, 0, 7);
  if (message.reestablishmentRequest) {
    check.within("lost cell", message.reestablishmentRequest->pci, 0, kLastPci);
  }
  if (message.release) check.within("end", message.release->cause, 0, 3);
  if (message.radio) {
    check.within("transmission mode", message.radio->transmissionMode, 1, 10);
    if (message.radio->drx && message.radio->drx->setup) {
      const Drx& drx = *message.radio->drx->setup;
      check.within("long cycle", drx.longCycleMs, 10, 2560);
      check.within("start", drx.startOffsetMs, 0, drx.longCycleMs.value_or(1) - 1);
    }
  }
  if (message.reconfiguration) checkReconfiguration(*message.reconfiguration, check);
  if (message.report) {
    check.within("measured", message.report->id, 1, 64);
    check.within("RSRP", message.report->rsrp, 0, 97);
    check.within("RSRQ", message.report->rsrq, 0, 34);
    check.within("neighbours", message.report->eutra.size(), 0, 8);
    for (const EutraResult& result : message.report->eutra) {
      check.within("neighbour", result.pci, 0, kLastPci);
    }
  }
}

}  // namespace

std::string implausible(const rrc::LteMessage& message) {
  Check check;
  checkSystemInformation(message, check);
  checkConnection(message, check);
  return check.failure;
}

}  // namespace qel::testing
