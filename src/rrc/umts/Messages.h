// UMTS's RRC messages (25.331) about one phone's connection, as far as they tell why it begins and
// ends: plain values.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"

namespace qel::rrc::umts {

enum class Channel : std::uint8_t { ulCcch, dlCcch, dlDcch };

// In the order of the standard, that is of the values on the air.
enum class RejectionCause : std::uint8_t { congestion, unspecified };
enum class ReleaseCause : std::uint8_t {
  normalEvent,
  unspecified,
  preEmptiveRelease,
  congestion,
  reestablishmentReject,
  directedSignallingConnectionReestablishment,
  userInactivity,
  spare,
};

// One of them at most: nothing for messages of other kinds.
struct Message {
  std::optional<unsigned> establishmentCause;  // 0 to 31; above 22 are spares
  std::optional<RejectionCause> rejectionCause;
  std::optional<ReleaseCause> releaseCause;
};

}  // namespace qel::rrc::umts

namespace qel::rrc {

// Any thread. Nothing when the bits are no message of that channel.
std::optional<umts::Message> readUmtsMessage(umts::Channel channel, ByteView pdu);

}  // namespace qel::rrc
