#include "rrc/LteValues.h"

#include <algorithm>
#include <cctype>
#include <optional>

namespace qel::testing {

using namespace rrc::lte;

namespace {

using Names = std::vector<std::string>;

class Claims {
 public:
  // Of what is said of `rows` of something, by a function of each.
  template <class Rows, class Value>
  void each(const Rows& rows, const Names& names, Value&& value, const Names& unless = {}) {
    Claim& claim = add(names, false, unless);
    for (const auto& row : rows) put(claim, value(row));
  }
  template <class Rows, class Value>
  void eachMeaning(const Rows& rows, const Names& names, Value&& value, const Names& unless = {}) {
    Claim& claim = add(names, true, unless);
    for (const auto& row : rows) put(claim, value(row));
  }
  template <class Value>
  void number(const std::string& name, const Value& value, const Names& unless = {}) {
    put(add({name}, false, unless), value);
  }
  template <class Value>
  void meaning(const std::string& name, const Value& value, const Names& unless = {}) {
    put(add({name}, true, unless), value);
  }
  void in(std::string within) { _within = std::move(within); }

  std::vector<Claim> claims;

 private:
  Claim& add(const Names& names, bool meanings, const Names& unless) {
    return claims.emplace_back(Claim{names, _within, {}, meanings, unless});
  }
  static void put(Claim& claim, const std::string& text) { claim.values.push_back(text); }
  template <class Number>
  static void put(Claim& claim, Number number) {
    claim.values.push_back(std::to_string(number));
  }
  template <class Value>
  static void put(Claim& claim, const std::optional<Value>& value) {
    if (value) put(claim, *value);
  }

  std::string _within;
};

// `count` bits from the left, in whole bytes.
std::string bitsText(std::uint64_t value, unsigned count) {
  const unsigned size = (count + 7) / 8;
  value <<= size * 8 - count;
  Bytes bytes;
  for (unsigned i = size; i > 0; --i) {
    bytes.push_back(static_cast<std::uint8_t>(value >> (8 * (i - 1))));
  }
  return hexText(bytes);
}

std::vector<unsigned> digitsOfMnc(const Sib1& sib) {
  std::vector<unsigned> digits;
  for (const Plmn& plmn : sib.plmns) {
    std::string text = std::to_string(plmn.mnc);
    text.insert(0, plmn.mncDigits - text.size(), '0');
    for (const char digit : text) digits.push_back(static_cast<unsigned>(digit - '0'));
  }
  return digits;
}

void claimSib1(const Sib1& sib, Claims& claims) {
  claims.in("mnc");
  claims.each(digitsOfMnc(sib), {"MCC-MNC-Digit"}, [](unsigned digit) { return digit; });
  claims.in("multiBandInfoList");
  claims.each(sib.furtherBands, {"FreqBandIndicator"}, [](unsigned band) { return band; },
              {"multiBandInfoList-v9e0"});
  claims.in("systemInformationBlockType1");
  claims.number("trackingAreaCode", bitsText(sib.trackingAreaCode, 16));
  claims.number("cellIdentity", bitsText(sib.cellIdentity, 28));
  claims.number("cellBarred", sib.barred ? 0 : 1);
  claims.number("intraFreqReselection", sib.intraFrequencyReselection ? 0 : 1);
  claims.number("q-RxLevMin", sib.qRxLevMin);
  claims.number("q-RxLevMinOffset", sib.qRxLevMinOffset);
  claims.number("q-QualMin-r9", sib.qQualMinDb);
  claims.number("q-QualMinOffset-r9", sib.qQualMinOffsetDb);
  claims.number("p-Max", sib.pMaxDbm);
  claims.number("freqBandIndicator", sib.band, {"freqBandIndicator-v9e0"});
  claims.in("tdd-Config");
  const std::vector<TddConfiguration> tdd(sib.tdd ? 1 : 0, sib.tdd.value_or(TddConfiguration()));
  claims.eachMeaning(tdd, {"subframeAssignment"}, [](auto& c) { return c.subframeAssignment; });
  claims.eachMeaning(tdd, {"specialSubframePatterns"},
                     [](auto& c) { return c.specialSubframePattern; },
                     {"specialSubframePatterns-v1130"});
}

void claimBarring(const std::optional<AccessBarring>& barring, const std::string& within,
                  Claims& claims) {
  claims.in(within);
  const std::vector<AccessBarring> rows(barring ? 1 : 0, barring.value_or(AccessBarring()));
  claims.each(rows, {"ac-BarringFactor"}, [](auto& b) { return b.factorIndex; });
  claims.eachMeaning(rows, {"ac-BarringFactor"}, [](auto& b) { return b.factorPercent; });
  claims.each(rows, {"ac-BarringTime"}, [](auto& b) { return b.timeIndex; });
  claims.eachMeaning(rows, {"ac-BarringTime"}, [](auto& b) { return b.timeS; });
  claims.each(rows, {"ac-BarringForSpecialAC"},
              [](auto& b) { return bitsText(b.specialClasses, 5); });
}

void claimSib2(const Sib2& sib, Claims& claims) {
  claimBarring(sib.forSignalling, "ac-BarringForMO-Signalling", claims);
  claimBarring(sib.forData, "ac-BarringForMO-Data", claims);
  claims.in("sib2");
  claims.number("ac-BarringForEmergency", sib.barredForEmergency);
  claims.number("ul-CarrierFreq", sib.ulEarfcn, {"ul-CarrierFreq-v9e0"});
  claims.meaning("ul-Bandwidth", sib.ulBandwidthBlocks);
}

void claimSib3(const Sib3& sib, Claims& claims) {
  claims.in("sib3");
  claims.meaning("q-Hyst", sib.qHystDb);
  claims.number("s-NonIntraSearch", sib.sNonIntraSearch, {"s-NonIntraSearchP-r9"});
  claims.number("s-NonIntraSearchQ-r9", sib.sNonIntraSearchQDb);
  claims.number("s-IntraSearch", sib.sIntraSearch, {"s-IntraSearchP-r9"});
  claims.number("s-IntraSearchQ-r9", sib.sIntraSearchQDb);
  claims.number("threshServingLow", sib.threshServingLow);
  claims.number("threshServingLowQ-r9", sib.threshServingLowQDb);
  claims.number("cellReselectionPriority", sib.priority);
  claims.number("q-RxLevMin", sib.qRxLevMin);
  claims.number("q-QualMin-r9", sib.qQualMinDb);
  claims.number("p-Max", sib.pMaxDbm);
  claims.meaning("allowedMeasBandwidth", sib.measuredBandwidthBlocks);
  claims.number("t-ReselectionEUTRA", sib.tReselectionS);
}

void claimSib5(const Sib5& sib, Claims& claims) {
  claims.in("sib5");
  const auto& all = sib.carriers;
  const auto both = [](const std::string& name) { return Names{name, name + "-r12"}; };
  claims.each(all, both("dl-CarrierFreq"), [](auto& c) { return c.earfcn; },
              {"dl-CarrierFreq-v9e0"});
  claims.each(all, both("q-RxLevMin"), [](auto& c) { return c.qRxLevMin; });
  claims.each(all, {"q-QualMin-r9", "q-QualMin-r12"}, [](auto& c) { return c.qQualMinDb; });
  claims.each(all, both("p-Max"), [](auto& c) { return c.pMaxDbm; });
  claims.each(all, both("t-ReselectionEUTRA"), [](auto& c) { return c.tReselectionS; });
  claims.each(all, both("threshX-High"), [](auto& c) { return c.threshXHigh; });
  claims.each(all, both("threshX-Low"), [](auto& c) { return c.threshXLow; });
  claims.each(all, {"threshX-HighQ-r9", "threshX-HighQ-r12"},
              [](auto& c) { return c.threshXHighQDb; });
  claims.each(all, {"threshX-LowQ-r9", "threshX-LowQ-r12"},
              [](auto& c) { return c.threshXLowQDb; });
  claims.eachMeaning(all, both("allowedMeasBandwidth"),
                     [](auto& c) { return c.measuredBandwidthBlocks; });
  claims.each(all, both("cellReselectionPriority"), [](auto& c) { return c.priority; });
}

void claimUtra(const std::vector<UtraCarrier>& all, const std::string& within, Claims& claims) {
  claims.in(within);
  claims.each(all, {"carrierFreq"}, [](auto& c) { return c.uarfcn; });
  claims.each(all, {"cellReselectionPriority"}, [](auto& c) { return c.priority; });
  claims.each(all, {"threshX-High"}, [](auto& c) { return c.threshXHigh; });
  claims.each(all, {"threshX-Low"}, [](auto& c) { return c.threshXLow; });
  claims.each(all, {"threshX-HighQ-r9"}, [](auto& c) { return c.threshXHighQDb; });
  claims.each(all, {"threshX-LowQ-r9"}, [](auto& c) { return c.threshXLowQDb; });
  claims.each(all, {"q-RxLevMin"}, [](auto& c) { return c.qRxLevMin; });
  claims.each(all, {"p-MaxUTRA"}, [](auto& c) { return c.pMaxDbm; });
  claims.each(all, {"q-QualMin"}, [](auto& c) { return c.qQualMinDb; });
}

void claimSib7(const Sib7& sib, Claims& claims) {
  claims.in("sib7");
  const auto& all = sib.carriers;
  claims.number("t-ReselectionGERAN", sib.tReselectionS);
  claims.each(all, {"startingARFCN"}, [](auto& c) { return c.startingArfcn; });
  claims.each(all, {"bandIndicator"}, [](auto& c) { return c.pcs1900 ? 1 : 0; });
  claims.each(all, {"cellReselectionPriority"}, [](auto& c) { return c.priority; });
  claims.each(all, {"ncc-Permitted"}, [](auto& c) { return bitsText(c.nccPermitted, 8); });
  claims.each(all, {"q-RxLevMin"}, [](auto& c) { return c.qRxLevMin; });
  claims.each(all, {"p-MaxGERAN"}, [](auto& c) { return c.pMaxDbm; });
  claims.each(all, {"threshX-High"}, [](auto& c) { return c.threshXHigh; });
  claims.each(all, {"threshX-Low"}, [](auto& c) { return c.threshXLow; });
}

void claimRadio(const RadioConfiguration& radio, Claims& claims) {
  claims.in("antennaInfo");
  claims.meaning("transmissionMode", radio.transmissionMode, {"antennaInfo-r10"});
  if (!radio.drx || !radio.drx->setup) return;
  const Drx& drx = *radio.drx->setup;
  claims.in("drx-Config");
  claims.meaning("onDurationTimer", drx.onDurationMs, {"onDurationTimer-v1310"});
  claims.meaning("drx-InactivityTimer", drx.inactivityMs);
  claims.meaning("drx-RetransmissionTimer", drx.retransmissionMs,
                 {"drx-RetransmissionTimer-v1130", "drx-RetransmissionTimer-v1310"});
  const Names later = {"longDRX-CycleStartOffset-v1130", "sf60-v1310"};
  if (drx.longCycleMs && drx.startOffsetMs) {
    claims.number("sf" + std::to_string(*drx.longCycleMs), *drx.startOffsetMs, later);
  }
  claims.meaning("shortDRX-Cycle", drx.shortCycleMs, {"shortDRX-Cycle-v1130"});
  claims.number("drxShortCycleTimer", drx.shortCycles);
}

void claimReconfiguration(const Reconfiguration& message, Claims& claims) {
  claims.in("sCellToAddModList-r10");
  const auto& cells = message.secondaryCells;
  claims.each(cells, {"sCellIndex-r10"}, [](auto& c) { return c.index; });
  claims.each(cells, {"physCellId-r10"}, [](auto& c) { return c.pci; });
  claims.each(cells, {"dl-CarrierFreq-r10"}, [](auto& c) { return c.dlEarfcn; },
              {"dl-CarrierFreq-v1090"});
  claims.eachMeaning(cells, {"dl-Bandwidth-r10"}, [](auto& c) { return c.dlBandwidthBlocks; });
  claims.each(cells, {"ul-CarrierFreq-r10"}, [](auto& c) { return c.ulEarfcn; },
              {"ul-CarrierFreq-v1090"});
  claims.eachMeaning(cells, {"ul-Bandwidth-r10"}, [](auto& c) { return c.ulBandwidthBlocks; });
  claims.eachMeaning(cells, {"transmissionMode-r10"}, [](auto& c) { return c.transmissionMode; });
  claims.in("sCellToReleaseList-r10");
  claims.each(message.removedSecondaryCells, {"SCellIndex-r10"}, [](unsigned i) { return i; });

  const std::vector<Handover> rows(message.handover ? 1 : 0, message.handover.value_or(Handover()));
  claims.in("mobilityControlInfo");
  claims.each(rows, {"targetPhysCellId"}, [](auto& h) { return h.pci; });
  claims.each(rows, {"dl-CarrierFreq"}, [](auto& h) { return h.dlEarfcn; },
              {"dl-CarrierFreq-v9e0"});
  claims.each(rows, {"ul-CarrierFreq"}, [](auto& h) { return h.ulEarfcn; },
              {"dl-CarrierFreq-v9e0"});
  claims.eachMeaning(rows, {"dl-Bandwidth"}, [](auto& h) { return h.dlBandwidthBlocks; });
  claims.eachMeaning(rows, {"ul-Bandwidth"}, [](auto& h) { return h.ulBandwidthBlocks; });

  const auto measured = message.measurements.value_or(MeasurementConfiguration());
  claims.in("measObjectToAddModList");
  claims.each(measured.objects, {"measObjectId"}, [](auto& o) { return o.id; });
  for (const auto& [within, target] :
       {std::pair{"measObjectEUTRA", Target::eutra}, {"measObjectUTRA", Target::utra}}) {
    claims.in(within);
    claims.each(
        measured.objects, {"carrierFreq"},
        [target = target](auto& o) { return o.technology == target ? o.carrier : std::nullopt; },
        {"carrierFreq-v9e0"});
  }
  claims.in("measIdToAddModList");
  claims.each(measured.identities, {"measId", "measId-v1250"}, [](auto& i) { return i.id; });
  claims.each(measured.identities, {"measObjectId", "measObjectId-r12"},
              [](auto& i) { return i.object; });
}

void claimReport(const MeasurementReport& report, Claims& claims) {
  claims.in("measurementReport");
  claims.number("measId", report.id, {"measId-v1250"});
  claims.in("measResultPCell");
  claims.number("rsrpResult", report.rsrp);
  claims.number("rsrqResult", report.rsrq);
  claims.in("measResultListEUTRA");
  claims.each(report.eutra, {"physCellId"}, [](auto& r) { return r.pci; });
  claims.each(report.eutra, {"rsrpResult"}, [](auto& r) { return r.rsrp; });
  claims.each(report.eutra, {"rsrqResult"}, [](auto& r) { return r.rsrq; });
  claims.in("measResultListUTRA");
  claims.each(report.utra, {"fdd", "tdd"}, [](auto& r) { return r.cell; });
  claims.each(report.utra, {"utra-RSCP"}, [](auto& r) { return r.rscp; });
  claims.each(report.utra, {"utra-EcN0"}, [](auto& r) { return r.ecn0; });
  claims.in("measResultListGERAN");
  claims.each(report.geran, {"arfcn"}, [](auto& r) { return r.arfcn; });
  claims.each(report.geran, {"bandIndicator"}, [](auto& r) { return r.pcs1900 ? 1 : 0; });
  claims.each(report.geran, {"networkColourCode"},
              [](auto& r) { return bitsText(r.networkColour, 3); });
  claims.each(report.geran, {"baseStationColourCode"},
              [](auto& r) { return bitsText(r.stationColour, 3); });
  claims.each(report.geran, {"rssi"}, [](auto& r) { return r.rssi; });
  claims.in("measResultServFreqList-r10");
  claims.each(report.secondaryCells, {"servFreqId-r10"}, [](auto& r) { return r.index; });
  claims.each(report.secondaryCells, {"rsrpResultSCell-r10"}, [](auto& r) { return r.rsrp; });
  claims.each(report.secondaryCells, {"rsrqResultSCell-r10"}, [](auto& r) { return r.rsrq; });
}

void claimRelease(const ConnectionRelease& release, Claims& claims) {
  claims.number("releaseCause", static_cast<int>(release.cause));
  claims.in("redirectedCarrierInfo");
  const auto redirection = release.redirection.value_or(Redirection());
  const auto to = [&](Target target) {
    return redirection.target == target ? redirection.carrier : std::nullopt;
  };
  claims.number("eutra", to(Target::eutra), {"eutra-v9e0"});
  claims.number("startingARFCN", to(Target::geran));
  claims.number("utra-FDD", to(Target::utraFdd));
  claims.number("carrierFreq-r15", to(Target::nr));
}

// "dB-4" is -4, "psf0-v1020" is 0; nothing of a spare.
std::optional<std::string> numberIn(const std::string& label) {
  if (label.starts_with("spare")) return std::nullopt;
  auto from = std::find_if(label.begin(), label.end(),
                           [](char c) { return c == '-' || (c >= '0' && c <= '9'); });
  const auto to = std::find_if(from + (from != label.end() && *from == '-' ? 1 : 0), label.end(),
                               [](char c) { return c < '0' || c > '9'; });
  if (from == to) return label;
  return std::to_string(std::stoi(std::string(from, to)));
}

}  // namespace

std::vector<Claim> claimsOf(const rrc::LteMessage& message) {
  Claims claims;
  if (message.mib) {
    claims.meaning("dl-Bandwidth", message.mib->dlBandwidthBlocks);
    claims.number("systemFrameNumber", bitsText(message.mib->sfnHigh, 8));
  }
  if (message.sib1) claimSib1(*message.sib1, claims);
  if (message.request) {
    claims.number("establishmentCause", static_cast<int>(message.request->cause));
  }
  if (message.reestablishmentRequest) {
    claims.number("reestablishmentCause", static_cast<int>(message.reestablishmentRequest->cause));
    claims.number("physCellId", message.reestablishmentRequest->pci);
  }
  claims.each(message.nas, {"dedicatedInfoNAS", "DedicatedInfoNAS", "dedicatedInfoNAS-r15"},
              [](const Bytes& nas) { return hexText(nas); });
  if (message.release) claimRelease(*message.release, claims);
  if (message.sib2) claimSib2(*message.sib2, claims);
  if (message.sib3) claimSib3(*message.sib3, claims);
  if (message.sib5) claimSib5(*message.sib5, claims);
  if (message.sib6) {
    claimUtra(message.sib6->fdd, "carrierFreqListUTRA-FDD", claims);
    claimUtra(message.sib6->tdd, "carrierFreqListUTRA-TDD", claims);
  }
  if (message.sib7) claimSib7(*message.sib7, claims);
  if (message.radio) claimRadio(*message.radio, claims);
  if (message.reconfiguration) claimReconfiguration(*message.reconfiguration, claims);
  if (message.report) claimReport(*message.report, claims);
  return std::move(claims.claims);
}

std::string contradiction(const Claim& claim, const std::vector<Shown>& shown) {
  std::vector<std::string> values;
  for (const Shown& one : shown) {
    const auto is = [&](const std::string& name) {
      return one.name == name || one.name.ends_with("-" + name);
    };
    if (std::any_of(claim.unless.begin(), claim.unless.end(), is)) return {};
    if (std::none_of(claim.names.begin(), claim.names.end(), is)) continue;
    const bool inside =
        claim.within.empty() ||
        std::any_of(one.path.begin(), one.path.end(),
                    [&](const std::string& around) { return around.starts_with(claim.within); });
    if (!inside) continue;
    const auto value = claim.meanings ? numberIn(one.label) : std::optional(one.value);
    if (value) values.push_back(*value);
  }
  if (values == claim.values) return {};
  std::string text = claim.within + ' ' + claim.names.front() + " is shown as";
  for (const std::string& value : values) text += ' ' + value;
  text += ", not as";
  for (const std::string& value : claim.values) text += ' ' + value;
  return text;
}

}  // namespace qel::testing
