#include "sources/modem_manager/WatchedModem.h"

#include <algorithm>
#include <utility>
#include <vector>

#include "sources/modem_manager/CellList.h"
#include "sources/modem_manager/Names.h"

namespace qel::sources {
namespace {

using namespace std::chrono_literals;

constexpr MethodRow kGetCellInfo = {
    mm::kModem, "GetCellInfo",
    "no cell information: not allowed to call GetCellInfo (run as root, or let the bus policy pass "
    "org.freedesktop.ModemManager1.Modem.GetCellInfo and polkit the action "
    "org.freedesktop.ModemManager1.Device.Control)",
    "no cell information: the modem does not support GetCellInfo"};
constexpr MethodRow kGetLocation = {
    mm::kLocation, "GetLocation",
    "no location area: not allowed to call GetLocation (polkit action "
    "org.freedesktop.ModemManager1.Location)",
    "no location area: the modem does not support GetLocation"};

constexpr SettingRow kSignalThresholds = {
    mm::kSignal, "SetupThresholds",
    "the signal is measured every few seconds: not allowed to have the modem report it (the bus "
    "policy must pass org.freedesktop.ModemManager1.Modem.Signal.SetupThresholds and polkit the "
    "action org.freedesktop.ModemManager1.Device.Control)",
    nullptr, true};
constexpr std::uint32_t kThresholdDb = 1;
constexpr SettingRow kSignalRate = {
    mm::kSignal, "Setup",
    "signal levels come at the pace that other programs ask for: not allowed to set it (polkit "
    "action org.freedesktop.ModemManager1.Device.Control)",
    "the modem has no signal levels to report", true};
// Whoever has switched it off meanwhile knows why.
constexpr SettingRow kPlaceSources = {
    mm::kLocation, "Setup",
    "no location area: not allowed to switch 3gpp-lac-ci on (polkit action "
    "org.freedesktop.ModemManager1.Device.Control)",
    "no location area: the modem does not support 3gpp-lac-ci", false};

std::string identityOf(const std::string& path, const BusInterfaces& modem) {
  const auto imei = busValue<std::string>(propertiesOf(modem, mm::kModem), "EquipmentIdentifier");
  return imei && !imei->empty() ? *imei : path;
}

std::optional<std::tuple<std::uint32_t>> rateIn(const BusInterfaces& modem) {
  const auto rateS = busUnsigned(propertiesOf(modem, mm::kSignal), "Rate");
  return rateS ? std::optional(std::tuple(*rateS)) : std::nullopt;
}

// What tells of a place, and whether that is pushed with the properties. Only where the modem can
// tell the place of the cell.
std::optional<std::tuple<std::uint32_t, bool>> placeSourcesIn(const BusInterfaces& modem) {
  const BusProperties& location = propertiesOf(modem, mm::kLocation);
  const auto sources = busUnsigned(location, "Enabled");
  const bool able = (busUnsigned(location, "Capabilities").value_or(0) & mm::kPlaceOfCell) != 0;
  if (!sources || !able) return std::nullopt;
  return std::tuple(*sources, busValue<bool>(location, "SignalsLocation").value_or(false));
}

// The cell's place is switched on and not pushed.
bool placeMustBeAsked(const BusInterfaces& modem) {
  const BusProperties& location = propertiesOf(modem, mm::kLocation);
  return (busUnsigned(location, "Enabled").value_or(0) & mm::kPlaceOfCell) != 0 &&
         !busValue<bool>(location, "SignalsLocation").value_or(false);
}

std::uint32_t wholeSeconds(std::chrono::milliseconds period) {
  return static_cast<std::uint32_t>(std::max<std::int64_t>(1, period / 1s));
}

}  // namespace

WatchedModem::WatchedModem(const std::string& modem, std::chrono::milliseconds period)
    : _path(modem),
      _period(period),
      _cells(
          kGetCellInfo, modem,
          [this](sdbus::MethodReply& reply) { _answers.cells = cellsIn(reply); },
          [this] { _answers.cells.reset(); }),
      _place(
          kGetLocation, modem,
          [this](sdbus::MethodReply& reply) {
            std::map<std::uint32_t, sdbus::Variant> locations;
            reply >> locations;
            _askedPlace = placeIn(locations);
          },
          [this] { _askedPlace.clear(); }),
      _signalThresholds(kSignalThresholds, modem, thresholdsIn,
                        [](const std::tuple<SignalThresholds>& found) {
                          auto [wanted] = found;
                          if (wanted.rssiDb == 0 || wanted.rssiDb > kThresholdDb) {
                            wanted.rssiDb = kThresholdDb;
                          }
                          return std::tuple(wanted);
                        }),
      _signalRate(kSignalRate, modem, rateIn,
                  [rateS = wholeSeconds(period)](const std::tuple<std::uint32_t>& found) {
                    const auto [now] = found;
                    return now == 0 || now > rateS ? std::tuple(rateS) : found;
                  }),
      _placeSources(kPlaceSources, modem, placeSourcesIn,
                    [this](std::tuple<std::uint32_t, bool> found) {
                      const bool needed = _cells.isSettled() && !tellsServingCell(_answers);
                      if (needed) std::get<0>(found) |= mm::kPlaceOfCell;
                      return found;
                    }) {}

void WatchedModem::readAnew() {
  _answers = {};
  _askedPlace.clear();
  _cells.callSoon();
  _place.callSoon();
}

void WatchedModem::step(BusCalls& calls, SaidOnce& said, const BusInterfaces& modem,
                        Clock::time_point now) {
  if (!isEnabled(modem)) {
    _answers = {};
    _pushedPlace = {};
    _askedPlace.clear();
    _accessTechnologies = 0;
    return;
  }
  const std::uint32_t technologies =
      busUnsigned(propertiesOf(modem, mm::kModem), "AccessTechnologies").value_or(0);
  // The cells and the place are of before the phone moved.
  if (std::exchange(_accessTechnologies, technologies) != technologies) {
    _askedPlace.clear();
    _technologySince = now;
    _cells.callSoon();
    _place.callSoon();
  }
  const std::string identity = identityOf(_path, modem);
  _cells.step(calls, said, identity, now, _period);
  if (placeMustBeAsked(modem)) {
    _place.step(calls, said, identity, now, _period);
  } else {
    _askedPlace.clear();
  }
  _pushedPlace.notice(pushedPlaceIn(modem), technologyIn(modem), now);
  const std::string pushed = _pushedPlace.current();
  _answers.place = pushed.empty() ? _askedPlace : pushed;
  _signalThresholds.step(calls, said, identity, modem, now);
  if (mustBeMeasured(modem, now)) _signalRate.step(calls, said, identity, modem, now);
  _placeSources.step(calls, said, identity, modem, now);
}

// A modem on a network that says nothing of its signal does not report it, whatever it answered.
bool WatchedModem::mustBeMeasured(const BusInterfaces& modem, Clock::time_point now) const {
  if (!thresholdsIn(modem) || _signalThresholds.isOff()) return true;
  return _accessTechnologies != 0 && !tellsLevels(modem) && now >= _technologySince + 2 * _period;
}

WatchedModem::Clock::time_point WatchedModem::due(const BusInterfaces& modem) const {
  if (!isEnabled(modem)) return Clock::time_point::max();
  return placeMustBeAsked(modem) ? std::min(_cells.due(), _place.due()) : _cells.due();
}

void WatchedModem::restore(BusCalls& calls, const BusInterfaces& modem) {
  _signalThresholds.restore(calls, modem);
  _signalRate.restore(calls, modem);
  _placeSources.restore(calls, modem);
}

}  // namespace qel::sources
