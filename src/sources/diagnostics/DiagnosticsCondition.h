// How it is with a diagnostics port and the modem behind it, in words.
#pragma once

#include <string>

#include "sources/SourceCondition.h"
#include "sources/diagnostics/port/PortFinder.h"
#include "sources/diagnostics/session/DiagnosticsSession.h"

namespace qel::diagnostics {

sources::SourceCondition conditionWithoutPort(const PortTrouble& trouble);
sources::SourceCondition conditionOf(const DiagnosticsSession& session, bool knowsCell);

// One line for the system log: what is wrong with the port, and what to do. Empty when nothing is.
std::string adviceWithoutPort(const FoundPort& port, const PortTrouble& trouble);
std::string adviceOf(DiagnosticsSession::State state, const FoundPort& port);

}  // namespace qel::diagnostics
