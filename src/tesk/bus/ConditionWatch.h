// How it is with the modem behind the service, followed over the bus.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <cstdint>
#include <functional>
#include <map>
#include <string>

namespace tesk::bus {

// Told in one line for people of 256 bytes at most, at first and at every change; empty: there is
// nothing to say. On a thread of the connection's own.
using ConditionObserver = std::function<void(const std::string& line)>;

// One thread, that of the connection; never waits. Without an observer it does nothing.
class ConditionWatch {
 public:
  // Both outlive it.
  ConditionWatch(sdbus::IConnection& connection, sdbus::IProxy& service,
                 ConditionObserver observer);

  // The service is there. What changes later comes by itself.
  void ask();
  // The service is not there, and so nothing is known.
  void forget();

 private:
  using Entries = std::map<std::string, sdbus::Variant>;

  void take(const sdbus::Variant& condition);
  void tell(std::string line);

  sdbus::IProxy& _service;
  const ConditionObserver _observer;
  std::string _told;
  std::uint64_t _question = 0;  // its number: the answer to an earlier one is late
  sdbus::Slot _changes;
};

}  // namespace tesk::bus
