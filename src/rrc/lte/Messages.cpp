#include "rrc/lte/Messages.h"

#include <algorithm>
#include <array>

#include "rrc/lte/Readers.h"
#include "rrc/lte_schema.h"
#include "rrc/reader/Walker.h"

namespace qel::rrc {
namespace lte {
namespace {

struct KindRow {
  Mark mark;
  Kind kind;
};

constexpr std::array kKinds = {
    KindRow{mark::systemInformation, Kind::systemInformation},
    KindRow{mark::systemInformationBlockType1, Kind::systemInformationBlockType1},
    KindRow{mark::mbsfnAreaConfigurationR9, Kind::mbsfnAreaConfiguration},
    KindRow{mark::mbmsCountingRequestR10, Kind::mbmsCountingRequest},
    KindRow{mark::paging, Kind::paging},
    KindRow{mark::rrcConnectionReestablishment, Kind::rrcConnectionReestablishment},
    KindRow{mark::rrcConnectionReestablishmentReject, Kind::rrcConnectionReestablishmentReject},
    KindRow{mark::rrcConnectionReject, Kind::rrcConnectionReject},
    KindRow{mark::rrcConnectionSetup, Kind::rrcConnectionSetup},
    KindRow{mark::rrcEarlyDataCompleteR15, Kind::rrcEarlyDataComplete},
    KindRow{mark::csfbParametersResponseCDMA2000, Kind::csfbParametersResponseCdma2000},
    KindRow{mark::dlInformationTransfer, Kind::dlInformationTransfer},
    KindRow{mark::handoverFromEUTRAPreparationRequest, Kind::handoverFromEutraPreparationRequest},
    KindRow{mark::mobilityFromEUTRACommand, Kind::mobilityFromEutraCommand},
    KindRow{mark::rrcConnectionReconfiguration, Kind::rrcConnectionReconfiguration},
    KindRow{mark::rrcConnectionRelease, Kind::rrcConnectionRelease},
    KindRow{mark::securityModeCommand, Kind::securityModeCommand},
    KindRow{mark::ueCapabilityEnquiry, Kind::ueCapabilityEnquiry},
    KindRow{mark::counterCheck, Kind::counterCheck},
    KindRow{mark::ueInformationRequestR9, Kind::ueInformationRequest},
    KindRow{mark::loggedMeasurementConfigurationR10, Kind::loggedMeasurementConfiguration},
    KindRow{mark::rnReconfigurationR10, Kind::rnReconfiguration},
    KindRow{mark::rrcConnectionResumeR13, Kind::rrcConnectionResume},
    KindRow{mark::dlDedicatedMessageSegmentR16, Kind::dlDedicatedMessageSegment},
    KindRow{mark::rrcConnectionReestablishmentRequest, Kind::rrcConnectionReestablishmentRequest},
    KindRow{mark::rrcConnectionRequest, Kind::rrcConnectionRequest},
    KindRow{mark::rrcConnectionResumeRequestR13, Kind::rrcConnectionResumeRequest},
    KindRow{mark::rrcEarlyDataRequestR15, Kind::rrcEarlyDataRequest},
    KindRow{mark::csfbParametersRequestCDMA2000, Kind::csfbParametersRequestCdma2000},
    KindRow{mark::measurementReport, Kind::measurementReport},
    KindRow{mark::rrcConnectionReconfigurationComplete, Kind::rrcConnectionReconfigurationComplete},
    KindRow{mark::rrcConnectionReestablishmentComplete, Kind::rrcConnectionReestablishmentComplete},
    KindRow{mark::rrcConnectionSetupComplete, Kind::rrcConnectionSetupComplete},
    KindRow{mark::securityModeComplete, Kind::securityModeComplete},
    KindRow{mark::securityModeFailure, Kind::securityModeFailure},
    KindRow{mark::ueCapabilityInformation, Kind::ueCapabilityInformation},
    KindRow{mark::ulHandoverPreparationTransfer, Kind::ulHandoverPreparationTransfer},
    KindRow{mark::ulInformationTransfer, Kind::ulInformationTransfer},
    KindRow{mark::counterCheckResponse, Kind::counterCheckResponse},
    KindRow{mark::ueInformationResponseR9, Kind::ueInformationResponse},
    KindRow{mark::proximityIndicationR9, Kind::proximityIndication},
    KindRow{mark::rnReconfigurationCompleteR10, Kind::rnReconfigurationComplete},
    KindRow{mark::mbmsCountingResponseR10, Kind::mbmsCountingResponse},
    KindRow{mark::interFreqRSTDMeasurementIndicationR10, Kind::interFreqRstdMeasurementIndication},
    KindRow{mark::ueAssistanceInformationR11, Kind::ueAssistanceInformation},
    KindRow{mark::inDeviceCoexIndicationR11, Kind::inDeviceCoexIndication},
    KindRow{mark::mbmsInterestIndicationR11, Kind::mbmsInterestIndication},
    KindRow{mark::scgFailureInformationR12, Kind::scgFailureInformation},
    KindRow{mark::sidelinkUEInformationR12, Kind::sidelinkUeInformation},
    KindRow{mark::wlanConnectionStatusReportR13, Kind::wlanConnectionStatusReport},
    KindRow{mark::rrcConnectionResumeCompleteR13, Kind::rrcConnectionResumeComplete},
    KindRow{mark::ulInformationTransferMRDCR15, Kind::ulInformationTransferMrdc},
    KindRow{mark::scgFailureInformationNRR15, Kind::scgFailureInformationNr},
    KindRow{mark::measReportAppLayerR15, Kind::measReportAppLayer},
    KindRow{mark::failureInformationR15, Kind::failureInformation},
    KindRow{mark::ulDedicatedMessageSegmentR16, Kind::ulDedicatedMessageSegment},
    KindRow{mark::purConfigurationRequestR16, Kind::purConfigurationRequest},
    KindRow{mark::failureInformationR16, Kind::failureInformationR16},
    KindRow{mark::mcgFailureInformationR16, Kind::mcgFailureInformation},
    KindRow{mark::ulInformationTransferIRATR16, Kind::ulInformationTransferIrat},
};

constexpr std::array kTypes = {
    // in the order of Channel
    type::BCCHBCHMessage, type::BCCHDLSCHMessage, type::MCCHMessage,   type::PCCHMessage,
    type::DLCCCHMessage,  type::DLDCCHMessage,    type::ULCCCHMessage, type::ULDCCHMessage,
};

Kind kindOf(Mark mark) {
  const auto row = std::find_if(kKinds.begin(), kKinds.end(),
                                [&](const KindRow& candidate) { return candidate.mark == mark; });
  return row != kKinds.end() ? row->kind : Kind::other;
}

void readSystemInformation(const Node& node, Message& message) {
  node.each([&](const Node& sib) {
    if (sib.mark() == mark::sib2) message.sib2 = sib2From(sib);
    if (sib.mark() == mark::sib3) message.sib3 = sib3From(sib);
    if (sib.mark() == mark::sib5) message.sib5 = sib5From(sib);
    if (sib.mark() == mark::sib6) message.sib6 = sib6From(sib);
    if (sib.mark() == mark::sib7) message.sib7 = sib7From(sib);
  });
}

void readContent(const Node& node, Message& message) {
  switch (message.kind) {
    case Kind::systemInformation:
      return readSystemInformation(node, message);
    case Kind::systemInformationBlockType1:
      message.sib1 = sib1From(node);
      return;
    case Kind::rrcConnectionReconfiguration:
      message.reconfiguration = reconfigurationFrom(node);
      break;
    case Kind::rrcConnectionRelease:
      message.release = releaseFrom(node);
      break;
    case Kind::mobilityFromEutraCommand:
      message.mobility = mobilityFrom(node);
      break;
    case Kind::rrcConnectionRequest:
      message.request = requestFrom(node);
      break;
    case Kind::rrcConnectionReestablishmentRequest:
      message.reestablishmentRequest = reestablishmentRequestFrom(node);
      break;
    case Kind::measurementReport:
      message.report = reportFrom(node);
      break;
    default:
      break;
  }
  message.radio = radioFrom(node);
  message.nas = nasFrom(node);
}

}  // namespace
}  // namespace lte

std::optional<LteMessage> readLteMessage(LteChannel channel, ByteView pdu) {
  const auto place = static_cast<std::size_t>(channel);
  if (place >= lte::kTypes.size()) return std::nullopt;
  const auto reading = walk(lte::schema(), lte::kTypes[place], pdu);
  if (!reading) return std::nullopt;
  LteMessage message;
  if (channel == LteChannel::bcchBch) {
    message.kind = lte::Kind::masterInformationBlock;
    message.mib = lte::mibFrom(reading->top());
    return message;
  }
  const Node node = reading->top().first();
  message.kind = lte::kindOf(node.mark());
  lte::readContent(node, message);
  return message;
}

}  // namespace qel::rrc
