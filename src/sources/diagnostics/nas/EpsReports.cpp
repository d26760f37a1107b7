#include "sources/diagnostics/nas/EpsReports.h"

#include <memory>

#include "messages/nas.h"
#include "messages/runtime/MessageReader.h"
#include "sources/Filling.h"

namespace qel::diagnostics {
namespace {

using sources::set;

constexpr std::int32_t kPdpIPv4 = 0;  // of PdpType, as an address
constexpr std::int32_t kPdpIPv6 = 1;

std::int32_t addressType(const Bytes& address) { return address.size() == 4 ? kPdpIPv4 : kPdpIPv6; }

std::shared_ptr<KCellularTrackingAreaId> message(const TrackingArea& area) {
  auto entry = makeMessage<KCellularTrackingAreaId>();
  entry->setEncodedPlmn(bytesOf(area.plmn));
  entry->setTac(area.tac);
  return entry;
}

std::shared_ptr<KCellularLocationAreaId> message(const LocationArea& area) {
  auto entry = makeMessage<KCellularLocationAreaId>();
  entry->setEncodedPlmn(bytesOf(area.plmn));
  entry->setLac(area.lac);
  return entry;
}

std::shared_ptr<Guti> message(const TemporaryIdentity& identity) {
  auto entry = makeMessage<Guti>();
  entry->setMmegi(identity.group);
  entry->setMmec(identity.entity);
  entry->setMTmsi(identity.mTmsi);
  return entry;
}

std::shared_ptr<BearerContext> message(const PacketConnection& connection) {
  auto entry = makeMessage<BearerContext>();
  entry->setNsapi(connection.nsapi);
  if (!connection.apn.empty()) entry->setApn(connection.apn);
  set(*entry, &BearerContext::setPdpType, connection.type);
  if (!connection.address.empty()) entry->setPdpAddr(connection.address);
  const auto& servers = connection.nameServers;
  if (!servers.empty()) {
    entry->setPrimaryDnsType(addressType(servers[0]));
    entry->setPrimaryDnsAddr(servers[0]);
  }
  if (servers.size() > 1) {
    entry->setSecondaryDnsType(addressType(servers[1]));
    entry->setSecondaryDnsAddr(servers[1]);
  }
  return entry;
}

}  // namespace

std::optional<Bytes> emmContext(const Picture& picture, std::uint64_t timeMs) {
  const EmmPart& emm = picture.nas.emm;
  if (!emm.registration && !emm.identity && !emm.procedure && !emm.rejectCause) return std::nullopt;
  KCellularEmmContext report;
  report.setTimestamp(timeMs);
  set(report, &KCellularEmmContext::setRegStatus, emm.registration);
  set(report, &KCellularEmmContext::setUpdateStatus, emm.updateStatus);
  for (const TrackingArea& area : emm.areas) report.addTaiList(message(area));
  if (emm.identity) report.setGuti(message(*emm.identity));
  set(report, &KCellularEmmContext::setRejectCause, emm.rejectCause);
  set(report, &KCellularEmmContext::setRegProc, emm.procedure);
  set(report, &KCellularEmmContext::setT3412DurS, emm.periodicUpdateS);
  set(report, &KCellularEmmContext::setIsImsVoiceSupported, emm.voiceOverIms);
  set(report, &KCellularEmmContext::setIsEmergBearerSupported, emm.emergencyBearers);
  return report.data();
}

std::optional<Bytes> packetConnections(const Picture& picture, std::uint64_t timeMs) {
  const auto& active = picture.nas.connections.active;
  if (!active) return std::nullopt;
  KCellularActivatedBearerContexts report;
  report.setTimestamp(timeMs);
  report.setBearerContextCount(static_cast<std::uint32_t>(active->size()));
  for (const PacketConnection& connection : *active) report.addBearerContexts(message(connection));
  return report.data();
}

std::optional<Bytes> networksAndAreas(const Picture& picture, std::uint64_t timeMs) {
  const CommonPart& common = picture.nas.common;
  if (common.imsi.empty() && !common.equivalents && common.noRoaming.empty() &&
      common.noService.empty() && common.noRoamingTracking.empty() &&
      common.noServiceTracking.empty()) {
    return std::nullopt;
  }
  KCellularMmCommonInfo report;
  report.setTimestamp(timeMs);
  if (!common.imsi.empty()) report.setImsi(common.imsi);
  for (const PlmnCode& network : common.equivalents.value_or(std::vector<PlmnCode>{})) {
    auto entry = makeMessage<Plmn>();
    entry->setEncodedPlmn(bytesOf(network));
    report.addEplmnList(entry);
  }
  for (const auto& area : common.noRoaming) report.addRoamingFlaiList(message(area));
  for (const auto& area : common.noService) report.addRegProvFlaiList(message(area));
  for (const auto& area : common.noRoamingTracking) report.addRoamingFtaiList(message(area));
  for (const auto& area : common.noServiceTracking) report.addRegProvFtaiList(message(area));
  return report.data();
}

}  // namespace qel::diagnostics
