// The logical channels of LTE's RRC and the messages that they carry (36.331, clause 6.2.1).
#pragma once

#include <cstdint>

namespace qel::rrc::lte {

enum class Channel : std::uint8_t {
  bcchBch,
  bcchDlSch,
  mcch,
  pcch,
  dlCcch,
  dlDcch,
  ulCcch,
  ulDcch,
};

// Which message it was. `other` is one that is newer than these, or a spare.
enum class Kind : std::uint8_t {
  other,
  // BCCH-BCH, BCCH-DL-SCH, MCCH, PCCH
  masterInformationBlock,
  systemInformation,
  systemInformationBlockType1,
  mbsfnAreaConfiguration,
  mbmsCountingRequest,
  paging,
  // DL-CCCH
  rrcConnectionReestablishment,
  rrcConnectionReestablishmentReject,
  rrcConnectionReject,
  rrcConnectionSetup,
  rrcEarlyDataComplete,
  // DL-DCCH
  csfbParametersResponseCdma2000,
  dlInformationTransfer,
  handoverFromEutraPreparationRequest,
  mobilityFromEutraCommand,
  rrcConnectionReconfiguration,
  rrcConnectionRelease,
  securityModeCommand,
  ueCapabilityEnquiry,
  counterCheck,
  ueInformationRequest,
  loggedMeasurementConfiguration,
  rnReconfiguration,
  rrcConnectionResume,
  dlDedicatedMessageSegment,
  // UL-CCCH
  rrcConnectionReestablishmentRequest,
  rrcConnectionRequest,
  rrcConnectionResumeRequest,
  rrcEarlyDataRequest,
  // UL-DCCH
  csfbParametersRequestCdma2000,
  measurementReport,
  rrcConnectionReconfigurationComplete,
  rrcConnectionReestablishmentComplete,
  rrcConnectionSetupComplete,
  securityModeComplete,
  securityModeFailure,
  ueCapabilityInformation,
  ulHandoverPreparationTransfer,
  ulInformationTransfer,
  counterCheckResponse,
  ueInformationResponse,
  proximityIndication,
  rnReconfigurationComplete,
  mbmsCountingResponse,
  interFreqRstdMeasurementIndication,
  ueAssistanceInformation,
  inDeviceCoexIndication,
  mbmsInterestIndication,
  scgFailureInformation,
  sidelinkUeInformation,
  wlanConnectionStatusReport,
  rrcConnectionResumeComplete,
  ulInformationTransferMrdc,
  scgFailureInformationNr,
  measReportAppLayer,
  failureInformation,
  ulDedicatedMessageSegment,
  purConfigurationRequest,
  failureInformationR16,
  mcgFailureInformation,
  ulInformationTransferIrat,
};

}  // namespace qel::rrc::lte
