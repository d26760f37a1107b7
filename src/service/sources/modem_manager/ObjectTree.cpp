#include "service/sources/modem_manager/ObjectTree.h"

#include <algorithm>
#include <utility>

#include "service/sources/modem_manager/Names.h"

namespace qel::service {
namespace {

using namespace std::chrono_literals;

constexpr auto kFirstPause = 1s;
constexpr auto kLongestPause = 60s;

std::string signalRule(const char* interface, const char* member) {
  return std::string("type='signal',path_namespace='") + mm::kRoot + "',interface='" + interface +
         "',member='" + member + "'";
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
  for (const auto& [path, interfaces] : _objects) _gone.insert(path);
  _objects.clear();
  _parts.clear();
  _asked.clear();
  _owner.clear();
  ++_epoch;
  _pause = kFirstPause;
  _askAt = now.empty() ? Clock::time_point::max() : Clock::now();
}

void ObjectTree::added(sdbus::Message& signal) {
  if (signal.getSender() != _owner) return;
  sdbus::ObjectPath path;
  BusInterfaces interfaces;
  signal >> path >> interfaces;
  for (auto& [name, properties] : interfaces) _objects[path][name] = std::move(properties);
  _gone.erase(path);
}

void ObjectTree::removed(sdbus::Message& signal) {
  if (signal.getSender() != _owner) return;
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
  for (const std::string& name : invalidated) known.erase(name);
}

void ObjectTree::drop(const std::string& path) {
  _objects.erase(path);
  _parts.erase(path);
  _asked.erase(path);
  _gone.insert(path);
}

void ObjectTree::step(Clock::time_point now) {
  for (const std::string& path : std::exchange(_gone, {})) _calls.forget(path);
  if (now >= _askAt) askForAll();
}

// Asked again with growing pauses until there is an answer.
void ObjectTree::askForAll() {
  _askAt = Clock::time_point::max();
  const auto pause =
      std::exchange(_pause, std::min<std::chrono::seconds>(_pause * 2, kLongestPause));
  const std::uint64_t epoch = ++_epoch;
  _calls.call(
      mm::kRoot, mm::kObjectManager, "GetManagedObjects",
      [this, epoch](sdbus::MethodReply& reply) {
        if (epoch != _epoch) return;
        std::map<sdbus::ObjectPath, BusInterfaces> objects;
        reply >> objects;
        _owner = reply.getSender();
        _objects = {objects.begin(), objects.end()};
      },
      [this, epoch, pause](const sdbus::Error&) {
        if (epoch == _epoch) _askAt = Clock::now() + pause;
      });
}

void ObjectTree::want(const std::vector<ModemPart>& parts) {
  for (const std::string& path : std::set<std::string>(_parts)) {
    if (std::ranges::find(parts, path, &ModemPart::path) == parts.end()) drop(path);
  }
  for (const ModemPart& part : parts) {
    if (_objects.contains(part.path) || !_asked.insert(part.path).second) continue;
    const std::string path = part.path;
    const std::string interface = part.interface;
    _calls.call(
        path, mm::kPropertiesInterface, "GetAll",
        [this, path, interface, epoch = _epoch](sdbus::MethodReply& reply) {
          if (epoch != _epoch || !_asked.contains(path)) return;
          BusProperties properties;
          reply >> properties;
          _objects[path][interface] = std::move(properties);
          _parts.insert(path);
        },
        [](const sdbus::Error&) {}, interface);
  }
}

}  // namespace qel::service
