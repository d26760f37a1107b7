#include "service/KeptBook.h"

#include <algorithm>
#include <utility>
#include <vector>

#include "base/LogSink.h"
#include "messages/catalogue/TagLog.h"
#include "service/ClientName.h"
#include "service/Limits.h"
#include "service/Request.h"

namespace qel::service {
namespace {

using When = StateSaver::When;

// How old the time of a client's last use may be in the state that is written.
constexpr std::uint64_t kUseEveryMs = 60ULL * 60 * 1000;

// A time that has not come yet says nothing: the clock was wrong then, or is now.
bool isOlder(std::uint64_t timeMs, std::uint64_t nowMs, std::uint64_t ageMs) {
  return timeMs > nowMs || nowMs - timeMs >= ageMs;
}

std::string number(std::size_t value) { return std::to_string(value); }

struct Taken {
  std::size_t applications = 0;
  std::size_t bytes = 0;
};

// What the configurations of other applications take up.
Taken takenByOthers(const KeptState& state, std::int64_t application) {
  Taken taken;
  for (const auto& [other, installed] : state.configurations) {
    if (other == application) continue;
    ++taken.applications;
    taken.bytes += installed.payload.size();
  }
  return taken;
}

bool hasRoomBeside(const Taken& others, std::size_t bytes) {
  return others.applications < limits::kApplications &&
         others.bytes + bytes <= limits::kAllPayloadBytes;
}

// How many other applications have their configuration from the client.
std::size_t countOthers(const KeptState& state, std::string_view client, std::int64_t application) {
  return static_cast<std::size_t>(std::ranges::count_if(state.configurations, [&](const auto& one) {
    return one.first != application && one.second.client == client;
  }));
}

}  // namespace

KeptBook::KeptBook(std::unique_ptr<StateKeeper> keeper, ConfigurationStore& store,
                   const Clock& clock, sources::WaitClock& waitClock)
    : _store(store), _clock(clock) {
  if (!keeper) return;
  _state = keeper->load();
  const bool asKept = restore();
  const auto state = [this] {
    const std::lock_guard lock(_mutex);
    return _state;
  };
  _saver = std::make_unique<StateSaver>(std::move(keeper), state, waitClock);
  if (!asKept) save(When::withinASecond);
}

void KeptBook::save(StateSaver::When when) {
  if (_saver) _saver->changed(when);
}

bool KeptBook::restore() {
  KeptState kept = std::exchange(_state, {});
  const std::size_t found = kept.configurations.size() + kept.applicationOfClient.size();
  restoreClients(kept);
  const CountedTagLines quiet;
  for (auto& [application, installed] : kept.configurations) {
    std::string reason;
    auto configuration = DeviceConfiguration::fromPayload(installed.payload, reason);
    if (!_state.applicationOfClient.contains(installed.client)) installed.client.clear();
    const bool fits =
        hasRoomBeside(takenByOthers(_state, application), installed.payload.size()) &&
        (installed.client.empty() ||
         countOthers(_state, installed.client, application) < limits::kApplicationsOfOneClient);
    if (!configuration || !fits) continue;
    _store.install(application, std::move(*configuration));
    _state.configurations.emplace(application, std::move(installed));
  }
  const std::size_t left = found - _state.configurations.size() - _state.applicationOfClient.size();
  if (left == 0) return true;
  systemLog().write("basebandd: state: " + number(left) +
                    " entries are damaged or beyond the limits, forgotten");
  return false;
}

// Those that were there last.
void KeptBook::restoreClients(const KeptState& kept) {
  std::vector<std::pair<std::string, ClientUse>> clients;
  for (const auto& [name, use] : kept.applicationOfClient) {
    if (faultOfClientName(name).empty()) clients.emplace_back(name, use);
  }
  std::ranges::stable_sort(clients, [](const auto& one, const auto& other) {
    return one.second.usedMs > other.second.usedMs;
  });
  if (clients.size() > limits::kRememberedClients) clients.resize(limits::kRememberedClients);
  _state.applicationOfClient.insert(clients.begin(), clients.end());
}

std::optional<std::int64_t> KeptBook::opened(std::string_view client) {
  const std::lock_guard lock(_mutex);
  ++_open.try_emplace(std::string(client), 0).first->second;
  const auto known = _state.applicationOfClient.find(client);
  if (known == _state.applicationOfClient.end()) return std::nullopt;
  return known->second.application;
}

void KeptBook::closed(std::string_view client) {
  const std::lock_guard lock(_mutex);
  const auto open = _open.find(client);
  if (open != _open.end() && --open->second == 0) _open.erase(open);
  const auto known = _state.applicationOfClient.find(client);
  if (known != _state.applicationOfClient.end()) known->second.usedMs = _clock.nowMs();
}

void KeptBook::note(std::string_view client, std::int64_t application) {
  {
    const std::lock_guard lock(_mutex);
    if (!noteLocked(client, application)) return;
  }
  save(When::withinASecond);
}

// Whether that is worth writing down.
bool KeptBook::noteLocked(std::string_view client, std::int64_t application) {
  auto& clients = _state.applicationOfClient;
  const std::uint64_t nowMs = _clock.nowMs();
  const auto known = clients.find(client);
  if (known != clients.end()) {
    const ClientUse before = std::exchange(known->second, {application, nowMs});
    return before.application != application || isOlder(before.usedMs, nowMs, kUseEveryMs);
  }
  if (!faultOfClientName(client).empty()) return false;
  if (clients.size() >= limits::kRememberedClients && !forgetOldestClient()) return false;
  clients.emplace(client, ClientUse{application, nowMs});
  return true;
}

bool KeptBook::forgetOldestClient() {
  auto& clients = _state.applicationOfClient;
  auto oldest = clients.end();
  for (auto it = clients.begin(); it != clients.end(); ++it) {
    if (_open.contains(it->first)) continue;
    if (oldest == clients.end() || it->second.usedMs < oldest->second.usedMs) oldest = it;
  }
  if (oldest == clients.end()) return false;
  disown(oldest->first);
  clients.erase(oldest);
  return true;
}

void KeptBook::disown(std::string_view client) {
  for (auto& [application, installed] : _state.configurations) {
    if (installed.client == client) installed.client.clear();
  }
}

bool KeptBook::isUsed(std::int64_t application) const {
  return std::ranges::any_of(_open, [&](const auto& open) {
    const auto known = _state.applicationOfClient.find(open.first);
    return known != _state.applicationOfClient.end() && known->second.application == application;
  });
}

bool KeptBook::isLongGone(std::string_view client) const {
  const auto known = _state.applicationOfClient.find(client);
  if (known == _state.applicationOfClient.end()) return true;
  return !_open.contains(client) &&
         isOlder(known->second.usedMs, _clock.nowMs(), limits::kLongGoneMs);
}

// Those of clients that are long gone and of applications that nobody is in.
std::optional<std::vector<std::int64_t>> KeptBook::givingWay(std::int64_t application,
                                                             std::size_t bytes) const {
  Taken taken = takenByOthers(_state, application);
  std::vector<std::int64_t> giving;
  for (const auto& [other, installed] : _state.configurations) {
    if (hasRoomBeside(taken, bytes)) break;
    if (other == application || !isLongGone(installed.client) || isUsed(other)) continue;
    giving.push_back(other);
    --taken.applications;
    taken.bytes -= installed.payload.size();
  }
  if (!hasRoomBeside(taken, bytes)) return std::nullopt;
  return giving;
}

std::optional<tesk::CommandResult> KeptBook::makeRoom(std::string_view client,
                                                      std::int64_t application, std::size_t bytes) {
  const std::string asked = "kKeyAppID " + std::to_string(application);
  if (countOthers(_state, client, application) >= limits::kApplicationsOfOneClient) {
    return refusal(CommandCode::tooManyConfigurations,
                   asked + " is one too many: a client may install configurations of " +
                       number(limits::kApplicationsOfOneClient) + " applications");
  }
  const auto giving = givingWay(application, bytes);
  if (!giving) {
    return refusal(CommandCode::tooManyConfigurations,
                   asked + " finds no room: configurations of at most " +
                       number(limits::kApplications) + " applications and " +
                       number(limits::kAllPayloadBytes) + " bytes are kept");
  }
  for (const std::int64_t other : *giving) {
    _store.clear(other);
    _state.configurations.erase(other);
  }
  return std::nullopt;
}

std::optional<tesk::CommandResult> KeptBook::install(std::string_view client,
                                                     std::int64_t application, const Bytes& payload,
                                                     DeviceConfiguration configuration) {
  {
    const std::lock_guard lock(_mutex);
    if (auto refused = makeRoom(client, application, payload.size())) return refused;
    _store.install(application, std::move(configuration));
    bool changed = noteLocked(client, application);
    const bool isKnown = _state.applicationOfClient.contains(client);
    InstalledPayload installed{payload, std::string(isKnown ? client : "")};
    InstalledPayload& kept = _state.configurations[application];
    changed = changed || kept != installed;
    kept = std::move(installed);
    if (!changed) return std::nullopt;
  }
  save(When::now);
  return std::nullopt;
}

void KeptBook::clear(std::string_view client, std::int64_t application) {
  {
    const std::lock_guard lock(_mutex);
    _store.clear(application);
    const bool erased = _state.configurations.erase(application) > 0;
    if (!noteLocked(client, application) && !erased) return;
  }
  save(When::withinASecond);
}

}  // namespace qel::service
