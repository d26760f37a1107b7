// What is read of LTE's messages about one phone's connection (36.331, clause 6.2.2): plain values.
//
// A number stands as it is signalled; what is enumerated stands for what it means. What the message
// does not say is absent.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"

namespace qel::rrc::lte {

// In the order of the standard, that is of the values on the air.
enum class EstablishmentCause : std::uint8_t {
  emergency,
  highPriorityAccess,
  mtAccess,
  moSignalling,
  moData,
  delayTolerantAccess,
  moVoiceCall,
  spare,
};
enum class ReestablishmentCause : std::uint8_t {
  reconfigurationFailure,
  handoverFailure,
  otherFailure,
  spare,
};
enum class ReleaseCause : std::uint8_t {
  loadBalancingTauRequired,
  other,
  csFallbackHighPriority,
  rrcSuspend,
};
enum class Target : std::uint8_t {  // of a redirection, a handover or a measurement
  eutra,
  geran,
  utraFdd,
  utraTdd,
  utra,  // FDD or TDD
  cdma2000Hrpd,
  cdma20001xRtt,
  cdma2000,  // either
  wlan,
  nr,
};

struct ConnectionRequest {
  EstablishmentCause cause = EstablishmentCause::spare;

  bool operator==(const ConnectionRequest&) const = default;
};

struct ReestablishmentRequest {
  unsigned pci = 0;  // the cell that was lost
  ReestablishmentCause cause = ReestablishmentCause::spare;

  bool operator==(const ReestablishmentRequest&) const = default;
};

// Discontinuous reception, when it is set up. Timers in subframes, that is milliseconds.
struct Drx {
  std::optional<unsigned> onDurationMs;
  std::optional<unsigned> inactivityMs;
  std::optional<unsigned> retransmissionMs;
  std::optional<unsigned> longCycleMs;
  std::optional<unsigned> startOffsetMs;
  std::optional<unsigned> shortCycleMs;
  std::optional<unsigned> shortCycles;

  bool operator==(const Drx&) const = default;
};

struct DrxChange {
  std::optional<Drx> setup;  // absent: released

  bool operator==(const DrxChange&) const = default;
};

// What setup, reconfiguration and re-establishment say of the radio.
struct RadioConfiguration {
  std::optional<DrxChange> drx;
  std::optional<unsigned> transmissionMode;  // 1 to 10
  bool defaultTransmissionMode = false;      // as 36.331 has it by default: 1 or 2

  bool operator==(const RadioConfiguration&) const = default;
};

struct SecondaryCell {
  unsigned index = 0;  // 1 to 7
  std::optional<unsigned> pci;
  std::optional<std::uint32_t> dlEarfcn;
  std::optional<unsigned> dlBandwidthBlocks;
  bool uplink = false;  // it is configured for the uplink too
  std::optional<std::uint32_t> ulEarfcn;
  std::optional<unsigned> ulBandwidthBlocks;
  std::optional<unsigned> transmissionMode;

  bool operator==(const SecondaryCell&) const = default;
};

struct Handover {
  unsigned pci = 0;
  std::optional<std::uint32_t> dlEarfcn;
  std::optional<std::uint32_t> ulEarfcn;
  std::optional<unsigned> dlBandwidthBlocks;
  std::optional<unsigned> ulBandwidthBlocks;

  bool operator==(const Handover&) const = default;
};

struct MeasurementObject {
  unsigned id = 0;  // 1 to 32
  Target technology = Target::eutra;
  std::optional<std::uint32_t> carrier;  // EARFCN, UARFCN, or the first ARFCN

  bool operator==(const MeasurementObject&) const = default;
};

struct MeasurementIdentity {
  unsigned id = 0;      // 1 to 64
  unsigned object = 0;  // 1 to 32

  bool operator==(const MeasurementIdentity&) const = default;
};

// Changes of what is measured: first what is removed, then what is added or replaced.
struct MeasurementConfiguration {
  std::vector<unsigned> removedObjects;
  std::vector<MeasurementObject> objects;
  std::vector<unsigned> removedIdentities;
  std::vector<MeasurementIdentity> identities;

  bool operator==(const MeasurementConfiguration&) const = default;
};

struct Reconfiguration {
  std::optional<MeasurementConfiguration> measurements;
  std::optional<Handover> handover;
  std::vector<unsigned> removedSecondaryCells;
  std::vector<SecondaryCell> secondaryCells;
  bool fullConfiguration = false;

  bool operator==(const Reconfiguration&) const = default;
};

struct Redirection {
  Target target = Target::eutra;
  std::optional<std::uint32_t> carrier;  // EARFCN, UARFCN, first ARFCN, or NR-ARFCN

  bool operator==(const Redirection&) const = default;
};

struct ConnectionRelease {
  ReleaseCause cause = ReleaseCause::other;
  std::optional<Redirection> redirection;

  bool operator==(const ConnectionRelease&) const = default;
};

struct MobilityFromEutra {
  std::optional<Target> target;  // absent: one that is newer than these

  bool operator==(const MobilityFromEutra&) const = default;
};

// Levels as reported: RSRP = dBm + 140 (0 to 97), RSRQ = (dB + 19.5) * 2 (0 to 34).
struct EutraResult {
  unsigned pci = 0;
  std::optional<unsigned> rsrp;
  std::optional<unsigned> rsrq;

  bool operator==(const EutraResult&) const = default;
};
struct UtraResult {
  bool fdd = true;
  unsigned cell = 0;             // FDD: primary scrambling code
  std::optional<int> rscp;       // dBm + 116, -5 to 91
  std::optional<unsigned> ecn0;  // (dB + 24.5) * 2, 0 to 49

  bool operator==(const UtraResult&) const = default;
};
struct GeranResult {
  unsigned arfcn = 0;
  bool pcs1900 = false;
  unsigned networkColour = 0;
  unsigned stationColour = 0;
  unsigned rssi = 0;  // dBm + 110, 0 to 63

  bool operator==(const GeranResult&) const = default;
};
struct ServingResult {  // a secondary cell's
  unsigned index = 0;
  std::optional<unsigned> rsrp;
  std::optional<unsigned> rsrq;
  std::optional<EutraResult> bestNeighbour;

  bool operator==(const ServingResult&) const = default;
};

struct MeasurementReport {
  unsigned id = 0;  // 1 to 64
  unsigned rsrp = 0;
  unsigned rsrq = 0;
  std::vector<EutraResult> eutra;
  std::vector<UtraResult> utra;
  std::vector<GeranResult> geran;
  std::vector<ServingResult> secondaryCells;

  bool operator==(const MeasurementReport&) const = default;
};

}  // namespace qel::rrc::lte
