// The states of LTE's connection: from the modem's events, and from messages where it tells none.
#pragma once

#include "rrc/lte/Messages.h"
#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

// 1606: a state; 1607: out of service; 1608: the radio link failed.
Outcome readRrcState(const ModemEvent& event, Picture& picture, Told& told);
Outcome readOutOfService(const ModemEvent& event, Picture& picture, Told& told);
Outcome readRadioLinkFailure(const ModemEvent& event, Picture& picture, Told& told);

// What a message on a channel of the connection says of its state and of its causes.
void followState(const rrc::LteMessage& message, rrc::LteChannel channel, std::uint64_t timeMs,
                 Picture& picture, Told& told);

}  // namespace qel::diagnostics
