// The service as a program of its own, and what its clients see.
#pragma once

#include <condition_variable>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "base/Value.h"
#include "support/ChildProcess.h"
#include "support/PrivateBus.h"
#include "tesk/Transport.h"
#include "tesk/bus/BusConnector.h"

namespace qel::testing {

class ServiceProcess : public ChildProcess {
 public:
  enum class State { none, whereTheEnvironmentSays };

  ServiceProcess(const PrivateBus& bus, const std::string& source, State state = State::none);
  ServiceProcess(const PrivateBus& bus, const std::string& source,
                 const std::string& stateDirectory);
};

// A client over the bus that keeps its events.
class Client {
 public:
  Client(const PrivateBus& bus, const std::string& name);

  // Both wait ten seconds at most. True when it came so far.
  bool waitForReachable(bool reachable);
  bool waitForMetrics(std::size_t count);

  // Installs a configuration of these metrics (16-bit identifiers) for the application.
  tesk::CommandResult install(std::int64_t application, const std::vector<std::uint32_t>& metrics);
  tesk::CommandResult clear(std::int64_t application);
  tesk::CommandResult query(std::int64_t application, std::int64_t trigger);

  std::vector<std::int64_t> metrics() const;
  void forgetMetrics();
  std::string why() const;
  tesk::Transport& transport() { return *_transport; }

 private:
  template <class Condition>
  bool waitFor(Condition condition);

  mutable std::mutex _mutex;
  std::condition_variable _changed;
  std::vector<std::int64_t> _metrics;
  bool _reachable = false;
  std::string _why;
  std::unique_ptr<tesk::Transport> _transport;
};

}  // namespace qel::testing
