#include "rrc/umts/Messages.h"

#include "rrc/reader/Walker.h"
#include "rrc/umts_schema.h"

namespace qel::rrc {
namespace {

using umts::Channel;

TypeIndex typeOf(Channel channel) {
  switch (channel) {
    case Channel::ulCcch:
      return umts::type::ULCCCHMessage;
    case Channel::dlCcch:
      return umts::type::DLCCCHMessage;
    case Channel::dlDcch:
      break;
  }
  return umts::type::DLDCCHMessage;
}

template <class Cause>
std::optional<Cause> causeIn(const Node& node) {
  const auto place = node.index();
  return place ? std::optional(static_cast<Cause>(*place)) : std::nullopt;
}

}  // namespace

std::optional<umts::Message> readUmtsMessage(umts::Channel channel, ByteView pdu) {
  namespace mark = umts::mark;
  const auto reading = walk(umts::schema(), typeOf(channel), pdu);
  if (!reading) return std::nullopt;
  const Node top = reading->top();
  umts::Message message;
  take(top[mark::rrcConnectionRequest][mark::establishmentCause], message.establishmentCause);
  message.rejectionCause =
      causeIn<umts::RejectionCause>(top[mark::rrcConnectionReject][mark::rejectionCause]);
  message.releaseCause =
      causeIn<umts::ReleaseCause>(top[mark::rrcConnectionRelease][mark::releaseCause]);
  return message;
}

}  // namespace qel::rrc
