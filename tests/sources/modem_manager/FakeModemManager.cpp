#include "sources/modem_manager/FakeModemManager.h"

#include <poll.h>

#include <array>
#include <future>
#include <utility>

namespace qel::testing {
namespace {

const std::string kService = "org.freedesktop.ModemManager1";
const std::string kRoot = "/org/freedesktop/ModemManager1";
const std::string kModemInterface = "org.freedesktop.ModemManager1.Modem";
const std::string kSignalInterface = kModemInterface + ".Signal";
const std::string kLocationInterface = kModemInterface + ".Location";

}  // namespace

struct FakeModemManager::Object {
  std::map<std::string, std::map<std::string, FakeProperty>> interfaces;
  std::unique_ptr<sdbus::IObject> object;
};

FakeModemManager::FakeModemManager(const std::string& busAddress)
    : _connection(sdbus::createSessionBusConnectionWithAddress(busAddress)),
      _root(sdbus::createObject(*_connection, kRoot)) {
  _root->addObjectManager();
  _root->finishRegistration();
  _connection->requestName(kService);
  _thread = std::thread([this] { live(); });
}

FakeModemManager::~FakeModemManager() {
  _stopping = true;
  _wakeUp.signal();
  _thread.join();
}

void FakeModemManager::live() {
  bool busIsThere = true;  // without it, what is asked of this object goes nowhere
  const auto wait = [&] {
    std::array<pollfd, 2> waited = {{{_wakeUp.descriptor(), POLLIN, 0}}};
    if (!busIsThere) {
      ::poll(waited.data(), 1, -1);
      return;
    }
    const auto bus = _connection->getEventLoopPollData();
    waited[1] = {bus.fd, bus.events, 0};
    ::poll(waited.data(), waited.size(), bus.getPollTimeout());
  };
  while (!_stopping) {
    try {
      wait();
      _wakeUp.clear();
      while (busIsThere && _connection->processPendingRequest()) {
      }
    } catch (const sdbus::Error&) {
      busIsThere = false;
    }
    std::deque<std::function<void()>> tasks;
    {
      const std::lock_guard lock(_mutex);
      tasks.swap(_tasks);
    }
    for (const auto& task : tasks) task();
  }
}

void FakeModemManager::perform(const std::function<void()>& task) {
  std::promise<void> done;
  {
    const std::lock_guard lock(_mutex);
    _tasks.push_back([&] {
      task();
      done.set_value();
    });
  }
  _wakeUp.signal();
  done.get_future().wait();
}

FakeModemManager::Object& FakeModemManager::make(const std::string& path,
                                                 FakeInterfaces interfaces) {
  auto made = std::make_unique<Object>();
  made->interfaces = std::move(interfaces);
  made->object = sdbus::createObject(*_connection, path);
  for (auto& [interface, properties] : made->interfaces) {
    for (auto& [name, property] : properties) {
      made->object->registerProperty(
          interface, name, property.signature,
          [held = &property](sdbus::PropertyGetReply& reply) { held->write(reply); });
    }
  }
  if (made->interfaces.contains(kModemInterface)) addMethods(*made->object, path);
  made->object->finishRegistration();
  return *(_objects[path] = std::move(made));
}

void FakeModemManager::add(const std::string& path, FakeInterfaces interfaces) {
  perform([&] {
    const Object& made = make(path, std::move(interfaces));
    if (path.starts_with(kRoot)) made.object->emitInterfacesAddedSignal();
  });
}

void FakeModemManager::addInPieces(const std::string& path, FakeInterfaces interfaces) {
  perform([&] {
    const Object& made = make(path, std::move(interfaces));
    for (const auto& [interface, properties] : made.interfaces) {
      made.object->emitInterfacesAddedSignal({interface});
    }
  });
}

void FakeModemManager::remove(const std::string& path) {
  perform([&] {
    if (path.starts_with(kRoot)) _objects.at(path)->object->emitInterfacesRemovedSignal();
    _objects.erase(path);
  });
}

void FakeModemManager::set(const std::string& path, const std::string& interface,
                           const std::string& name, FakeProperty value) {
  perform([&] {
    Object& object = *_objects.at(path);
    object.interfaces.at(interface).at(name).write = value.write;
    object.object->emitPropertiesChangedSignal(interface, {name});
  });
}

void FakeModemManager::setQuietly(const std::string& path, const std::string& interface,
                                  const std::string& name, FakeProperty value) {
  perform([&] {
    Object& object = *_objects.at(path);
    object.interfaces.at(interface).at(name).write = value.write;
    auto signal =
        object.object->createSignal("org.freedesktop.DBus.Properties", "PropertiesChanged");
    signal << interface << FakeDictionary() << std::vector<std::string>{name};
    object.object->emitSignal(signal);
  });
}

void FakeModemManager::setCells(std::vector<FakeDictionary> cells) {
  perform([&] { _cells = std::move(cells); });
}

void FakeModemManager::setPlace(std::string place) {
  perform([&] { _place = std::move(place); });
}

void FakeModemManager::answer(const std::string& name, FakeAnswer how) {
  perform([&] { _answers[name] = std::move(how); });
}

int FakeModemManager::calls(const std::string& name) {
  int count = 0;
  perform([&] { count = _calls[name]; });
  return count;
}

std::vector<std::uint32_t> FakeModemManager::ratesAskedFor() {
  std::vector<std::uint32_t> rates;
  perform([&] { rates = _rates; });
  return rates;
}

std::vector<std::uint32_t> FakeModemManager::thresholdsAskedFor() {
  std::vector<std::uint32_t> thresholds;
  perform([&] { thresholds = _thresholds; });
  return thresholds;
}

std::vector<std::pair<std::uint32_t, bool>> FakeModemManager::placesAskedFor() {
  std::vector<std::pair<std::uint32_t, bool>> places;
  perform([&] { places = _places; });
  return places;
}

void FakeModemManager::method(sdbus::IObject& object, const std::string& interface,
                              const std::string& name, const std::string& in,
                              const std::string& out,
                              std::function<void(sdbus::MethodCall&, sdbus::MethodReply&)> write) {
  const std::string member = name.substr(name.rfind('.') + 1);
  object.registerMethod(interface, member, in, out, [this, name, write](sdbus::MethodCall call) {
    ++_calls[name];
    const FakeAnswer& how = _answers[name];
    switch (how.kind) {
      case FakeAnswer::Kind::error:
        call.createErrorReply(sdbus::Error(how.error, "as the test wants it")).send();
        return;
      case FakeAnswer::Kind::never:
        _unanswered.push_back(std::move(call));
        return;
      case FakeAnswer::Kind::nonsense: {
        auto reply = call.createReply();
        reply << std::string("nonsense") << 7.5;
        reply.send();
        return;
      }
      case FakeAnswer::Kind::normal: {
        auto reply = call.createReply();
        write(call, reply);
        reply.send();
        return;
      }
    }
  });
}

void FakeModemManager::addMethods(sdbus::IObject& object, const std::string& path) {
  method(object, kModemInterface, "GetCellInfo", "", "aa{sv}",
         [this](sdbus::MethodCall&, sdbus::MethodReply& reply) { reply << _cells; });
  method(object, kLocationInterface, "GetLocation", "", "a{uv}",
         [this](sdbus::MethodCall&, sdbus::MethodReply& reply) {
           reply << std::map<std::uint32_t, sdbus::Variant>{{1U, sdbus::Variant(_place)}};
         });
  method(object, kLocationInterface, "Location.Setup", "ub", "",
         [this, path](sdbus::MethodCall& call, sdbus::MethodReply&) {
           std::uint32_t sources = 0;
           bool signals = false;
           call >> sources >> signals;
           _places.emplace_back(sources, signals);
           Object& modem = *_objects.at(path);
           auto& location = modem.interfaces.at(kLocationInterface);
           location.at("Enabled").write = FakeProperty(sources).write;
           location.at("SignalsLocation").write = FakeProperty(signals).write;
           modem.object->emitPropertiesChangedSignal(kLocationInterface,
                                                     {"Enabled", "SignalsLocation"});
         });
  method(object, kSignalInterface, "SetupThresholds", "a{sv}", "",
         [this, path](sdbus::MethodCall& call, sdbus::MethodReply&) {
           FakeDictionary thresholds;
           call >> thresholds;
           const auto rssi = thresholds.at("rssi-threshold").get<std::uint32_t>();
           _thresholds.push_back(rssi);
           Object& modem = *_objects.at(path);
           modem.interfaces.at(kSignalInterface).at("RssiThreshold").write =
               FakeProperty(rssi).write;
           modem.object->emitPropertiesChangedSignal(kSignalInterface, {"RssiThreshold"});
         });
  method(object, kSignalInterface, "Setup", "u", "",
         [this, path](sdbus::MethodCall& call, sdbus::MethodReply&) {
           std::uint32_t rate = 0;
           call >> rate;
           _rates.push_back(rate);
           Object& modem = *_objects.at(path);
           modem.interfaces.at(kSignalInterface).at("Rate").write = FakeProperty(rate).write;
           modem.object->emitPropertiesChangedSignal(kSignalInterface, {"Rate"});
         });
}

}  // namespace qel::testing
