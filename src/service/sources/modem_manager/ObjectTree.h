// ModemManager's objects with their properties, kept up to date by its signals.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <chrono>
#include <cstdint>
#include <set>
#include <string>
#include <vector>

#include "service/sources/modem_manager/BusCalls.h"
#include "service/sources/modem_manager/ModemReading.h"

namespace qel::service {

// One thread. Empty while ModemManager is not there; filled anew when it is back.
class ObjectTree {
 public:
  using Clock = std::chrono::steady_clock;

  ObjectTree(sdbus::IConnection& connection, BusCalls& calls);

  const BusObjects& objects() const { return _objects; }

  // Makes the calls that are due. Not from within a signal or an answer.
  void step(Clock::time_point now);
  // The objects that ModemManager does not list by itself, all that are wanted.
  void want(const std::vector<ModemPart>& parts);
  // Those that are not there are asked for again.
  void askAgain() { _asked.clear(); }
  // When step() has something to do, at the latest.
  Clock::time_point due() const { return _askAt; }

 private:
  using Take = void (ObjectTree::*)(sdbus::Message& signal);
  sdbus::Slot watch(sdbus::IConnection& connection, const std::string& rule, Take take);
  void ownerChanged(sdbus::Message& signal);
  void added(sdbus::Message& signal);
  void removed(sdbus::Message& signal);
  void changed(sdbus::Message& signal);
  void askForAll();
  void drop(const std::string& path);

  BusCalls& _calls;
  std::string _owner;        // the unique name whose signals count
  std::uint64_t _epoch = 0;  // of the owner: answers of an earlier one are late
  Clock::time_point _askAt;
  std::chrono::seconds _pause;
  BusObjects _objects;
  std::set<std::string> _parts;  // of the objects, those that were asked for
  std::set<std::string> _asked;
  std::set<std::string> _gone;  // to be forgotten by the calls
  std::vector<sdbus::Slot> _watches;
};

}  // namespace qel::service
