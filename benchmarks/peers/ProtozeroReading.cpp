#include <protozero/pbf_message.hpp>

#include "peers/ProtozeroMessages.h"

namespace qel::bench::plain {
namespace {

using protozero::pbf_message;
using protozero::tag_and_type;

constexpr auto kVarint = protozero::pbf_wire_type::varint;
constexpr auto kLengthDelimited = protozero::pbf_wire_type::length_delimited;

void read(pbf_message<EgwErrcNbrEutraMeas::Tag> reader, EgwErrcNbrEutraMeas& message) {
  using Tag = EgwErrcNbrEutraMeas::Tag;
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::nbrEarfcn, kVarint):
        message.nbrEarfcn = reader.get_uint32();
        break;
      case tag_and_type(Tag::nbrPhysCellId, kVarint):
        message.nbrPhysCellId = reader.get_uint32();
        break;
      case tag_and_type(Tag::freqBandInd, kVarint):
        message.freqBandInd = reader.get_uint32();
        break;
      case tag_and_type(Tag::nbrRsrp, kVarint):
        message.nbrRsrp = reader.get_sint32();
        break;
      case tag_and_type(Tag::nbrRsrq, kVarint):
        message.nbrRsrq = reader.get_sint32();
        break;
      default:
        reader.skip();
    }
  }
}

}  // namespace

void read(std::string_view data, KCellularLteNbrEutraCellMeas& message) {
  using Tag = KCellularLteNbrEutraCellMeas::Tag;
  pbf_message<Tag> reader(data.data(), data.size());
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::timestamp, kVarint):
        message.timestamp = reader.get_uint64();
        break;
      case tag_and_type(Tag::measNbrEutra, kLengthDelimited):
        read(reader.get_message(), another(message.measNbrEutra));
        break;
      default:
        reader.skip();
    }
  }
}

void read(std::string_view data, KCellularLteRrcState& message) {
  using Tag = KCellularLteRrcState::Tag;
  pbf_message<Tag> reader(data.data(), data.size());
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::timestamp, kVarint):
        message.timestamp = reader.get_uint64();
        break;
      case tag_and_type(Tag::state, kVarint):
        message.state = reader.get_enum();
        break;
      case tag_and_type(Tag::prevState, kVarint):
        message.prevState = reader.get_enum();
        break;
      case tag_and_type(Tag::prevStateDurMs, kVarint):
        message.prevStateDurMs = reader.get_uint32();
        break;
      case tag_and_type(Tag::cause, kVarint):
        message.cause = reader.get_enum();
        break;
      default:
        reader.skip();
    }
  }
}

namespace {

void read(pbf_message<KCellularTrackingAreaId::Tag> reader, KCellularTrackingAreaId& message) {
  using Tag = KCellularTrackingAreaId::Tag;
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::encodedPlmn, kLengthDelimited):
        message.encodedPlmn = reader.get_bytes();
        break;
      case tag_and_type(Tag::tac, kVarint):
        message.tac = reader.get_uint32();
        break;
      default:
        reader.skip();
    }
  }
}

void read(pbf_message<Guti::Tag> reader, Guti& message) {
  using Tag = Guti::Tag;
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::mmegi, kVarint):
        message.mmegi = reader.get_uint32();
        break;
      case tag_and_type(Tag::mmec, kVarint):
        message.mmec = reader.get_uint32();
        break;
      case tag_and_type(Tag::mTmsi, kVarint):
        message.mTmsi = reader.get_uint32();
        break;
      default:
        reader.skip();
    }
  }
}

}  // namespace

void read(std::string_view data, KCellularEmmContext& message) {
  using Tag = KCellularEmmContext::Tag;
  pbf_message<Tag> reader(data.data(), data.size());
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::timestamp, kVarint):
        message.timestamp = reader.get_uint64();
        break;
      case tag_and_type(Tag::regStatus, kVarint):
        message.regStatus = reader.get_enum();
        break;
      case tag_and_type(Tag::updateStatus, kVarint):
        message.updateStatus = reader.get_enum();
        break;
      case tag_and_type(Tag::ueOpMode, kVarint):
        message.ueOpMode = reader.get_enum();
        break;
      case tag_and_type(Tag::taiList, kLengthDelimited):
        read(reader.get_message(), another(message.taiList));
        break;
      case tag_and_type(Tag::guti, kLengthDelimited):
        if (!message.guti) message.guti.emplace();
        read(reader.get_message(), *message.guti);
        break;
      case tag_and_type(Tag::rejectCause, kVarint):
        message.rejectCause = reader.get_enum();
        break;
      case tag_and_type(Tag::regProc, kVarint):
        message.regProc = reader.get_enum();
        break;
      case tag_and_type(Tag::t3412DurS, kVarint):
        message.t3412DurS = reader.get_uint32();
        break;
      case tag_and_type(Tag::isImsVoiceSupported, kVarint):
        message.isImsVoiceSupported = reader.get_bool();
        break;
      case tag_and_type(Tag::isEmergBearerSupported, kVarint):
        message.isEmergBearerSupported = reader.get_bool();
        break;
      default:
        reader.skip();
    }
  }
}

namespace {

void read(pbf_message<BearerContext::Tag> reader, BearerContext& message) {
  using Tag = BearerContext::Tag;
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::cid, kVarint):
        message.cid = reader.get_uint32();
        break;
      case tag_and_type(Tag::nsapi, kVarint):
        message.nsapi = reader.get_uint32();
        break;
      case tag_and_type(Tag::apn, kLengthDelimited):
        message.apn = reader.get_string();
        break;
      case tag_and_type(Tag::pdpType, kVarint):
        message.pdpType = reader.get_enum();
        break;
      case tag_and_type(Tag::pdpAddr, kLengthDelimited):
        message.pdpAddr = reader.get_bytes();
        break;
      case tag_and_type(Tag::primaryDnsType, kVarint):
        message.primaryDnsType = reader.get_enum();
        break;
      case tag_and_type(Tag::primaryDnsAddr, kLengthDelimited):
        message.primaryDnsAddr = reader.get_bytes();
        break;
      case tag_and_type(Tag::secondaryDnsType, kVarint):
        message.secondaryDnsType = reader.get_enum();
        break;
      case tag_and_type(Tag::secondaryDnsAddr, kLengthDelimited):
        message.secondaryDnsAddr = reader.get_bytes();
        break;
      case tag_and_type(Tag::isAddrIratMobile, kVarint):
        message.isAddrIratMobile = reader.get_bool();
        break;
      default:
        reader.skip();
    }
  }
}

}  // namespace

void read(std::string_view data, KCellularActivatedBearerContexts& message) {
  using Tag = KCellularActivatedBearerContexts::Tag;
  pbf_message<Tag> reader(data.data(), data.size());
  while (reader.next()) {
    switch (reader.tag_and_type()) {
      case tag_and_type(Tag::timestamp, kVarint):
        message.timestamp = reader.get_uint64();
        break;
      case tag_and_type(Tag::bearerContextCount, kVarint):
        message.bearerContextCount = reader.get_uint32();
        break;
      case tag_and_type(Tag::bearerContexts, kLengthDelimited):
        read(reader.get_message(), another(message.bearerContexts));
        break;
      default:
        reader.skip();
    }
  }
}

}  // namespace qel::bench::plain
