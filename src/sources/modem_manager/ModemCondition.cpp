#include "sources/modem_manager/ModemCondition.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <string>
#include <vector>

#include "sources/modem_manager/Names.h"

namespace qel::sources {
namespace {

constexpr std::size_t kLongestName = 64;

// A word and a headline by Modem.State; a state that is not here is one of the beginning.
struct StateRow {
  std::int64_t number;
  std::string_view state;
  std::string_view headline;
};
constexpr std::string_view kFailed = "failed";
constexpr std::string_view kLocked = "locked";
constexpr std::string_view kEnabled = "enabled";
constexpr std::string_view kSearching = "searching";
constexpr std::array kStates = {
    StateRow{-1, kFailed, "Modem failed"},
    StateRow{2, kLocked, "Modem locked"},
    StateRow{3, "disabled", "Modem switched off"},
    StateRow{4, "disabled", "Modem switched off"},
    StateRow{5, "enabling", "Modem being switched on"},
    StateRow{mm::kStateEnabled, kEnabled, "No network"},
    StateRow{7, kSearching, "Searching for a network"},
    StateRow{8, "registered", "Registered with a network"},
    StateRow{9, "registered", "Registered with a network"},
    StateRow{10, "registered", "Registered with a network"},
    StateRow{11, "connected", "Connected"},
};
constexpr StateRow kStarting = {0, "starting", "Modem starting"};

struct ReasonRow {
  std::int64_t number;
  std::string_view words;
};
constexpr std::array kFailures = {
    // of Modem.StateFailedReason
    ReasonRow{2, "SIM missing"},
    ReasonRow{3, "SIM faulty"},
    ReasonRow{4, "its abilities are not known"},
    ReasonRow{5, "eSIM without profile"},
};
constexpr std::array kLocks = {
    // of Modem.UnlockRequired
    ReasonRow{2, "SIM PIN needed"},
    ReasonRow{3, "SIM PIN2 needed"},
    ReasonRow{4, "SIM PUK needed"},
    ReasonRow{5, "SIM PUK2 needed"},
    ReasonRow{6, "service provider PIN needed"},
    ReasonRow{7, "service provider PUK needed"},
    ReasonRow{8, "network PIN needed"},
    ReasonRow{9, "network PUK needed"},
    ReasonRow{10, "SIM of this phone needed"},
    ReasonRow{11, "company PIN needed"},
    ReasonRow{12, "company PUK needed"},
    ReasonRow{13, "first SIM of this phone needed"},
    ReasonRow{14, "first SIM of this phone needed"},
    ReasonRow{15, "network subset PIN needed"},
    ReasonRow{16, "network subset PUK needed"},
};
constexpr std::array kRegistrations = {
    // of Modem3gpp.RegistrationState
    ReasonRow{mm::kDenied, "registration denied"},
    ReasonRow{mm::kEmergencyOnly, "emergency calls only"},
};

template <std::size_t Size>
std::string_view wordsIn(const std::array<ReasonRow, Size>& rows, const BusProperties& properties,
                         const std::string& key) {
  const auto number = busInteger(properties, key);
  const auto row = std::ranges::find(rows, number.value_or(0), &ReasonRow::number);
  return row == rows.end() ? std::string_view() : row->words;
}

// What a modem calls itself is shown to people: printable ASCII, and not too much of it.
std::string shownName(std::string_view name) {
  std::string shown;
  for (const char c : name) {
    if (shown.size() == kLongestName) break;
    if (c >= ' ' && c <= '~') shown += c;
  }
  return shown;
}

std::string driversIn(const BusProperties& modem) {
  std::string names;
  const auto drivers = busValue<std::vector<std::string>>(modem, "Drivers");
  for (const std::string& driver : drivers.value_or(std::vector<std::string>())) {
    if (names.size() > kLongestName) break;
    names += (names.empty() ? "" : ", ") + shownName(driver);
  }
  return shownName(names);
}

}  // namespace

SourceCondition noBusCondition() { return {"no-bus", "No message bus", ""}; }

std::optional<SourceCondition> conditionWithoutModem(ObjectTree::Manager manager, bool wished) {
  constexpr std::string_view kNoManager = "no-modem-manager";
  switch (manager) {
    case ObjectTree::Manager::unknown:
      return std::nullopt;
    case ObjectTree::Manager::absent:
      return SourceCondition{kNoManager, "ModemManager not running", ""};
    case ObjectTree::Manager::denied:
      return SourceCondition{kNoManager, "ModemManager not reachable", "no permission"};
    case ObjectTree::Manager::silent:
      return SourceCondition{kNoManager, "ModemManager not reachable", "it does not answer"};
    case ObjectTree::Manager::present:
      break;
  }
  return SourceCondition{"absent", "No modem", wished ? "the chosen one is not there" : ""};
}

SourceCondition conditionOf(const BusInterfaces& modem) {
  const BusProperties& own = propertiesOf(modem, mm::kModem);
  const auto number = busInteger(own, "State");
  const auto found = std::ranges::find(kStates, number.value_or(0), &StateRow::number);
  const StateRow& row = found == kStates.end() ? kStarting : *found;
  SourceCondition condition{row.state, row.headline, ""};
  if (row.state == kFailed) condition.reason = wordsIn(kFailures, own, "StateFailedReason");
  if (row.state == kLocked) condition.reason = wordsIn(kLocks, own, "UnlockRequired");
  if (row.state == kEnabled || row.state == kSearching) {
    condition.reason =
        wordsIn(kRegistrations, propertiesOf(modem, mm::kModem3gpp), "RegistrationState");
  }
  condition.model = shownName(busValue<std::string>(own, "Model").value_or(""));
  condition.driver = driversIn(own);
  return condition;
}

}  // namespace qel::sources
