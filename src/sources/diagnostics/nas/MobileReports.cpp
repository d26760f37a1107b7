#include "sources/diagnostics/nas/MobileReports.h"

#include <memory>

#include "messages/nas.h"
#include "messages/runtime/MessageReader.h"
#include "sources/Filling.h"

namespace qel::diagnostics {
namespace {

using sources::set;

// What the network told this phone, else what the cell tells all phones.
std::optional<std::uint32_t> periodicLocationUpdateS(const Picture& picture) {
  constexpr std::uint32_t kTenthOfAnHourS = 360;
  if (picture.nas.mm.periodicUpdateS) return picture.nas.mm.periodicUpdateS;
  const auto& channel = picture.gsm.broadcast.controlChannel;
  if (picture.technology != Technology::gsm || !channel) return std::nullopt;
  return channel->t3212 * kTenthOfAnHourS;
}

}  // namespace

std::optional<Bytes> mmContext(const Picture& picture, std::uint64_t timeMs) {
  using Context = KCellularMmContext;
  const MmPart& mm = picture.nas.mm;
  if (!mm.registration && !mm.updateStatus && !mm.area && !mm.tmsi && !mm.combined) {
    return std::nullopt;
  }
  Context message;
  message.setTimestamp(timeMs);
  set(message, &Context::setRegStatus, mm.registration);
  set(message, &Context::setUpdateStatus, mm.updateStatus);
  if (mm.area) {
    auto area = makeMessage<KCellularLocationAreaId>();
    area->setEncodedPlmn(bytesOf(mm.area->plmn));
    area->setLac(mm.area->lac);
    message.setLai(area);
  }
  set(message, &Context::setTmsi, mm.tmsi);
  set(message, &Context::setT3212DurS, periodicLocationUpdateS(picture));
  set(message, &Context::setProcFailureCause, mm.failureCause);
  set(message, &Context::setRejectCause, mm.rejectCause);
  set(message, &Context::setIsCombinedProc, mm.combined);
  return message.data();
}

std::optional<Bytes> gmmContext(const Picture& picture, std::uint64_t timeMs) {
  using Context = KCellularGmmContext;
  const GmmPart& gmm = picture.nas.gmm;
  if (!gmm.registration && !gmm.area && !gmm.pTmsi && !gmm.procedure) return std::nullopt;
  Context message;
  message.setTimestamp(timeMs);
  set(message, &Context::setRegStatus, gmm.registration);
  set(message, &Context::setUpdateStatus, gmm.updateStatus);
  if (gmm.area) {
    auto area = makeMessage<RoutingAreaId>();
    area->setEncodedPlmn(bytesOf(gmm.area->location.plmn));
    area->setLac(gmm.area->location.lac);
    area->setRac(gmm.area->rac);
    message.setRai(area);
  }
  set(message, &Context::setPTmsi, gmm.pTmsi);
  set(message, &Context::setT3312DurS, gmm.periodicUpdateS);
  set(message, &Context::setProcFailureCause, gmm.failureCause);
  set(message, &Context::setRejectCause, gmm.rejectCause);
  set(message, &Context::setRegProc, gmm.procedure);
  return message.data();
}

}  // namespace qel::diagnostics
