// The text by which a user names a source.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <variant>

#include "sources/EventSource.h"
#include "sources/SourceError.h"
#include "sources/WaitClock.h"

namespace qel::sources {

struct SimulatedChoice {
  std::uint64_t seed = 1;
  double speed = 1;                      // simulated seconds in one
  std::optional<std::uint64_t> startMs;  // absent: the time of the start
};

struct RecordingChoice {
  std::string path;
  double speed = 1;
  bool loops = false;
};

// A modem by its IMEI or its object path; with neither the first.
struct ModemManagerChoice {
  std::string imei;
  std::string path;
  std::string bus = "system";  // or "session", or an address
};

// A diagnostics port or a file of what one sent. `place` is a device, "@NAME" for a router's socket
// or a file; empty: the likeliest port.
struct DiagnosticsPlace {
  std::string place;
  unsigned radio = 1;
  std::optional<double> speed;  // of a file
};

// The port and ModemManager together. `isPortMissed`: it was asked for by name.
struct CombinedChoice {
  DiagnosticsPlace port;
  ModemManagerChoice manager;
  bool isPortMissed = true;
};

using SourceChoice = std::variant<SimulatedChoice, RecordingChoice, ModemManagerChoice,
                                  DiagnosticsPlace, CombinedChoice>;

// "simulated[,seed=N][,speed=N][,start=MS]", "recording:FILE[,speed=N][,loop]",
// "modem-manager[:IMEI|:PATH][,bus=ADDRESS]", "diag[:PORT][,radio=N]", "diag:FILE[,speed=N]
// [,radio=N]", "diag[:PORT][,radio=N]+modem-manager[…]" or "auto[,bus=ADDRESS]". A file name and an
// address may contain commas. Nothing when the text is none of them; `error` then says what is
// wrong.
std::optional<SourceChoice> parseSourceChoice(std::string_view text, SourceError& error);

// Nothing when there is no such source; of a file the beginning is looked at.
std::unique_ptr<EventSource> makeSource(const SourceChoice& choice, SourceError& error,
                                        WaitClock& clock = steadyWaitClock());

}  // namespace qel::sources
