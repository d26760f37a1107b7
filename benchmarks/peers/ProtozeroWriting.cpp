#include <protozero/pbf_builder.hpp>

#include "peers/ProtozeroMessages.h"

namespace qel::bench::plain {
namespace {

using protozero::pbf_builder;

void write(const RsrpRsrqSinr& message, pbf_builder<RsrpRsrqSinr::Tag> writer) {
  using Tag = RsrpRsrqSinr::Tag;
  if (message.phyCellId) writer.add_uint32(Tag::phyCellId, *message.phyCellId);
  if (message.rsrp0) writer.add_sint32(Tag::rsrp0, *message.rsrp0);
  if (message.rsrp1) writer.add_sint32(Tag::rsrp1, *message.rsrp1);
  if (message.rsrq0) writer.add_sint32(Tag::rsrq0, *message.rsrq0);
  if (message.rsrq1) writer.add_sint32(Tag::rsrq1, *message.rsrq1);
  if (message.sinr0) writer.add_sint32(Tag::sinr0, *message.sinr0);
  if (message.sinr1) writer.add_sint32(Tag::sinr1, *message.sinr1);
}

}  // namespace

void write(const KCellularLteRsrpRsrqSinr& message, std::string& out) {
  using Tag = KCellularLteRsrpRsrqSinr::Tag;
  pbf_builder<Tag> writer(out);
  if (message.timestamp) writer.add_uint64(Tag::timestamp, *message.timestamp);
  if (message.callId) writer.add_string(Tag::callId, *message.callId);
  if (message.lastXSeconds) writer.add_uint32(Tag::lastXSeconds, *message.lastXSeconds);
  if (message.lastYSamples) writer.add_uint32(Tag::lastYSamples, *message.lastYSamples);
  if (message.samplePeriodMs) writer.add_uint32(Tag::samplePeriodMs, *message.samplePeriodMs);
  if (message.durationMs) writer.add_uint32(Tag::durationMs, *message.durationMs);
  if (message.numSamples) writer.add_uint32(Tag::numSamples, *message.numSamples);
  if (message.avgValues) write(*message.avgValues, {writer, Tag::avgValues});
  for (const auto& each : message.instValues) write(each, {writer, Tag::instValues});
}

namespace {

void write(const TxPowerInfo& message, pbf_builder<TxPowerInfo::Tag> writer) {
  using Tag = TxPowerInfo::Tag;
  if (message.pucchTxPower) writer.add_sint32(Tag::pucchTxPower, *message.pucchTxPower);
  if (message.puschTxPower) writer.add_sint32(Tag::puschTxPower, *message.puschTxPower);
  if (message.subframeIndex) writer.add_uint32(Tag::subframeIndex, *message.subframeIndex);
}

}  // namespace

void write(const KCellularLteTxPower& message, std::string& out) {
  using Tag = KCellularLteTxPower::Tag;
  pbf_builder<Tag> writer(out);
  if (message.timestamp) writer.add_uint64(Tag::timestamp, *message.timestamp);
  for (const auto& each : message.txPowerInfo) write(each, {writer, Tag::txPowerInfo});
}

namespace {

void write(const EgwErrcNbrEutraMeas& message, pbf_builder<EgwErrcNbrEutraMeas::Tag> writer) {
  using Tag = EgwErrcNbrEutraMeas::Tag;
  if (message.nbrEarfcn) writer.add_uint32(Tag::nbrEarfcn, *message.nbrEarfcn);
  if (message.nbrPhysCellId) writer.add_uint32(Tag::nbrPhysCellId, *message.nbrPhysCellId);
  if (message.freqBandInd) writer.add_uint32(Tag::freqBandInd, *message.freqBandInd);
  if (message.nbrRsrp) writer.add_sint32(Tag::nbrRsrp, *message.nbrRsrp);
  if (message.nbrRsrq) writer.add_sint32(Tag::nbrRsrq, *message.nbrRsrq);
}

}  // namespace

void write(const KCellularLteNbrEutraCellMeas& message, std::string& out) {
  using Tag = KCellularLteNbrEutraCellMeas::Tag;
  pbf_builder<Tag> writer(out);
  if (message.timestamp) writer.add_uint64(Tag::timestamp, *message.timestamp);
  for (const auto& each : message.measNbrEutra) write(each, {writer, Tag::measNbrEutra});
}

void write(const KCellularLteRrcState& message, std::string& out) {
  using Tag = KCellularLteRrcState::Tag;
  pbf_builder<Tag> writer(out);
  if (message.timestamp) writer.add_uint64(Tag::timestamp, *message.timestamp);
  if (message.state) writer.add_enum(Tag::state, *message.state);
  if (message.prevState) writer.add_enum(Tag::prevState, *message.prevState);
  if (message.prevStateDurMs) writer.add_uint32(Tag::prevStateDurMs, *message.prevStateDurMs);
  if (message.cause) writer.add_enum(Tag::cause, *message.cause);
}

void write(const KCellularLteScellInfo& message, std::string& out) {
  using Tag = KCellularLteScellInfo::Tag;
  pbf_builder<Tag> writer(out);
  if (message.timestamp) writer.add_uint64(Tag::timestamp, *message.timestamp);
  if (message.phyCellId) writer.add_uint32(Tag::phyCellId, *message.phyCellId);
  if (message.dlFreq) writer.add_uint32(Tag::dlFreq, *message.dlFreq);
  if (message.ulFreq) writer.add_uint32(Tag::ulFreq, *message.ulFreq);
  if (message.dlBw) writer.add_uint32(Tag::dlBw, *message.dlBw);
  if (message.ulBw) writer.add_uint32(Tag::ulBw, *message.ulBw);
  if (message.cellId) writer.add_uint32(Tag::cellId, *message.cellId);
  if (message.freqBandInd) writer.add_uint32(Tag::freqBandInd, *message.freqBandInd);
  if (message.trackingAreaCode) writer.add_uint32(Tag::trackingAreaCode, *message.trackingAreaCode);
  if (message.numMncDigits) writer.add_uint32(Tag::numMncDigits, *message.numMncDigits);
  if (message.selPlmnMcc) writer.add_uint32(Tag::selPlmnMcc, *message.selPlmnMcc);
  if (message.selPlmnMnc) writer.add_uint32(Tag::selPlmnMnc, *message.selPlmnMnc);
  if (message.tddSfAssignment) writer.add_uint32(Tag::tddSfAssignment, *message.tddSfAssignment);
  if (message.tddSsfPatterns) writer.add_uint32(Tag::tddSsfPatterns, *message.tddSsfPatterns);
}

namespace {

void write(const NbrEutra& message, pbf_builder<NbrEutra::Tag> writer) {
  using Tag = NbrEutra::Tag;
  if (message.earfcn) writer.add_uint32(Tag::earfcn, *message.earfcn);
  if (message.qRxlevMin) writer.add_sint32(Tag::qRxlevMin, *message.qRxlevMin);
  if (message.qQualMin) writer.add_sint32(Tag::qQualMin, *message.qQualMin);
  if (message.qOffset) writer.add_sint32(Tag::qOffset, *message.qOffset);
  if (message.pmax) writer.add_sint32(Tag::pmax, *message.pmax);
  if (message.dlBw) writer.add_uint32(Tag::dlBw, *message.dlBw);
  if (message.thresXHighP) writer.add_uint32(Tag::thresXHighP, *message.thresXHighP);
  if (message.thresXLowP) writer.add_uint32(Tag::thresXLowP, *message.thresXLowP);
  if (message.thresXHighQ) writer.add_uint32(Tag::thresXHighQ, *message.thresXHighQ);
  if (message.thresXLowQ) writer.add_uint32(Tag::thresXLowQ, *message.thresXLowQ);
  if (message.priority) writer.add_uint32(Tag::priority, *message.priority);
  if (message.frameType) writer.add_enum(Tag::frameType, *message.frameType);
  if (message.band) writer.add_uint32(Tag::band, *message.band);
}

}  // namespace

void write(const KCellularLteSelReselCellInfo& message, std::string& out) {
  using Tag = KCellularLteSelReselCellInfo::Tag;
  pbf_builder<Tag> writer(out);
  if (message.timestamp) writer.add_uint64(Tag::timestamp, *message.timestamp);
  if (!message.multiBandInfo.empty())
    writer.add_packed_uint32(Tag::multiBandInfo, message.multiBandInfo.begin(),
                             message.multiBandInfo.end());
  if (message.imsEmergencySupport)
    writer.add_uint32(Tag::imsEmergencySupport, *message.imsEmergencySupport);
  if (message.acBarringForEmergency)
    writer.add_uint32(Tag::acBarringForEmergency, *message.acBarringForEmergency);
  if (message.moSignallingAcBarringFactor)
    writer.add_uint32(Tag::moSignallingAcBarringFactor, *message.moSignallingAcBarringFactor);
  if (message.moSignallingAcBarringTime)
    writer.add_uint32(Tag::moSignallingAcBarringTime, *message.moSignallingAcBarringTime);
  if (message.moSignallingAcBarringForSpecialAc)
    writer.add_uint32(Tag::moSignallingAcBarringForSpecialAc,
                      *message.moSignallingAcBarringForSpecialAc);
  if (message.moDataAcBarringFactor)
    writer.add_uint32(Tag::moDataAcBarringFactor, *message.moDataAcBarringFactor);
  if (message.moDataAcBarringTime)
    writer.add_uint32(Tag::moDataAcBarringTime, *message.moDataAcBarringTime);
  if (message.moDataAcBarringForSpecialAc)
    writer.add_uint32(Tag::moDataAcBarringForSpecialAc, *message.moDataAcBarringForSpecialAc);
  if (message.qRxLevMin) writer.add_sint32(Tag::qRxLevMin, *message.qRxLevMin);
  if (message.qQualMin) writer.add_sint32(Tag::qQualMin, *message.qQualMin);
  if (message.qHyst) writer.add_uint32(Tag::qHyst, *message.qHyst);
  if (message.sNonIntraSearchP) writer.add_uint32(Tag::sNonIntraSearchP, *message.sNonIntraSearchP);
  if (message.sNonIntraSearchQ) writer.add_uint32(Tag::sNonIntraSearchQ, *message.sNonIntraSearchQ);
  if (message.sIntraSearchP) writer.add_uint32(Tag::sIntraSearchP, *message.sIntraSearchP);
  if (message.sIntraSearchQ) writer.add_uint32(Tag::sIntraSearchQ, *message.sIntraSearchQ);
  if (message.threshServingLowP)
    writer.add_uint32(Tag::threshServingLowP, *message.threshServingLowP);
  if (message.threshServingLowQ)
    writer.add_uint32(Tag::threshServingLowQ, *message.threshServingLowQ);
  if (message.priorityOperatingFreq)
    writer.add_uint32(Tag::priorityOperatingFreq, *message.priorityOperatingFreq);
  for (const auto& each : message.nbrEutra) write(each, {writer, Tag::nbrEutra});
}

namespace {

void write(const KCellularTrackingAreaId& message,
           pbf_builder<KCellularTrackingAreaId::Tag> writer) {
  using Tag = KCellularTrackingAreaId::Tag;
  if (message.encodedPlmn) writer.add_bytes(Tag::encodedPlmn, *message.encodedPlmn);
  if (message.tac) writer.add_uint32(Tag::tac, *message.tac);
}

void write(const Guti& message, pbf_builder<Guti::Tag> writer) {
  using Tag = Guti::Tag;
  if (message.mmegi) writer.add_uint32(Tag::mmegi, *message.mmegi);
  if (message.mmec) writer.add_uint32(Tag::mmec, *message.mmec);
  if (message.mTmsi) writer.add_uint32(Tag::mTmsi, *message.mTmsi);
}

}  // namespace

void write(const KCellularEmmContext& message, std::string& out) {
  using Tag = KCellularEmmContext::Tag;
  pbf_builder<Tag> writer(out);
  if (message.timestamp) writer.add_uint64(Tag::timestamp, *message.timestamp);
  if (message.regStatus) writer.add_enum(Tag::regStatus, *message.regStatus);
  if (message.updateStatus) writer.add_enum(Tag::updateStatus, *message.updateStatus);
  if (message.ueOpMode) writer.add_enum(Tag::ueOpMode, *message.ueOpMode);
  for (const auto& each : message.taiList) write(each, {writer, Tag::taiList});
  if (message.guti) write(*message.guti, {writer, Tag::guti});
  if (message.rejectCause) writer.add_enum(Tag::rejectCause, *message.rejectCause);
  if (message.regProc) writer.add_enum(Tag::regProc, *message.regProc);
  if (message.t3412DurS) writer.add_uint32(Tag::t3412DurS, *message.t3412DurS);
  if (message.isImsVoiceSupported)
    writer.add_bool(Tag::isImsVoiceSupported, *message.isImsVoiceSupported);
  if (message.isEmergBearerSupported)
    writer.add_bool(Tag::isEmergBearerSupported, *message.isEmergBearerSupported);
}

namespace {

void write(const BearerContext& message, pbf_builder<BearerContext::Tag> writer) {
  using Tag = BearerContext::Tag;
  if (message.cid) writer.add_uint32(Tag::cid, *message.cid);
  if (message.nsapi) writer.add_uint32(Tag::nsapi, *message.nsapi);
  if (message.apn) writer.add_string(Tag::apn, *message.apn);
  if (message.pdpType) writer.add_enum(Tag::pdpType, *message.pdpType);
  if (message.pdpAddr) writer.add_bytes(Tag::pdpAddr, *message.pdpAddr);
  if (message.primaryDnsType) writer.add_enum(Tag::primaryDnsType, *message.primaryDnsType);
  if (message.primaryDnsAddr) writer.add_bytes(Tag::primaryDnsAddr, *message.primaryDnsAddr);
  if (message.secondaryDnsType) writer.add_enum(Tag::secondaryDnsType, *message.secondaryDnsType);
  if (message.secondaryDnsAddr) writer.add_bytes(Tag::secondaryDnsAddr, *message.secondaryDnsAddr);
  if (message.isAddrIratMobile) writer.add_bool(Tag::isAddrIratMobile, *message.isAddrIratMobile);
}

}  // namespace

void write(const KCellularActivatedBearerContexts& message, std::string& out) {
  using Tag = KCellularActivatedBearerContexts::Tag;
  pbf_builder<Tag> writer(out);
  if (message.timestamp) writer.add_uint64(Tag::timestamp, *message.timestamp);
  if (message.bearerContextCount)
    writer.add_uint32(Tag::bearerContextCount, *message.bearerContextCount);
  for (const auto& each : message.bearerContexts) write(each, {writer, Tag::bearerContexts});
}

}  // namespace qel::bench::plain
