// How much of what the bus has brought is taken before a loop looks at anything else.
#pragma once

namespace qel::bus {

inline constexpr int kMostMessagesOfATurn = 64;

// A peer that never stops sending holds nobody up for longer than that. What is left is there at
// the next turn: a connection that has read it asks for no sleep (getPollTimeout), and the rest is
// still in the socket. `Connection` is sdbus::IConnection.
template <class Connection>
void processTurn(Connection& connection) {
  for (int i = 0; i < kMostMessagesOfATurn; ++i) {
    if (!connection.processPendingRequest()) return;
  }
}

}  // namespace qel::bus
