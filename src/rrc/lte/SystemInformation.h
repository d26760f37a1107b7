// What is read of LTE's system information (36.331, clauses 6.2.2 and 6.3.1): plain values.
//
// A number stands as it is signalled; where one step is not one unit, the comment says so. What is
// enumerated stands for what it means. What the message does not say is absent.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

namespace qel::rrc::lte {

struct MasterInformationBlock {
  unsigned dlBandwidthBlocks = 0;  // 6 15 25 50 75 100
  unsigned sfnHigh = 0;            // the upper 8 bits of the system frame number's 10

  bool operator==(const MasterInformationBlock&) const = default;
};

struct Plmn {
  std::optional<unsigned> mcc;  // absent: the first of the list did not say
  unsigned mnc = 0;
  unsigned mncDigits = 0;  // 2 or 3
  bool reservedForOperator = false;

  bool operator==(const Plmn&) const = default;
};

struct TddConfiguration {
  unsigned subframeAssignment = 0;      // 0 to 6
  unsigned specialSubframePattern = 0;  // 0 to 8

  bool operator==(const TddConfiguration&) const = default;
};

struct Sib1 {
  std::vector<Plmn> plmns;
  unsigned trackingAreaCode = 0;
  std::uint32_t cellIdentity = 0;  // 28 bits
  bool barred = false;
  bool intraFrequencyReselection = false;
  std::optional<std::uint32_t> csgIdentity;
  int qRxLevMin = 0;                        // steps of 2 dBm
  std::optional<unsigned> qRxLevMinOffset;  // steps of 2 dB
  std::optional<int> qQualMinDb;
  std::optional<unsigned> qQualMinOffsetDb;
  std::optional<int> pMaxDbm;
  unsigned band = 0;                   // the wider one where there are two
  std::vector<unsigned> furtherBands;  // the wider one where there are two
  std::optional<TddConfiguration> tdd;
  std::optional<bool> imsEmergencySupport;  // absent: the message is of release 8

  bool operator==(const Sib1&) const = default;
};

struct AccessBarring {
  unsigned factorIndex = 0;     // 0 to 15
  unsigned factorPercent = 0;   // 0 to 95
  unsigned timeIndex = 0;       // 0 to 7
  unsigned timeS = 0;           // 4 to 512
  unsigned specialClasses = 0;  // bits 4 to 0 are classes 11 to 15

  bool operator==(const AccessBarring&) const = default;
};

struct Sib2 {
  std::optional<bool> barredForEmergency;  // absent: nothing is barred for anybody
  std::optional<AccessBarring> forSignalling;
  std::optional<AccessBarring> forData;
  std::optional<std::uint32_t> ulEarfcn;
  std::optional<unsigned> ulBandwidthBlocks;

  bool operator==(const Sib2&) const = default;
};

struct Sib3 {
  unsigned qHystDb = 0;
  std::optional<unsigned> sNonIntraSearch;  // steps of 2 dB; of release 9 where both are there
  std::optional<unsigned> sNonIntraSearchQDb;
  std::optional<unsigned> sIntraSearch;  // likewise
  std::optional<unsigned> sIntraSearchQDb;
  unsigned threshServingLow = 0;  // steps of 2 dB
  std::optional<unsigned> threshServingLowQDb;
  unsigned priority = 0;
  int qRxLevMin = 0;  // steps of 2 dBm
  std::optional<int> qQualMinDb;
  std::optional<int> pMaxDbm;
  std::optional<unsigned> measuredBandwidthBlocks;
  unsigned tReselectionS = 0;

  bool operator==(const Sib3&) const = default;
};

struct EutraCarrier {
  std::uint32_t earfcn = 0;  // the wider one where there are two
  int qRxLevMin = 0;         // steps of 2 dBm
  std::optional<int> qQualMinDb;
  std::optional<int> pMaxDbm;
  unsigned tReselectionS = 0;
  unsigned threshXHigh = 0;  // steps of 2 dB
  unsigned threshXLow = 0;   // steps of 2 dB
  std::optional<unsigned> threshXHighQDb;
  std::optional<unsigned> threshXLowQDb;
  unsigned measuredBandwidthBlocks = 0;
  std::optional<unsigned> priority;
  int qOffsetDb = 0;
  std::vector<unsigned> furtherBands;

  bool operator==(const EutraCarrier&) const = default;
};

struct Sib5 {
  std::vector<EutraCarrier> carriers;

  bool operator==(const Sib5&) const = default;
};

struct UtraCarrier {
  unsigned uarfcn = 0;
  std::optional<unsigned> priority;
  unsigned threshXHigh = 0;  // steps of 2 dB
  unsigned threshXLow = 0;   // steps of 2 dB
  std::optional<unsigned> threshXHighQDb;
  std::optional<unsigned> threshXLowQDb;
  int qRxLevMin = 0;  // dBm = 2 times this + 1
  int pMaxDbm = 0;
  std::optional<int> qQualMinDb;  // FDD only

  bool operator==(const UtraCarrier&) const = default;
};

struct Sib6 {
  std::vector<UtraCarrier> fdd;
  std::vector<UtraCarrier> tdd;
  unsigned tReselectionS = 0;

  bool operator==(const Sib6&) const = default;
};

struct GeranCarriers {
  unsigned startingArfcn = 0;
  bool pcs1900 = false;                 // else DCS 1800 where an ARFCN may be either
  std::vector<unsigned> furtherArfcns;  // empty where they are not in a list but in a bit map
  std::optional<unsigned> priority;
  unsigned nccPermitted = 0;  // 8 bits, the highest is NCC 0
  unsigned qRxLevMin = 0;     // dBm = 2 times this - 115
  std::optional<unsigned> pMaxDbm;
  unsigned threshXHigh = 0;  // steps of 2 dB
  unsigned threshXLow = 0;   // steps of 2 dB

  bool operator==(const GeranCarriers&) const = default;
};

struct Sib7 {
  std::vector<GeranCarriers> carriers;
  unsigned tReselectionS = 0;

  bool operator==(const Sib7&) const = default;
};

}  // namespace qel::rrc::lte
