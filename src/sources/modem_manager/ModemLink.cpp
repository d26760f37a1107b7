#include "sources/modem_manager/ModemLink.h"

#include <poll.h>

#include <algorithm>
#include <array>
#include <utility>

#include "base/PollTimeout.h"
#include "bus/Turn.h"
#include "sources/modem_manager/ModemCondition.h"
#include "sources/modem_manager/Names.h"

namespace qel::sources {
namespace {

using namespace std::chrono_literals;

constexpr auto kFarewell = 2s;

// By number: Modem/2 comes before Modem/10.
bool isEarlier(const std::string& a, const std::string& b) {
  return a.size() != b.size() ? a.size() < b.size() : a < b;
}

}  // namespace

ModemLink::ModemLink(const bus::BusAddress& address, ModemWish wish, const ModemTiming& timing,
                     SaidOnce& said)
    : _wish(std::move(wish)),
      _timing(timing),
      _said(said),
      _connection(bus::connectTo(address)),
      _calls(*_connection, timing.callTimeout),
      _tree(*_connection, _calls),
      _askAgainAt(Clock::now()) {
  process();
}

void ModemLink::waitAndProcess(int wakeDescriptor, Clock::time_point until) {
  const auto bus = _connection->getEventLoopPollData();
  std::array<pollfd, 2> waited = {{{bus.fd, bus.events, 0}, {wakeDescriptor, POLLIN, 0}}};
  ::poll(waited.data(), waited.size(),
         shorterTimeout(pollTimeout(std::min(until, due())), bus.getPollTimeout()));
  process();
}

void ModemLink::process() {
  bus::processTurn(*_connection);
  const auto now = Clock::now();
  const auto gone = _tree.step(now);
  if (_watched && gone.contains(_watched->path())) leave();
  choose();
  if (_watched) attend(now);
}

bool ModemLink::isWished(const std::string& path, const BusInterfaces& interfaces) const {
  const auto modem = interfaces.find(mm::kModem);
  if (modem == interfaces.end()) return false;
  if (!mayBeDevice(modem->second)) return false;
  if (!_wish.path.empty()) return path == _wish.path;
  if (_wish.imei.empty()) return true;
  return busValue<std::string>(modem->second, "EquipmentIdentifier") == _wish.imei ||
         busValue<std::string>(propertiesOf(interfaces, mm::kModem3gpp), "Imei") == _wish.imei;
}

// ModemManager names some devices by words of its own: those may be any.
bool ModemLink::mayBeDevice(const BusProperties& modem) const {
  const std::string wished = _wish.device ? _wish.device() : "";
  const std::string device = busValue<std::string>(modem, "Device").value_or("");
  return wished.empty() || !device.starts_with("/sys/") || device == wished;
}

// With the modem goes what was asked of it: an answer would find nobody.
void ModemLink::leave() {
  _calls.forget(_watched->path());
  _watched.reset();
  _tree.want({});
}

// The modem that is watched stays the one for as long as it is there.
void ModemLink::choose() {
  const BusObjects& objects = _tree.objects();
  if (_watched) {
    const auto found = objects.find(_watched->path());
    if (found != objects.end() && isWished(found->first, found->second)) return;
    leave();
  }
  const std::string* first = nullptr;
  for (const auto& [path, interfaces] : objects) {
    if (isWished(path, interfaces) && (!first || isEarlier(path, *first))) first = &path;
  }
  if (first) _watched = std::make_unique<WatchedModem>(*first, _timing.period);
}

const BusInterfaces& ModemLink::watchedInterfaces() const {
  return _tree.objects().at(_watched->path());
}

void ModemLink::attend(Clock::time_point now) {
  if (now >= _askAgainAt) {
    _askAgainAt = now + _timing.period;
    _tree.askAgain();
  }
  const BusInterfaces& modem = watchedInterfaces();
  _tree.want(partsOf(modem));
  _watched->step(_calls, _said, modem, now);
}

ModemLink::Clock::time_point ModemLink::due() const {
  auto due = _tree.due();
  if (!_watched) return due;
  due = std::min(due, _askAgainAt);
  return std::min(due, _watched->due(watchedInterfaces()));
}

void ModemLink::readAnew() {
  _tree.readAnew();
  if (_watched) _watched->readAnew();
}

std::optional<ModemPicture> ModemLink::picture() const {
  if (!_watched || !_tree.isCurrent()) return std::nullopt;
  return pictureOf(_tree.objects(), _watched->path(), _watched->answers());
}

std::optional<SourceCondition> ModemLink::condition() const {
  if (!_tree.isCurrent()) return std::nullopt;
  if (_watched) return conditionOf(watchedInterfaces());
  return conditionWithoutModem(_tree.manager(), !_wish.imei.empty() || !_wish.path.empty());
}

void ModemLink::finish() {
  const auto end = Clock::now() + kFarewell;
  const auto settle = [&] {
    while (_watched && _watched->changesSettings() && Clock::now() < end) {
      const auto bus = _connection->getEventLoopPollData();
      pollfd waited{bus.fd, bus.events, 0};
      ::poll(&waited, 1, shorterTimeout(pollTimeout(end), bus.getPollTimeout()));
      bus::processTurn(*_connection);
    }
  };
  settle();
  if (!_watched || !_tree.objects().contains(_watched->path())) return;
  _watched->restore(_calls, watchedInterfaces());
  settle();
}

}  // namespace qel::sources
