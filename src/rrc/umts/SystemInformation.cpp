#include "rrc/umts/SystemInformation.h"

#include <algorithm>
#include <array>

#include "rrc/reader/Walker.h"
#include "rrc/umts_schema.h"

namespace qel::rrc::umts {
namespace {

constexpr unsigned kArfcns = 1024;  // they go round

// Adds the carriers of a group, all with one priority.
class GsmGroup {
 public:
  GsmGroup(const Node& group, Sib19& into) : _into(into) {
    take(group[mark::startingARFCN], _start);
    take(group[mark::priority], _priority);
    add(0);
    addList(group[mark::explicitListOfARFCNs]);
    addSpaced(group[mark::equallySpacedARFCNs]);
    addMapped(group[mark::variableBitMapOfARFCNs]);
    addRange(group[mark::continuousRangeOfARFCNs]);
  }

 private:
  void addChannel(unsigned channel) {
    if (_into.gsm.size() < Sib19::kMostGsmFrequencies) _into.gsm.push_back({channel, _priority});
  }
  void add(unsigned behindStart) { addChannel((_start + behindStart) % kArfcns); }

  void addList(const Node& list) {
    list.each([&](const Node& channel) {
      addChannel(static_cast<unsigned>(channel.number().value_or(0)));
    });
  }

  void addSpaced(const Node& spaced) {
    unsigned spacing = 0;
    unsigned count = 0;
    take(spaced[mark::arfcnSpacing], spacing);
    take(spaced[mark::numberOfFollowingARFCNs], count);
    for (unsigned i = 1; i <= count; ++i) add(i * spacing);
  }

  void addMapped(const Node& map) {
    const BitRange range = map.bits();
    for (std::size_t i = 0; i < range.count; ++i) {
      if (range.at(i)) add(static_cast<unsigned>(i) + 1);
    }
  }

  void addRange(const Node& range) {
    const auto end = range[mark::endingARFCN].number();
    if (!end) return;
    const unsigned length = (static_cast<unsigned>(*end) + kArfcns - _start) % kArfcns;
    for (unsigned i = 1; i <= length; ++i) add(i);
  }

  Sib19& _into;
  unsigned _start = 0;
  std::optional<unsigned> _priority;
};

std::vector<PrioritisedFrequency> frequenciesIn(const Node& list, Mark channel) {
  std::vector<PrioritisedFrequency> frequencies;
  list.each([&](const Node& element) {
    PrioritisedFrequency frequency;
    take(element[channel], frequency.channel);
    take(element[mark::priority], frequency.priority);
    frequencies.push_back(frequency);
  });
  return frequencies;
}

}  // namespace

std::optional<Sib1> readSib1(ByteView block) {
  const auto reading = walk(schema(), type::SysInfoType1, block);
  if (!reading) return std::nullopt;
  Sib1 sib;
  reading->top()[mark::cnDomainSysInfoList].each([&](const Node& domain) {
    unsigned coefficient = 0;
    take(domain[mark::cnDRXCycleLengthCoeff], coefficient);
    sib.drxCoefficients.push_back(coefficient);
  });
  return sib;
}

std::optional<Sib3> readSib3(ByteView block) {
  constexpr int kFdd = 0;
  constexpr int kBarred = 0;
  constexpr int kGsm = 0;
  const auto reading = walk(schema(), type::SysInfoType3, block);
  if (!reading) return std::nullopt;
  const Node top = reading->top();
  const Node mode = top[mark::cellSelectReselectInfo][mark::modeSpecificInfo];
  Sib3 sib;
  take(top[mark::cellIdentity], sib.cellId);
  sib.barred = top[mark::cellBarred].index() == kBarred;
  sib.fdd = mode.index() == kFdd;
  take(mode[mark::sIntrasearch], sib.intraSearch);
  take(mode[mark::sIntersearch], sib.interSearch);
  mode[mark::ratList].each([&](const Node& technology) {
    if (technology[mark::ratIdentifier].index() == kGsm)
      take(technology[mark::sSearchRAT], sib.gsmSearch);
  });
  return sib;
}

std::optional<Sib5> readSib5(ByteView block) {
  const auto reading = walk(schema(), type::SysInfoType5, block);
  if (!reading) return std::nullopt;
  // Where reading ends before it comes to high-speed access.
  constexpr std::array kEnds = {mark::tdd,
                                mark::dedicatedTransChTFS,
                                mark::dynamic,
                                mark::addition,
                                mark::removal,
                                mark::replacement,
                                mark::splitTFCISignalling,
                                mark::pNBSCHAllocationR4,
                                mark::openLoopPowerControlIPDLTDD,
                                mark::prachSystemInformationListLCRR4,
                                mark::tdd128SpecificInfo,
                                mark::hcrR5SpecificInfo};
  const Node top = reading->top();
  const bool cut = std::ranges::any_of(kEnds, [&](Mark end) { return bool(top[end]); });
  if (cut) return std::nullopt;
  return Sib5{.hsdpa = bool(top[mark::hsdpaCellIndicator]),
              .edch = bool(top[mark::edchCellIndicator])};
}

std::optional<Sib11> readSib11(ByteView block) {
  const auto reading = walk(schema(), type::SysInfoType11, block);
  if (!reading) return std::nullopt;
  return Sib11{bool(reading->top()[mark::fachMeasurementOccasionInfo])};
}

std::optional<Sib19> readSib19(ByteView block) {
  const auto reading = walk(schema(), type::SysInfoType19, block);
  if (!reading) return std::nullopt;
  const Node top = reading->top();
  Sib19 sib;
  take(top[mark::utraServingCell][mark::priority], sib.priority);
  sib.utraFdd = frequenciesIn(top[mark::utranFDDFrequencyList], mark::uarfcn);
  sib.eutra = frequenciesIn(top[mark::eutraFrequencyAndPriorityInfoList], mark::earfcn);
  top[mark::gsmPriorityInfoList].each([&](const Node& group) { GsmGroup(group, sib); });
  return sib;
}

}  // namespace qel::rrc::umts
