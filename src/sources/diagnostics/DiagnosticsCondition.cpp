#include "sources/diagnostics/DiagnosticsCondition.h"

namespace qel::diagnostics {
namespace {

using sources::SourceCondition;
using State = DiagnosticsSession::State;
using Kind = PortTrouble::Kind;

SourceCondition wordsOf(State state, bool knowsCell) {
  switch (state) {
    case State::starting:
      return {"starting", "Modem starting", "its logs are being switched on"};
    case State::listening:
      if (!knowsCell) return {"searching", "No cell known yet", ""};
      return {"running", "Modem telling", ""};
    case State::resting:
      return {"resting", "Modem's logs off", "nobody listens"};
    case State::silent:
      return {"silent", "Modem silent", "no answer on its diagnostics port"};
    case State::refused:
      return {"refused", "Modem refuses", "it sends no logs"};
    case State::ended:
    case State::lost:
      break;
  }
  return {"no-port", "No diagnostics port", "it has gone"};
}

}  // namespace

SourceCondition conditionWithoutPort(const PortTrouble& trouble) {
  switch (trouble.kind) {
    case Kind::absent:
      break;
    case Kind::held:
      return {"held", "Diagnostics port in use", "another program holds it"};
    case Kind::denied:
      return {"no-rights", "Diagnostics port not allowed", "the service may not open it"};
    case Kind::failed:
      return {"failed", "Diagnostics port broken", "it cannot be opened"};
  }
  return {"no-port", "No diagnostics port", ""};
}

SourceCondition conditionOf(const DiagnosticsSession& session, bool knowsCell) {
  SourceCondition condition = wordsOf(session.state(), knowsCell);
  if (session.build()) condition.model = session.build()->model;
  if (condition.model.empty() && session.version()) condition.model = session.version()->model;
  return condition;
}

std::string adviceWithoutPort(const FoundPort& port, const PortTrouble& trouble) {
  const std::string name = port.address.empty() ? "a port" : port.address;
  switch (trouble.kind) {
    case Kind::absent:
      return port.address.empty() ? "no diagnostics port found, waiting for one"
                                  : name + " is not there (" + trouble.words + "), waiting for it";
    case Kind::held:
      return name +
             " is held by another program, most likely ModemManager: a udev rule with "
             "ENV{ID_MM_PORT_IGNORE}=\"1\" frees it, see DIAGNOSTICS PORT in basebandd(8)";
    case Kind::denied:
      return "no right to open " + name + " (" + trouble.words +
             "): see DIAGNOSTICS PORT in basebandd(8)";
    case Kind::failed:
      break;
  }
  return name + " cannot be opened (" + trouble.words + "), trying again";
}

std::string adviceOf(State state, const FoundPort& port) {
  switch (state) {
    case State::lost:
      return port.address + " has gone, waiting for it";
    case State::silent:
      return "no answer on " + port.address +
             ": another program may take it, see DIAGNOSTICS PORT in basebandd(8); trying again";
    case State::refused:
      return "the modem on " + port.address + " refuses to send logs, trying again";
    case State::starting:
    case State::listening:
    case State::resting:
    case State::ended:
      break;
  }
  return "";
}

}  // namespace qel::diagnostics
