#include "sources/SourceChoice.h"

#include <sysexits.h>

#include <algorithm>
#include <charconv>
#include <utility>

#include "sources/diagnostics/port/PortName.h"

namespace qel::sources {
namespace {

constexpr std::string_view kSimulated = "simulated";
constexpr std::string_view kRecording = "recording:";
constexpr std::string_view kModemManager = "modem-manager";
constexpr std::string_view kDiagnostics = "diag";
constexpr std::string_view kAuto = "auto";
constexpr std::string_view kAndModemManager = "+modem-manager";
constexpr unsigned kMostRadios = 16;
constexpr double kSlowest = 0.01;
constexpr double kFastest = 1e6;

template <class Number>
std::optional<Number> numberOf(std::string_view text) {
  Number number{};
  const auto [end, code] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (code != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return number;
}

bool readSpeed(std::string_view text, double& speed) {
  const auto number = numberOf<double>(text);
  // Also false for what is no number at all.
  if (!number || !(*number >= kSlowest && *number <= kFastest)) return false;
  speed = *number;
  return true;
}

bool readOption(std::string_view name, std::string_view value, SimulatedChoice& choice) {
  if (name == "speed") return readSpeed(value, choice.speed);
  const auto number = numberOf<std::uint64_t>(value);
  if (!number) return false;
  if (name == "seed") {
    choice.seed = *number;
  } else if (name == "start") {
    choice.startMs = *number;
  } else {
    return false;
  }
  return true;
}

std::nullopt_t refuse(SourceError& error, std::string message) {
  error = {EX_USAGE, std::move(message)};
  return std::nullopt;
}

std::optional<SourceChoice> parseSimulated(std::string_view options, SourceError& error) {
  SimulatedChoice choice;
  while (!options.empty()) {
    options.remove_prefix(1);  // the comma
    const std::string_view option = options.substr(0, options.find(','));
    options.remove_prefix(option.size());
    const std::size_t equals = option.find('=');
    if (equals == std::string_view::npos ||
        !readOption(option.substr(0, equals), option.substr(equals + 1), choice)) {
      return refuse(error, "simulated source: bad option \"" + std::string(option) +
                               "\" (seed=N, speed=0.01..1000000, start=MS)");
    }
  }
  return choice;
}

// Takes options from the end of the text for as long as they are options: what is left is the file.
// `take` answers whether it knows the name and whether the value is good.
enum class OptionIs : std::uint8_t { good, bad, none };

template <class Take>
std::string_view takeOptions(std::string_view text, Take take, std::string_view& bad) {
  for (std::size_t comma = text.rfind(','); comma != std::string_view::npos;
       comma = text.rfind(',')) {
    const std::string_view option = text.substr(comma + 1);
    const std::size_t equals = option.find('=');
    const bool hasValue = equals != std::string_view::npos;
    const OptionIs is = take(option.substr(0, equals),
                             hasValue ? option.substr(equals + 1) : std::string_view(), hasValue);
    if (is == OptionIs::none) break;
    if (is == OptionIs::bad) bad = option;
    if (is == OptionIs::bad) break;
    text = text.substr(0, comma);
  }
  return text;
}

std::optional<SourceChoice> parseRecording(std::string_view text, SourceError& error) {
  RecordingChoice choice;
  bool speedSet = false;
  std::string_view bad;
  const auto take = [&](std::string_view name, std::string_view value, bool hasValue) {
    if (name == "loop" && !hasValue) {
      choice.loops = true;
      return OptionIs::good;
    }
    if (name != "speed" || !hasValue) return OptionIs::none;
    double speed = 1;
    if (!readSpeed(value, speed)) return OptionIs::bad;
    if (!std::exchange(speedSet, true)) choice.speed = speed;
    return OptionIs::good;
  };
  text = takeOptions(text, take, bad);
  if (!bad.empty()) {
    return refuse(
        error, "recording source: bad option \"" + std::string(bad) + "\" (speed=0.01..1000000)");
  }
  if (text.empty()) return refuse(error, "recording source: no file named");
  choice.path = text;
  return choice;
}

bool isImei(std::string_view text) {
  constexpr std::size_t kImeiDigits = 15;    // 23.003, clause 6.2
  constexpr std::size_t kImeiSvDigits = 16;  // with the software version
  return (text.size() == kImeiDigits || text.size() == kImeiSvDigits) &&
         std::ranges::all_of(text, [](char c) { return c >= '0' && c <= '9'; });
}

bool isObjectPath(std::string_view text) {
  return text.size() > 1 && text.front() == '/' && text.back() != '/' &&
         text.find("//") == std::string_view::npos && std::ranges::all_of(text, [](char c) {
           return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') ||
                  c == '_' || c == '/';
         });
}

// The bus is the last option: its address goes to the end.
std::optional<ModemManagerChoice> parseModemManager(std::string_view text, SourceError& error) {
  constexpr std::string_view kBus = ",bus=";
  ModemManagerChoice choice;
  if (const std::size_t bus = text.find(kBus); bus != std::string_view::npos) {
    choice.bus = text.substr(bus + kBus.size());
    if (choice.bus.empty()) return refuse(error, "modem-manager source: no bus named");
    text = text.substr(0, bus);
  }
  if (text.empty()) return choice;
  const std::string_view modem = text.substr(1);
  if (text.front() == ':' && isImei(modem)) {
    choice.imei = modem;
  } else if (text.front() == ':' && isObjectPath(modem)) {
    choice.path = modem;
  } else {
    return refuse(error, "modem-manager source: bad modem \"" + std::string(text) +
                             "\" (:IMEI of 15 digits or :/org/freedesktop/ModemManager1/Modem/N)");
  }
  return choice;
}

std::optional<DiagnosticsPlace> parseDiagnostics(std::string_view text, SourceError& error) {
  DiagnosticsPlace choice;
  std::string_view bad;
  const auto take = [&](std::string_view name, std::string_view value, bool hasValue) {
    if (!hasValue || (name != "speed" && name != "radio")) return OptionIs::none;
    if (name == "speed") {
      double speed = 1;
      if (!readSpeed(value, speed)) return OptionIs::bad;
      if (!choice.speed) choice.speed = speed;
      return OptionIs::good;
    }
    const auto radio = numberOf<unsigned>(value);
    if (!radio || *radio == 0 || *radio > kMostRadios) return OptionIs::bad;
    choice.radio = *radio;
    return OptionIs::good;
  };
  text = takeOptions(text, take, bad);
  if (!bad.empty() || (!text.empty() && text.front() != ':')) {
    return refuse(error, "diag source: bad option \"" +
                             std::string(bad.empty() ? text.substr(1) : bad) +
                             "\" (radio=1..16, of a file speed=0.01..1000000)");
  }
  if (text == ":") return refuse(error, "diag source: no port or file named");
  if (!text.empty()) choice.place = text.substr(1);
  if (choice.speed && diagnostics::isPortName(choice.place)) {
    return refuse(error, "diag source: a port has no speed, only a file has");
  }
  return choice;
}

// "diag…+modem-manager…"
std::optional<SourceChoice> parseCombined(std::string_view diagnostics, std::string_view manager,
                                          SourceError& error) {
  const auto port = parseDiagnostics(diagnostics, error);
  if (!port) return std::nullopt;
  if (!diagnostics::isPortName(port->place)) {
    return refuse(error, "diag source: a file and ModemManager do not go together");
  }
  const auto modem = parseModemManager(manager, error);
  if (!modem) return std::nullopt;
  CombinedChoice choice;
  choice.port = *port;
  choice.manager = *modem;
  return choice;
}

std::optional<SourceChoice> parseAuto(std::string_view text, SourceError& error) {
  if (!text.empty() && !text.starts_with(",bus=")) {
    return refuse(error,
                  "auto source: bad option \"" + std::string(text.substr(1)) + "\" (bus=ADDRESS)");
  }
  const auto modem = parseModemManager(text, error);
  if (!modem) return std::nullopt;
  CombinedChoice choice;
  choice.manager = *modem;
  choice.isPortMissed = false;
  return choice;
}

// Whether the text names that source, alone or with something behind it.
bool names(std::string_view text, std::string_view source, std::string_view behind) {
  return text.starts_with(source) &&
         (text.size() == source.size() || behind.find(text[source.size()]) != behind.npos);
}

}  // namespace

std::optional<SourceChoice> parseSourceChoice(std::string_view text, SourceError& error) {
  if (names(text, kSimulated, ",")) return parseSimulated(text.substr(kSimulated.size()), error);
  if (text.starts_with(kRecording)) return parseRecording(text.substr(kRecording.size()), error);
  if (names(text, kModemManager, ":,")) {
    return parseModemManager(text.substr(kModemManager.size()), error);
  }
  if (names(text, kDiagnostics, ":,+")) {
    const std::string_view rest = text.substr(kDiagnostics.size());
    const std::size_t also = rest.find(kAndModemManager);
    if (also == std::string_view::npos) return parseDiagnostics(rest, error);
    return parseCombined(rest.substr(0, also), rest.substr(also + kAndModemManager.size()), error);
  }
  if (names(text, kAuto, ",")) return parseAuto(text.substr(kAuto.size()), error);
  return refuse(error, "unknown source \"" + std::string(text) +
                           "\" (auto[,bus=ADDRESS], simulated[,seed=N][,speed=N][,start=MS], "
                           "recording:FILE[,speed=N][,loop], "
                           "modem-manager[:IMEI|:PATH][,bus=ADDRESS], diag[:PORT][,radio=N]"
                           "[+modem-manager…] or diag:FILE[,speed=N][,radio=N])");
}

}  // namespace qel::sources
