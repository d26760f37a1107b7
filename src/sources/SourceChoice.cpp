#include "sources/SourceChoice.h"

#include <sysexits.h>

#include <algorithm>
#include <charconv>
#include <utility>

namespace qel::sources {
namespace {

constexpr std::string_view kSimulated = "simulated";
constexpr std::string_view kRecording = "recording:";
constexpr std::string_view kModemManager = "modem-manager";
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

// Options are taken from the end for as long as they are options: what is left is the file.
std::optional<SourceChoice> parseRecording(std::string_view text, SourceError& error) {
  RecordingChoice choice;
  bool speedSet = false;
  for (std::size_t comma = text.rfind(','); comma != std::string_view::npos;
       comma = text.rfind(',')) {
    const std::string_view option = text.substr(comma + 1);
    if (option == "loop") {
      choice.loops = true;
    } else if (option.starts_with("speed=")) {
      double speed = 1;
      if (!readSpeed(option.substr(option.find('=') + 1), speed)) {
        return refuse(error, "recording source: bad option \"" + std::string(option) +
                                 "\" (speed=0.01..1000000)");
      }
      if (!std::exchange(speedSet, true)) choice.speed = speed;
    } else {
      break;
    }
    text = text.substr(0, comma);
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
std::optional<SourceChoice> parseModemManager(std::string_view text, SourceError& error) {
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

}  // namespace

std::optional<SourceChoice> parseSourceChoice(std::string_view text, SourceError& error) {
  if (text == kSimulated || text.starts_with(std::string(kSimulated) + ",")) {
    return parseSimulated(text.substr(kSimulated.size()), error);
  }
  if (text.starts_with(kRecording)) return parseRecording(text.substr(kRecording.size()), error);
  if (text == kModemManager || text.starts_with(std::string(kModemManager) + ":") ||
      text.starts_with(std::string(kModemManager) + ",")) {
    return parseModemManager(text.substr(kModemManager.size()), error);
  }
  return refuse(error, "unknown source \"" + std::string(text) +
                           "\" (simulated[,seed=N][,speed=N][,start=MS], "
                           "recording:FILE[,speed=N][,loop] or "
                           "modem-manager[:IMEI|:PATH][,bus=ADDRESS])");
}

}  // namespace qel::sources
