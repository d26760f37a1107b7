// How it is with the modem behind the service, followed over the bus.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <cstdint>
#include <functional>
#include <map>
#include <string>

namespace tesk::bus {

// Each text of 256 bytes at most.
struct Condition {
  std::string line;         // for people; empty: there is nothing to say
  std::string state;        // one word for programs
  std::string model;        // of the modem; empty: not known
  std::string reason = {};  // where there is more to say; it is in the line too

  // For observers that only show the line.
  operator const std::string&() const { return line; }
  friend bool operator==(const Condition&, const Condition&) = default;
};

// Told at first and at every change. On a thread of the connection's own.
using ConditionObserver = std::function<void(const Condition& condition)>;

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
  void tell(Condition condition);

  sdbus::IProxy& _service;
  const ConditionObserver _observer;
  Condition _told;
  std::uint64_t _question = 0;  // its number: the answer to an earlier one is late
  sdbus::Slot _changes;
};

}  // namespace tesk::bus
