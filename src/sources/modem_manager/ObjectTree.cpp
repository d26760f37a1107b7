#include "sources/modem_manager/ObjectTree.h"

#include <algorithm>
#include <utility>

#include "sources/modem_manager/Names.h"

namespace qel::sources {
namespace {

using namespace std::chrono_literals;

constexpr auto kFirstPause = 1s;
// A manager that does not answer yet, and none at all: then there will be a signal.
constexpr auto kLongestPause = 5s;
constexpr auto kLongestPauseWithout = 60s;

std::string signalRule(const char* interface, const char* member) {
  return std::string("type='signal',sender='") + mm::kService + "',interface='" + interface +
         "',member='" + member + "'";
}

ObjectTree::Manager managerAfter(const sdbus::Error& error) {
  const std::string& name = error.getName();
  if (name == "org.freedesktop.DBus.Error.AccessDenied") return ObjectTree::Manager::denied;
  const bool noAnswer =
      name == "org.freedesktop.DBus.Error.NoReply" || name == "org.freedesktop.DBus.Error.Timeout";
  return noAnswer ? ObjectTree::Manager::silent : ObjectTree::Manager::absent;
}

}  // namespace

ObjectTree::ObjectTree(sdbus::IConnection& connection, BusCalls& calls)
    : _calls(calls), _askAt(Clock::now()), _pause(kFirstPause) {
  const std::string ownerRule =
      std::string("type='signal',sender='org.freedesktop.DBus',interface='org.freedesktop.DBus',") +
      "member='NameOwnerChanged',arg0='" + mm::kService + "'";
  _watches.push_back(watch(connection, ownerRule, &ObjectTree::ownerChanged));
  _watches.push_back(
      watch(connection, signalRule(mm::kObjectManager, "InterfacesAdded"), &ObjectTree::added));
  _watches.push_back(
      watch(connection, signalRule(mm::kObjectManager, "InterfacesRemoved"), &ObjectTree::removed));
  _watches.push_back(watch(connection, signalRule(mm::kPropertiesInterface, "PropertiesChanged"),
                           &ObjectTree::changed));
}

sdbus::Slot ObjectTree::watch(sdbus::IConnection& connection, const std::string& rule, Take take) {
  return connection.addMatch(rule, [this, take](sdbus::Message& signal) {
    try {
      (this->*take)(signal);
    } catch (const sdbus::Error&) {
      // Of other types than the interface has: no news.
    }
  });
}

void ObjectTree::ownerChanged(sdbus::Message& signal) {
  std::string name;
  std::string before;
  std::string now;
  signal >> name >> before >> now;
  forgetAll();
  _owner.clear();
  _isCurrent = true;
  ++_epoch;
  _pause = kFirstPause;
  _manager = now.empty() ? Manager::absent : Manager::unknown;
  _askAt = now.empty() ? Clock::time_point::max() : Clock::now();
}

void ObjectTree::added(sdbus::Message& signal) {
  if (signal.getSender() != _owner) {
    // Whoever did not answer so far is there now; and who is about to may not tell of this one.
    if (_owner.empty() && _askAt != Clock::time_point::max()) _askAt = Clock::now();
    _newsMeanwhile = true;
    return;
  }
  sdbus::ObjectPath path;
  BusInterfaces interfaces;
  signal >> path >> interfaces;
  for (auto& [name, properties] : interfaces) _objects[path][name] = std::move(properties);
}

void ObjectTree::removed(sdbus::Message& signal) {
  if (signal.getSender() != _owner) {
    _newsMeanwhile = true;
    return;
  }
  sdbus::ObjectPath path;
  std::vector<std::string> interfaces;
  signal >> path >> interfaces;
  const auto found = _objects.find(path);
  if (found == _objects.end()) return;
  for (const std::string& interface : interfaces) found->second.erase(interface);
  // What else a modem had is of no use without it.
  if (found->second.empty() || std::ranges::count(interfaces, mm::kModem) != 0) drop(path);
}

void ObjectTree::changed(sdbus::Message& signal) {
  if (signal.getSender() != _owner) return;
  const auto found = _objects.find(signal.getPath());
  if (found == _objects.end()) return;
  std::string interface;
  BusProperties properties;
  std::vector<std::string> invalidated;
  signal >> interface >> properties >> invalidated;
  BusProperties& known = found->second[interface];
  for (auto& [name, value] : properties) known[name] = std::move(value);
  // Their old values hold until the new ones are read.
  if (!invalidated.empty()) _toRead.emplace(found->first, interface);
}

void ObjectTree::drop(const std::string& path) {
  _objects.erase(path);
  _parts.erase(path);
  for (std::set<Place>* places : {&_toRead, &_reading, &_unread}) {
    std::erase_if(*places, [&](const Place& place) { return place.first == path; });
  }
  _gone.insert(path);
}

void ObjectTree::forgetAll() {
  while (!_objects.empty()) drop(std::string(_objects.begin()->first));
  for (std::set<Place>* places : {&_toRead, &_reading, &_unread}) {
    for (const Place& place : *places) _gone.insert(place.first);
    places->clear();
  }
}

std::set<std::string> ObjectTree::step(Clock::time_point now) {
  auto gone = std::exchange(_gone, {});
  for (const std::string& path : gone) _calls.forget(path);
  if (now >= _askAt) askForAll();
  for (const Place& place : std::exchange(_toRead, {})) read(place);
  return gone;
}

void ObjectTree::readAnew() {
  if (_owner.empty()) return;  // asked for anyway
  for (const std::string& path : std::set<std::string>(_parts)) drop(path);
  for (std::set<Place>* places : {&_toRead, &_reading, &_unread}) places->clear();
  _isCurrent = false;
  _pause = kFirstPause;
  _askAt = Clock::time_point();
}

// Asked again with growing pauses until there is an answer.
void ObjectTree::askForAll() {
  _askAt = Clock::time_point::max();
  _newsMeanwhile = false;
  const auto pause = _pause;
  const std::uint64_t epoch = ++_epoch;
  _calls.call(
      mm::kRoot, mm::kObjectManager, "GetManagedObjects",
      [this, epoch](sdbus::MethodReply& reply) {
        if (epoch != _epoch) return;
        _isCurrent = true;
        std::map<sdbus::ObjectPath, BusInterfaces> objects;
        reply >> objects;
        for (const auto& [path, interfaces] : BusObjects(_objects)) {
          if (!_parts.contains(path) && objects.count(sdbus::ObjectPath(path)) == 0) drop(path);
        }
        for (auto& [path, interfaces] : objects) _objects[path] = std::move(interfaces);
        _owner = reply.getSender();
        _manager = Manager::present;
        _pause = kFirstPause;
        if (_newsMeanwhile) _askAt = Clock::now();
      },
      [this, epoch, pause](const sdbus::Error& error) {
        if (epoch != _epoch) return;
        const bool absent = error.getName() == "org.freedesktop.DBus.Error.ServiceUnknown";
        _pause = std::min<std::chrono::seconds>(pause * 2,
                                                absent ? kLongestPauseWithout : kLongestPause);
        _askAt = Clock::now() + pause;
        // Who has answered once is there, whatever becomes of a later question.
        if (_owner.empty()) _manager = managerAfter(error);
      });
}

void ObjectTree::read(const Place& place) {
  if (!_reading.insert(place).second) {
    // What is on its way may be older than what is wanted.
    _unread.insert(place);
    return;
  }
  const std::uint64_t epoch = _epoch;
  _calls.call(
      place.first, mm::kPropertiesInterface, "GetAll",
      [this, place, epoch](sdbus::MethodReply& reply) {
        if (epoch != _epoch || _reading.erase(place) == 0) return;
        BusProperties properties;
        reply >> properties;
        if (_unread.erase(place) != 0) _toRead.insert(place);
        put(place, std::move(properties));
      },
      [this, place, epoch](const sdbus::Error&) {
        if (epoch != _epoch) return;
        _reading.erase(place);
        _unread.insert(place);
        put(place, {});
      },
      place.second);
}

// Unless the object has gone meanwhile, or is wanted no more.
void ObjectTree::put(const Place& place, BusProperties properties) {
  const auto& [path, interface] = place;
  if (!_objects.contains(path)) {
    if (!_wanted.contains(path)) return;
    _parts.insert(path);
  }
  _objects[path][interface] = std::move(properties);
}

void ObjectTree::want(const std::vector<ModemPart>& parts) {
  _wanted.clear();
  for (const ModemPart& part : parts) _wanted.insert(part.path);
  for (const std::string& path : std::set<std::string>(_parts)) {
    if (!_wanted.contains(path)) drop(path);
  }
  for (const ModemPart& part : parts) {
    const Place place(part.path, part.interface);
    const auto object = _objects.find(part.path);
    const bool known = object != _objects.end() && object->second.contains(part.interface);
    if (!known && !_reading.contains(place) && !_unread.contains(place)) _toRead.insert(place);
  }
}

void ObjectTree::askAgain() {
  for (const Place& place : std::exchange(_unread, {})) _toRead.insert(place);
}

}  // namespace qel::sources
