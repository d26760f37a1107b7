// Events as packets of the stream between service and client.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "base/Bytes.h"
#include "tesk/Message.h"

namespace tesk::bus {

// No packet is longer; what would be is not sent. Well below what a socket takes in one piece.
inline constexpr std::size_t kLargestPacket = 64 * 1024;

struct StreamEvent {
  std::string_view name;  // tesk::kEventMetric or tesk::kEventTrigger
  Message message;
};

// Nothing for a stream that has no packets, or an event that is too large.
std::optional<qel::Bytes> encodeEvent(std::string_view eventName, const Message& event);

// Nothing for bytes that are no packet.
std::optional<StreamEvent> decodeEvent(qel::ByteView packet);

// Whether a metric event says of which metric it is: what comes without may be anybody's bytes.
bool isIdentified(const StreamEvent& event);

}  // namespace tesk::bus
