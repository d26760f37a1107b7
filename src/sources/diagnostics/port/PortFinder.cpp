#include "sources/diagnostics/port/PortFinder.h"

#include <unistd.h>

#include <algorithm>

namespace qel::diagnostics {
namespace {

using Kind = PortTrouble::Kind;

// A port that is there and cannot be had says more than one that is not.
int weightOf(Kind kind) {
  switch (kind) {
    case Kind::held:
      return 3;
    case Kind::denied:
      return 2;
    case Kind::failed:
      return 1;
    case Kind::absent:
      break;
  }
  return 0;
}

}  // namespace

std::unique_ptr<DiagPort> PortFinder::open() {
  _search->clear();
  const std::vector<FoundPort> known = _search->ports();
  _port = {_wish, ""};
  _trouble = {Kind::absent, "none was found"};
  const std::vector<FoundPort> tried = candidates(known);
  _tried = look(tried);
  for (const FoundPort& candidate : tried) {
    PortTrouble trouble;
    if (auto port = openPort(candidate.address, trouble)) {
      _port = candidate;
      _modem = candidate.modem;
      return port;
    }
    const bool isKnown = candidate.address.starts_with('/') &&
                         std::ranges::count(known, candidate.address, &FoundPort::address) != 0;
    if (trouble.kind == Kind::absent && isKnown) {
      trouble = {Kind::denied, "its device is hidden from this program"};
    }
    const bool isWished = candidate.address == _wish && _trouble.kind == Kind::absent;
    if (!isWished && weightOf(trouble.kind) <= weightOf(_trouble.kind)) continue;
    _port = candidate;
    _trouble = trouble;
  }
  return nullptr;
}

bool PortFinder::hasChanged() {
  _search->clear();
  return look(candidates(_search->ports())) != _tried;
}

std::vector<PortFinder::Sight> PortFinder::look(const std::vector<FoundPort>& ports) {
  std::vector<Sight> sights;
  for (const FoundPort& port : ports) {
    const bool isRouter = port.address.starts_with('@');
    sights.push_back({port, isRouter || ::access(port.address.c_str(), R_OK | W_OK) == 0});
  }
  return sights;
}

std::vector<FoundPort> PortFinder::candidates(std::vector<FoundPort> ports) {
  const auto isOfModem = [this](const FoundPort& port) {
    return !_modem.empty() && port.modem == _modem;
  };
  if (!_wish.empty()) {
    std::erase_if(ports,
                  [&](const FoundPort& port) { return port.address == _wish || !isOfModem(port); });
    ports.insert(ports.begin(), {_wish, _search->modemOf(_wish)});
  }
  std::ranges::stable_partition(ports, isOfModem);
  return ports;
}

}  // namespace qel::diagnostics
