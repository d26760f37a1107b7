// The enumeration values that the simulated modem reports, as the message schemas number them.
#pragma once

#include <cstdint>

namespace qel::sources {

enum LteRrcStateCode : std::int32_t {
  kLteRrcNull = 0,
  kLteRrcIdle = 1,
  kLteRrcConnecting = 2,
  kLteRrcConnected = 3,
  kLteRrcEnding = 4,
  kLteRrcLeaving = 5,
};

enum LteRrcCauseCode : std::int32_t {
  kLteCauseMobileTerminated = 2,
  kLteCauseSignalling = 3,
  kLteCauseData = 4,
  kLteCauseReestablishT311Expired = 11,
  kLteCauseReleased = 15,
  kLteCauseMovedFromLte = 20,
  kLteCauseNoResponse = 22,
  kLteCauseReestablishT310Expired = 27,
  kLteCauseNotApplicable = 255,
};

enum UmtsRrcStateCode : std::int32_t {
  kUmtsRrcInactive = 1,
  kUmtsRrcIdle = 2,
  kUmtsRrcEstablish = 3,
  kUmtsRrcCellFach = 6,
  kUmtsRrcCellDch = 7,
  kUmtsRrcRelease = 8,
  kUmtsRrcRadioLinkFailure = 9,
};

enum UmtsEstablishmentCode : std::int32_t {
  kUmtsOriginatingCall = 0,
  kUmtsOriginatingInteractive = 2,
  kUmtsTerminatingCall = 5,
  kUmtsTerminatingBackground = 8,
  kUmtsRegistration = 12,
};

enum UmtsReleaseCode : std::int32_t {
  kUmtsReleaseNone = 1,
  kUmtsReleaseNormal = 4,
  kUmtsReleaseCellChanged = 6,
  kUmtsReleaseLowerLayer = 13,
};

enum GsmStateCode : std::int32_t { kGsmDedicated = 1, kGsmNotDedicated = 2 };

enum RegistrationCode : std::int32_t {
  kRegNormalService = 0,
  kRegNoService = 3,
  kRegInProgress = 11
};

enum MmUpdateCode : std::int32_t { kMmUpdated = 1, kMmNotUpdated = 2 };
enum PacketUpdateCode : std::int32_t { kPacketUpdated = 0, kPacketNotUpdated = 1 };  // GMM and EMM

enum EmmProcedureCode : std::int32_t {
  kEmmNoProcedure = 0,
  kEmmAttachCombined = 2,
  kEmmTauCombined = 5,
  kEmmServiceRequest = 7,
};

enum GmmProcedureCode : std::int32_t { kGmmCombinedRau = 3, kGmmServiceRequest = 6, kGmmNone = 10 };

enum PdpTypeCode : std::int32_t {
  kPdpIPv4 = 0,
  kPdpIPv6 = 1,
  kPdpIPv4v6 = 2,
  kPdpIPv6Lte = 4,
  kPdpIPv4v6Lte = 5
};

enum SecondaryCarrierCode : std::int32_t { kSccDeactivated = 1, kSccActivated = 2 };

inline constexpr std::int32_t kEmmCsPsMode1 = 2;
inline constexpr std::int32_t kHspaBoth = 3;
inline constexpr std::int32_t kFrameFdd = 0;

}  // namespace qel::sources
