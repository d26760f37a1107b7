// LTE's RRC messages and the packets that carry them, written bit by bit.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"

namespace qel::diagnostics::test {

enum class AirChannel : std::uint8_t {
  bcchBch,
  bcchDlSch,
  mcch,
  pcch,
  dlCcch,
  dlDcch,
  ulCcch,
  ulDcch
};

struct AirCell {
  std::uint32_t earfcn = 1300;
  std::uint32_t pci = 185;
};

// The versions that packets of this kind are written in here.
const std::vector<unsigned>& airVersions();

// The body of a packet 0xB0C0.
Bytes overTheAir(unsigned version, AirChannel channel, const Bytes& message, const AirCell& cell,
                 unsigned segment = 0);
inline Bytes overTheAir(AirChannel channel, const Bytes& message, const AirCell& cell = {}) {
  return overTheAir(20, channel, message, cell);
}

struct AirTdd {
  unsigned assignment = 0;
  unsigned pattern = 0;
};
struct AirSib1 {
  int qRxLevMin = -62;
  std::optional<AirTdd> tdd = {};
  bool ofRelease9 = false;  // then it supports emergency calls over IMS
  int qQualMinDb = -20;     // of release 9
  std::vector<unsigned> bands = {};
};
Bytes sib1Message(const AirSib1& sib);

// System information of several blocks.
struct AirBarring {
  unsigned factor = 0;
  unsigned time = 0;
  unsigned classes = 0;
};
struct AirSib3 {
  unsigned qHyst = 2;  // an index
  unsigned nonIntra = 6;
  unsigned low = 2;
  unsigned priority = 5;
  unsigned intra = 31;
};
struct AirFrequency {
  std::uint32_t earfcn = 700;  // 16 bits
  int qRxLevMin = -62;
  unsigned high = 4;
  unsigned low = 5;
  unsigned bandwidth = 3;
  std::optional<unsigned> priority = {};
};
Bytes sib3Message(const AirSib3& sib);
Bytes sib5Message(const std::vector<AirFrequency>& frequencies);
// Behind the barring everything as short as can be.
Bytes sib2Message(bool emergencyBarred, const std::optional<AirBarring>& signalling);

Bytes connectionRequest(unsigned cause);
Bytes reestablishmentRequest(unsigned pci, unsigned cause);
Bytes reestablishmentReject();
Bytes connectionReject();
Bytes connectionRelease(unsigned cause);
Bytes mobilityToUmts();
Bytes setupComplete();
Bytes ciphering();  // any other message on the dedicated channel

struct AirDrx {
  unsigned onDuration = 7;   // 10 ms
  unsigned inactivity = 14;  // 100 ms
  unsigned retransmission = 4;
  bool shortCycle = true;  // 80 ms, twice
};
Bytes setupWithDrx(const std::optional<AirDrx>& drx);  // nothing: released
Bytes plainSetup();
// `mode` 1 to 7.
Bytes setupWithAntennas(unsigned mode);
Bytes reconfigurationWithAntennas(unsigned mode);

struct AirSecondary {
  unsigned index = 1;
  unsigned pci = 0;
  std::uint32_t earfcn = 0;
};
Bytes secondaryCells(const std::vector<unsigned>& removed, const std::vector<AirSecondary>& added);

Bytes fullConfiguration();  // instead of a change

Bytes handover(unsigned pci, std::uint32_t earfcn);

struct AirMeasured {
  unsigned object = 1;
  std::uint32_t earfcn = 0;
  unsigned identity = 1;
};
Bytes measureConfiguration(const std::vector<AirMeasured>& measured);

struct AirResult {
  unsigned pci = 0;
  std::optional<unsigned> rsrp;
  std::optional<unsigned> rsrq;
};
struct AirUmtsResult {
  unsigned psc = 0;
  int rscp = 0;
  unsigned ecn0 = 0;
};
struct AirGsmResult {
  unsigned arfcn = 0;
  unsigned network = 0;
  unsigned station = 0;
  unsigned rssi = 0;
};
Bytes measurementReport(unsigned identity, const std::vector<AirResult>& results);
Bytes measurementReport(unsigned identity, const std::vector<AirUmtsResult>& results);
Bytes measurementReport(unsigned identity, const std::vector<AirGsmResult>& results);

}  // namespace qel::diagnostics::test
