// The steps of a connection, and how long its causes hold.
#pragma once

#include "sources/diagnostics/picture/UmtsPicture.h"

namespace qel::diagnostics {

// The last release's cause holds until the next connection is asked for, the cause of that until
// the phone is idle again. Packets that tell the same step twice change nothing.
inline void enter(UmtsState state, UmtsConnection& connection) {
  const bool begins = state == UmtsState::establish && connection.state != state;
  const bool ends = state == UmtsState::idle || state == UmtsState::inactive;
  if (begins) connection.releaseCause.reset();
  if (ends) connection.establishmentCause.reset();
  connection.state = state;
}

}  // namespace qel::diagnostics
