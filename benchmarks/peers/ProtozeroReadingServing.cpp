#include <protozero/pbf_message.hpp>

#include "peers/ProtozeroMessages.h"

namespace qel::bench::plain {
namespace {

using protozero::pbf_message;
using protozero::tag_and_type;

constexpr auto kVarint = protozero::pbf_wire_type::varint;
constexpr auto kLengthDelimited = protozero::pbf_wire_type::length_delimited;

void read(pbf_message<RsrpRsrqSinr::Tag> reader, RsrpRsrqSinr& message) {
  using Tag = RsrpRsrqSinr::Tag;
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::phyCellId, kVarint):
        message.phyCellId = reader.get_uint32();
        break;
      case tag_and_type(Tag::rsrp0, kVarint):
        message.rsrp0 = reader.get_sint32();
        break;
      case tag_and_type(Tag::rsrp1, kVarint):
        message.rsrp1 = reader.get_sint32();
        break;
      case tag_and_type(Tag::rsrq0, kVarint):
        message.rsrq0 = reader.get_sint32();
        break;
      case tag_and_type(Tag::rsrq1, kVarint):
        message.rsrq1 = reader.get_sint32();
        break;
      case tag_and_type(Tag::sinr0, kVarint):
        message.sinr0 = reader.get_sint32();
        break;
      case tag_and_type(Tag::sinr1, kVarint):
        message.sinr1 = reader.get_sint32();
        break;
      default:
        reader.skip();
    }
  }
}

}  // namespace

void read(std::string_view data, KCellularLteRsrpRsrqSinr& message) {
  using Tag = KCellularLteRsrpRsrqSinr::Tag;
  pbf_message<Tag> reader(data.data(), data.size());
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::timestamp, kVarint):
        message.timestamp = reader.get_uint64();
        break;
      case tag_and_type(Tag::callId, kLengthDelimited):
        message.callId = reader.get_string();
        break;
      case tag_and_type(Tag::lastXSeconds, kVarint):
        message.lastXSeconds = reader.get_uint32();
        break;
      case tag_and_type(Tag::lastYSamples, kVarint):
        message.lastYSamples = reader.get_uint32();
        break;
      case tag_and_type(Tag::samplePeriodMs, kVarint):
        message.samplePeriodMs = reader.get_uint32();
        break;
      case tag_and_type(Tag::durationMs, kVarint):
        message.durationMs = reader.get_uint32();
        break;
      case tag_and_type(Tag::numSamples, kVarint):
        message.numSamples = reader.get_uint32();
        break;
      case tag_and_type(Tag::avgValues, kLengthDelimited):
        if (!message.avgValues) message.avgValues.emplace();
        read(reader.get_message(), *message.avgValues);
        break;
      case tag_and_type(Tag::instValues, kLengthDelimited):
        read(reader.get_message(), another(message.instValues));
        break;
      default:
        reader.skip();
    }
  }
}

namespace {

void read(pbf_message<TxPowerInfo::Tag> reader, TxPowerInfo& message) {
  using Tag = TxPowerInfo::Tag;
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::pucchTxPower, kVarint):
        message.pucchTxPower = reader.get_sint32();
        break;
      case tag_and_type(Tag::puschTxPower, kVarint):
        message.puschTxPower = reader.get_sint32();
        break;
      case tag_and_type(Tag::subframeIndex, kVarint):
        message.subframeIndex = reader.get_uint32();
        break;
      default:
        reader.skip();
    }
  }
}

}  // namespace

void read(std::string_view data, KCellularLteTxPower& message) {
  using Tag = KCellularLteTxPower::Tag;
  pbf_message<Tag> reader(data.data(), data.size());
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::timestamp, kVarint):
        message.timestamp = reader.get_uint64();
        break;
      case tag_and_type(Tag::txPowerInfo, kLengthDelimited):
        read(reader.get_message(), another(message.txPowerInfo));
        break;
      default:
        reader.skip();
    }
  }
}

void read(std::string_view data, KCellularLteScellInfo& message) {
  using Tag = KCellularLteScellInfo::Tag;
  pbf_message<Tag> reader(data.data(), data.size());
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::timestamp, kVarint):
        message.timestamp = reader.get_uint64();
        break;
      case tag_and_type(Tag::phyCellId, kVarint):
        message.phyCellId = reader.get_uint32();
        break;
      case tag_and_type(Tag::dlFreq, kVarint):
        message.dlFreq = reader.get_uint32();
        break;
      case tag_and_type(Tag::ulFreq, kVarint):
        message.ulFreq = reader.get_uint32();
        break;
      case tag_and_type(Tag::dlBw, kVarint):
        message.dlBw = reader.get_uint32();
        break;
      case tag_and_type(Tag::ulBw, kVarint):
        message.ulBw = reader.get_uint32();
        break;
      case tag_and_type(Tag::cellId, kVarint):
        message.cellId = reader.get_uint32();
        break;
      case tag_and_type(Tag::freqBandInd, kVarint):
        message.freqBandInd = reader.get_uint32();
        break;
      case tag_and_type(Tag::trackingAreaCode, kVarint):
        message.trackingAreaCode = reader.get_uint32();
        break;
      case tag_and_type(Tag::numMncDigits, kVarint):
        message.numMncDigits = reader.get_uint32();
        break;
      case tag_and_type(Tag::selPlmnMcc, kVarint):
        message.selPlmnMcc = reader.get_uint32();
        break;
      case tag_and_type(Tag::selPlmnMnc, kVarint):
        message.selPlmnMnc = reader.get_uint32();
        break;
      case tag_and_type(Tag::tddSfAssignment, kVarint):
        message.tddSfAssignment = reader.get_uint32();
        break;
      case tag_and_type(Tag::tddSsfPatterns, kVarint):
        message.tddSsfPatterns = reader.get_uint32();
        break;
      default:
        reader.skip();
    }
  }
}

namespace {

void read(pbf_message<NbrEutra::Tag> reader, NbrEutra& message) {
  using Tag = NbrEutra::Tag;
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::earfcn, kVarint):
        message.earfcn = reader.get_uint32();
        break;
      case tag_and_type(Tag::qRxlevMin, kVarint):
        message.qRxlevMin = reader.get_sint32();
        break;
      case tag_and_type(Tag::qQualMin, kVarint):
        message.qQualMin = reader.get_sint32();
        break;
      case tag_and_type(Tag::qOffset, kVarint):
        message.qOffset = reader.get_sint32();
        break;
      case tag_and_type(Tag::pmax, kVarint):
        message.pmax = reader.get_sint32();
        break;
      case tag_and_type(Tag::dlBw, kVarint):
        message.dlBw = reader.get_uint32();
        break;
      case tag_and_type(Tag::thresXHighP, kVarint):
        message.thresXHighP = reader.get_uint32();
        break;
      case tag_and_type(Tag::thresXLowP, kVarint):
        message.thresXLowP = reader.get_uint32();
        break;
      case tag_and_type(Tag::thresXHighQ, kVarint):
        message.thresXHighQ = reader.get_uint32();
        break;
      case tag_and_type(Tag::thresXLowQ, kVarint):
        message.thresXLowQ = reader.get_uint32();
        break;
      case tag_and_type(Tag::priority, kVarint):
        message.priority = reader.get_uint32();
        break;
      case tag_and_type(Tag::frameType, kVarint):
        message.frameType = reader.get_enum();
        break;
      case tag_and_type(Tag::band, kVarint):
        message.band = reader.get_uint32();
        break;
      default:
        reader.skip();
    }
  }
}

}  // namespace

void read(std::string_view data, KCellularLteSelReselCellInfo& message) {
  using Tag = KCellularLteSelReselCellInfo::Tag;
  pbf_message<Tag> reader(data.data(), data.size());
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::timestamp, kVarint):
        message.timestamp = reader.get_uint64();
        break;
      case tag_and_type(Tag::multiBandInfo, kLengthDelimited): {
        const auto values = reader.get_packed_uint32();
        message.multiBandInfo.insert(message.multiBandInfo.end(), values.begin(), values.end());
        break;
      }
      case tag_and_type(Tag::multiBandInfo, kVarint):
        message.multiBandInfo.push_back(reader.get_uint32());
        break;
      case tag_and_type(Tag::imsEmergencySupport, kVarint):
        message.imsEmergencySupport = reader.get_uint32();
        break;
      case tag_and_type(Tag::acBarringForEmergency, kVarint):
        message.acBarringForEmergency = reader.get_uint32();
        break;
      case tag_and_type(Tag::moSignallingAcBarringFactor, kVarint):
        message.moSignallingAcBarringFactor = reader.get_uint32();
        break;
      case tag_and_type(Tag::moSignallingAcBarringTime, kVarint):
        message.moSignallingAcBarringTime = reader.get_uint32();
        break;
      case tag_and_type(Tag::moSignallingAcBarringForSpecialAc, kVarint):
        message.moSignallingAcBarringForSpecialAc = reader.get_uint32();
        break;
      case tag_and_type(Tag::moDataAcBarringFactor, kVarint):
        message.moDataAcBarringFactor = reader.get_uint32();
        break;
      case tag_and_type(Tag::moDataAcBarringTime, kVarint):
        message.moDataAcBarringTime = reader.get_uint32();
        break;
      case tag_and_type(Tag::moDataAcBarringForSpecialAc, kVarint):
        message.moDataAcBarringForSpecialAc = reader.get_uint32();
        break;
      case tag_and_type(Tag::qRxLevMin, kVarint):
        message.qRxLevMin = reader.get_sint32();
        break;
      case tag_and_type(Tag::qQualMin, kVarint):
        message.qQualMin = reader.get_sint32();
        break;
      case tag_and_type(Tag::qHyst, kVarint):
        message.qHyst = reader.get_uint32();
        break;
      case tag_and_type(Tag::sNonIntraSearchP, kVarint):
        message.sNonIntraSearchP = reader.get_uint32();
        break;
      case tag_and_type(Tag::sNonIntraSearchQ, kVarint):
        message.sNonIntraSearchQ = reader.get_uint32();
        break;
      case tag_and_type(Tag::sIntraSearchP, kVarint):
        message.sIntraSearchP = reader.get_uint32();
        break;
      case tag_and_type(Tag::sIntraSearchQ, kVarint):
        message.sIntraSearchQ = reader.get_uint32();
        break;
      case tag_and_type(Tag::threshServingLowP, kVarint):
        message.threshServingLowP = reader.get_uint32();
        break;
      case tag_and_type(Tag::threshServingLowQ, kVarint):
        message.threshServingLowQ = reader.get_uint32();
        break;
      case tag_and_type(Tag::priorityOperatingFreq, kVarint):
        message.priorityOperatingFreq = reader.get_uint32();
        break;
      case tag_and_type(Tag::nbrEutra, kLengthDelimited):
        read(reader.get_message(), another(message.nbrEutra));
        break;
      default:
        reader.skip();
    }
  }
}

}  // namespace qel::bench::plain
