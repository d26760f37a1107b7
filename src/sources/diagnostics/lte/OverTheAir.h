// The head of the packets that carry an RRC message of LTE as it went over the air (0xB0C0).
#pragma once

#include "rrc/lte/Channel.h"
#include "sources/diagnostics/packets/Packet.h"
#include "sources/diagnostics/picture/LteCells.h"

namespace qel::diagnostics {

struct OverTheAir {
  Outcome outcome = Outcome::damaged;  // the rest holds when it is understood
  LteCellName cell;
  rrc::lte::Channel channel = rrc::lte::Channel::bcchDlSch;
  ByteView message;
};

// Any thread. Parts of messages and messages of NB-IoT are not ours.
OverTheAir overTheAir(ByteView body);

}  // namespace qel::diagnostics
