// The machine's ports, as a test has them.
#pragma once

#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "base/WakeUp.h"
#include "sources/diagnostics/port/PortSearch.h"

namespace qel::diagnostics::test {

// Any thread. Searches made of it say what it says then.
class PlayedPorts {
 public:
  void set(std::vector<FoundPort> ports) {
    const std::lock_guard lock(_mutex);
    _ports = std::move(ports);
    _changed.signal();
  }
  std::vector<FoundPort> get() const {
    const std::lock_guard lock(_mutex);
    return _ports;
  }
  const WakeUp& changed() const { return _changed; }

 private:
  mutable std::mutex _mutex;
  std::vector<FoundPort> _ports;
  WakeUp _changed;
};

class PlayedSearch final : public PortSearch {
 public:
  explicit PlayedSearch(std::shared_ptr<const PlayedPorts> ports) : _ports(std::move(ports)) {}

  std::vector<FoundPort> ports() override { return _ports->get(); }
  std::string modemOf(const std::string& address) override {
    for (const FoundPort& port : _ports->get()) {
      if (port.address == address) return port.modem;
    }
    return "";
  }
  int descriptor() const override { return _ports->changed().descriptor(); }
  void clear() override { _ports->changed().clear(); }

 private:
  const std::shared_ptr<const PlayedPorts> _ports;
};

}  // namespace qel::diagnostics::test
