// qelctl diag-report: which packets a modem sends, for those who teach this program new layouts.

#include <poll.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <chrono>
#include <cstring>
#include <memory>
#include <string>

#include "base/TerminalText.h"
#include "sources/SourceError.h"
#include "sources/diagnostics/PacketTable.h"
#include "sources/diagnostics/files/RawLog.h"
#include "sources/diagnostics/port/PortFinder.h"
#include "sources/diagnostics/port/PortName.h"
#include "sources/diagnostics/session/DiagnosticsSession.h"
#include "tools/Commands.h"
#include "tools/PacketReport.h"
#include "tools/StopSignals.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

using diagnostics::DiagnosticsSession;
using SteadyClock = DiagnosticsSession::Clock;
using namespace std::chrono_literals;

constexpr auto kFarewell = 2s;

struct ReportOptions {
  std::string place;
  double durationS = 60;
};

diagnostics::FrameReader::Counts readFile(const std::string& path, PacketReport& report) {
  sources::SourceError error;
  const auto log = diagnostics::RawLog::open(path, error);
  if (!log) throw ToolError(error.exitCode, error.message);
  while (log->read(report)) {
  }
  if (!log->fault().message.empty()) throw ToolError(log->fault().exitCode, log->fault().message);
  if (log->frames().frames == 0) {
    throw ToolError(EX_DATAERR, log->name(), "no frame of a diagnostics port in it");
  }
  return log->frames();
}

std::unique_ptr<diagnostics::DiagPort> openPort(const std::string& wished) {
  diagnostics::PortFinder finder(wished, diagnostics::makeUdevPortSearch());
  if (auto port = finder.open()) return port;
  const std::string& address = finder.port().address;
  if (address.empty()) throw ToolError(EX_NOINPUT, "no diagnostics port found");
  const bool isHeld = finder.trouble().kind == diagnostics::PortTrouble::Kind::held;
  throw ToolError(EX_NOINPUT, address,
                  finder.trouble().words + (isHeld ? " (does the service listen there?)" : ""));
}

// Until then, a signal or the end of the session.
void live(DiagnosticsSession& session, const diagnostics::DiagPort& port,
          const StopSignals* signals, SteadyClock::time_point end) {
  while (!session.isOver() && !(signals && signals->arrived()) && SteadyClock::now() < end) {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(
        std::clamp(std::min(end, session.due()) - SteadyClock::now(), SteadyClock::duration::zero(),
                   SteadyClock::duration(1h)));
    pollfd waited[] = {{port.descriptor(), POLLIN, 0},
                       {signals ? signals->wakeUp().descriptor() : -1, POLLIN, 0}};
    ::poll(waited, 2, static_cast<int>(left.count()));
    const auto now = SteadyClock::now();
    if (waited[0].revents != 0) session.receive(now);
    if (session.due() <= now) session.step(now);
  }
}

diagnostics::FrameReader::Counts listen(const ReportOptions& options, PacketReport& report) {
  const StopSignals signals(StopSignals::Waiting::fails);
  const auto port = openPort(options.place);
  complain("qelctl", "listening for " + std::to_string(static_cast<int>(options.durationS)) +
                         " s; let the phone do something");
  DiagnosticsSession session(
      *port, report,
      {[](std::uint16_t code) { return diagnostics::findLog(code) != nullptr; },
       [](std::uint16_t id) { return diagnostics::findEvent(id) != nullptr; }},
      {}, SteadyClock::now());
  live(session, *port, &signals,
       SteadyClock::now() + std::chrono::duration_cast<SteadyClock::duration>(
                                std::chrono::duration<double>(options.durationS)));
  report.note(session.version(), session.build());
  using State = DiagnosticsSession::State;
  if (session.state() == State::silent || session.state() == State::lost) {
    throw ToolError(EX_IOERR, session.state() == State::silent ? "the modem does not answer"
                                                               : "the port has gone");
  }
  session.end(SteadyClock::now());
  live(session, *port, nullptr, SteadyClock::now() + kFarewell);
  return port->counts();
}

}  // namespace

void addDiagReportCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand(
      "diag-report", "Tell which packets a modem's diagnostics port sends, to send it on");
  command->footer(
      "The report has codes, versions and lengths of packets, and the names of the chip's\n"
      "software. It has nothing of what is in the packets: no identity, no place, no time.");
  const auto options = std::make_shared<ReportOptions>();
  command->add_option("PORT", options->place,
                      "A port, found when not given, or a raw log; - is standard input");
  command->add_option("--duration", options->durationS, "Listen to a port for so many seconds")
      ->type_name("SECONDS")
      ->check(CLI::Range(1.0, 86400.0).description(""))
      ->capture_default_str();
  command->callback([options, &chosen] {
    chosen = [options](Output& output) {
      PacketReport report;
      const bool isPort = diagnostics::isPortName(options->place);
      const auto frames = isPort ? listen(*options, report) : readFile(options->place, report);
      for (const std::string& line : report.lines(frames)) output.line(forTerminal(line));
    };
  });
}

}  // namespace qel::tools
