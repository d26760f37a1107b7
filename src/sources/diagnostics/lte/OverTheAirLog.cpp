#include "sources/diagnostics/lte/OverTheAirLog.h"

#include "rrc/lte/Messages.h"
#include "sources/diagnostics/lte/Configuration.h"
#include "sources/diagnostics/lte/LevelCheck.h"
#include "sources/diagnostics/lte/OverTheAir.h"
#include "sources/diagnostics/lte/Reported.h"
#include "sources/diagnostics/lte/RrcStates.h"
#include "sources/diagnostics/lte/SystemInformation.h"

namespace qel::diagnostics {
namespace {

using rrc::LteChannel;

// Paging is most of what a phone receives, and tells nothing of what is asked here.
bool isRead(LteChannel channel) {
  switch (channel) {
    case LteChannel::bcchDlSch:
    case LteChannel::dlCcch:
    case LteChannel::dlDcch:
    case LteChannel::ulCcch:
    case LteChannel::ulDcch:
      return true;
    default:
      return false;
  }
}

}  // namespace

Outcome readLteOverTheAir(const LogPacket& packet, Picture& picture, Told& told) {
  const OverTheAir air = overTheAir(packet.body);
  if (air.outcome != Outcome::understood) return air.outcome;
  if (!isRead(air.channel)) return Outcome::notOurs;
  if (!isCell(air.cell)) return Outcome::damaged;
  const auto message = rrc::readLteMessage(air.channel, air.message);
  if (!message) return Outcome::damaged;
  if (air.channel == LteChannel::bcchDlSch) {
    takeSystemInformation(*message, air.cell, picture, told);
    return told.empty() ? Outcome::notOurs : Outcome::understood;
  }
  picture.lte.camp(air.cell);
  followState(*message, air.channel, packet.timeMs, picture, told);
  takeConfiguration(*message, packet.timeMs, picture, told);
  if (message->report) takeReported(*message->report, packet.timeMs, picture, told);
  return Outcome::understood;
}

}  // namespace qel::diagnostics
