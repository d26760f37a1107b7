#include "service/sources/modem_manager/ModemLink.h"

#include <poll.h>

#include <algorithm>
#include <array>
#include <utility>

#include "service/sources/modem_manager/CellReadings.h"
#include "service/sources/modem_manager/Names.h"

namespace qel::service {
namespace {

using namespace std::chrono_literals;

constexpr auto kFarewell = 2s;

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

constexpr std::size_t kMostCells = 256;

std::vector<CellReading> cellsIn(sdbus::MethodReply& reply) {
  std::vector<BusProperties> cells;
  reply >> cells;
  std::vector<CellReading> readings;
  for (const BusProperties& cell : cells) {
    if (readings.size() == kMostCells) break;
    if (auto reading = cellReading(cell)) readings.push_back(std::move(*reading));
  }
  return readings;
}

std::string identityOf(const std::string& path, const BusInterfaces& modem) {
  const auto imei = busValue<std::string>(propertiesOf(modem, mm::kModem), "EquipmentIdentifier");
  return imei && !imei->empty() ? *imei : path;
}

// By number: Modem/2 comes before Modem/10.
bool isEarlier(const std::string& a, const std::string& b) {
  return a.size() != b.size() ? a.size() < b.size() : a < b;
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

int pollTimeout(ModemLink::Clock::time_point until, int busTimeout) {
  // Rounded up to the next millisecond, and never far away.
  const auto left = std::clamp<std::chrono::nanoseconds>(
      until == ModemLink::Clock::time_point::max() ? 1h : until - ModemLink::Clock::now(), 0s, 1h);
  const int wait = static_cast<int>(std::chrono::ceil<std::chrono::milliseconds>(left).count());
  return busTimeout < 0 ? wait : std::min(busTimeout, wait);
}

}  // namespace

ModemLink::Watched::Watched(const std::string& modem, std::uint32_t rateS)
    : path(modem),
      cells(
          kGetCellInfo, modem,
          [this](sdbus::MethodReply& reply) { answers.cells = cellsIn(reply); },
          [this] { answers.cells.reset(); }),
      place(
          kGetLocation, modem,
          [this](sdbus::MethodReply& reply) {
            std::map<std::uint32_t, sdbus::Variant> locations;
            reply >> locations;
            answers.place = placeIn(locations);
          },
          [this] { answers.place.clear(); }),
      signalRate(kSignalRate, modem, rateIn,
                 [rateS](const std::tuple<std::uint32_t>& found) {
                   const auto [now] = found;
                   return now == 0 || now > rateS ? std::tuple(rateS) : found;
                 }),
      placeSources(kPlaceSources, modem, placeSourcesIn,
                   [this](std::tuple<std::uint32_t, bool> found) {
                     const bool needed = cells.isSettled() && !tellsServingCell(answers);
                     if (needed) std::get<0>(found) |= mm::kPlaceOfCell;
                     return found;
                   }) {}

ModemLink::ModemLink(const tesk::bus::BusAddress& address, ModemWish wish,
                     const ModemTiming& timing, SaidOnce& said)
    : _wish(std::move(wish)),
      _timing(timing),
      _said(said),
      _connection(tesk::bus::connectTo(address)),
      _calls(*_connection, timing.callTimeout),
      _tree(*_connection, _calls),
      _askAgainAt(Clock::now()) {
  process();
}

void ModemLink::waitAndProcess(int wakeDescriptor, Clock::time_point until) {
  const auto bus = _connection->getEventLoopPollData();
  std::array<pollfd, 2> waited = {{{bus.fd, bus.events, 0}, {wakeDescriptor, POLLIN, 0}}};
  ::poll(waited.data(), waited.size(), pollTimeout(std::min(until, due()), bus.getPollTimeout()));
  process();
}

void ModemLink::process() {
  while (_connection->processPendingRequest()) {
  }
  const auto now = Clock::now();
  const auto gone = _tree.step(now);
  if (_watched && gone.contains(_watched->path)) leave();
  choose();
  if (_watched) attend(now);
}

bool ModemLink::isWished(const std::string& path, const BusInterfaces& interfaces) const {
  const auto modem = interfaces.find(mm::kModem);
  if (modem == interfaces.end()) return false;
  if (!_wish.path.empty()) return path == _wish.path;
  return _wish.imei.empty() ||
         busValue<std::string>(modem->second, "EquipmentIdentifier") == _wish.imei ||
         busValue<std::string>(propertiesOf(interfaces, mm::kModem3gpp), "Imei") == _wish.imei;
}

// With the modem goes what was asked of it: an answer would find nobody.
void ModemLink::leave() {
  _calls.forget(_watched->path);
  _watched.reset();
  _tree.want({});
}

// The modem that is watched stays the one for as long as it is there.
void ModemLink::choose() {
  const BusObjects& objects = _tree.objects();
  if (_watched) {
    const auto found = objects.find(_watched->path);
    if (found != objects.end() && isWished(found->first, found->second)) return;
    leave();
  }
  const std::string* first = nullptr;
  for (const auto& [path, interfaces] : objects) {
    if (isWished(path, interfaces) && (!first || isEarlier(path, *first))) first = &path;
  }
  if (first) _watched = std::make_unique<Watched>(*first, wholeSeconds(_timing.period));
}

const BusInterfaces& ModemLink::watchedInterfaces() const {
  return _tree.objects().at(_watched->path);
}

void ModemLink::attend(Clock::time_point now) {
  if (now >= _askAgainAt) {
    _askAgainAt = now + _timing.period;
    _tree.askAgain();
  }
  const BusInterfaces& interfaces = watchedInterfaces();
  _tree.want(partsOf(interfaces));
  const std::string identity = identityOf(_watched->path, interfaces);
  if (!isEnabled(interfaces)) {
    _watched->answers = {};
    return;
  }
  const std::uint32_t technologies =
      busUnsigned(propertiesOf(interfaces, mm::kModem), "AccessTechnologies").value_or(0);
  // The cells and the place are of before the phone moved.
  if (std::exchange(_watched->accessTechnologies, technologies) != technologies) {
    _watched->answers.place.clear();
    _watched->cells.callSoon();
    _watched->place.callSoon();
  }
  _watched->cells.step(_calls, _said, identity, now, _timing.period);
  if (placeMustBeAsked(interfaces)) {
    _watched->place.step(_calls, _said, identity, now, _timing.period);
  } else {
    _watched->answers.place.clear();
  }
  _watched->signalRate.step(_calls, _said, identity, interfaces, now);
  _watched->placeSources.step(_calls, _said, identity, interfaces, now);
}

ModemLink::Clock::time_point ModemLink::due() const {
  auto due = _tree.due();
  if (!_watched) return due;
  due = std::min(due, _askAgainAt);
  if (!isEnabled(watchedInterfaces())) return due;
  if (placeMustBeAsked(watchedInterfaces())) due = std::min(due, _watched->place.due());
  return std::min(due, _watched->cells.due());
}

std::optional<ModemPicture> ModemLink::picture() const {
  if (!_watched) return std::nullopt;
  return pictureOf(_tree.objects(), _watched->path, _watched->answers);
}

void ModemLink::finish() {
  const auto end = Clock::now() + kFarewell;
  const auto settle = [&] {
    while (_watched && _watched->changesSettings() && Clock::now() < end) {
      const auto bus = _connection->getEventLoopPollData();
      pollfd waited{bus.fd, bus.events, 0};
      ::poll(&waited, 1, pollTimeout(end, bus.getPollTimeout()));
      while (_connection->processPendingRequest()) {
      }
    }
  };
  settle();
  if (!_watched || !_tree.objects().contains(_watched->path)) return;
  _watched->signalRate.restore(_calls, watchedInterfaces());
  _watched->placeSources.restore(_calls, watchedInterfaces());
  settle();
}

}  // namespace qel::service
