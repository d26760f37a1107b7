// LTE's RRC messages in raw logs of modems' diagnostics ports, which the repository does not hold:
// the folder that QEL_DIAG_CAPTURES names.
#pragma once

#include <vector>

#include "rrc/Tshark.h"
#include "rrc/lte/Channel.h"

namespace qel::testing {

struct CapturedMessage {
  rrc::lte::Channel channel;
  Bytes pdu;
};

// Each once. Nothing when the variable is not set.
std::vector<CapturedMessage> capturedLteMessages();

}  // namespace qel::testing
