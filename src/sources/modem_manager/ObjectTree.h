// ModemManager's objects with their properties, kept up to date by its signals.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <chrono>
#include <cstdint>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "sources/modem_manager/BusCalls.h"
#include "sources/modem_manager/ModemReading.h"

namespace qel::sources {

// One thread. Empty while ModemManager is not there; filled anew when it is back.
class ObjectTree {
 public:
  using Clock = std::chrono::steady_clock;

  ObjectTree(sdbus::IConnection& connection, BusCalls& calls);

  const BusObjects& objects() const { return _objects; }

  // Whether ModemManager is there: it has answered, or why not. Unknown before the first answer.
  enum class Manager { unknown, present, absent, denied, silent };
  Manager manager() const { return _manager; }

  // Makes the calls that are due. Not from within a signal or an answer. Returns the objects that
  // went since the last step: what is now at such a path is another one.
  std::set<std::string> step(Clock::time_point now);
  // The objects that ModemManager does not list by itself, all that are wanted.
  void want(const std::vector<ModemPart>& parts);
  // All is asked for again, and is not current before there is an answer.
  void readAnew();
  bool isCurrent() const { return _isCurrent; }
  // What could not be read is asked for again.
  void askAgain();
  // When step() has something to do, at the latest.
  Clock::time_point due() const { return _toRead.empty() ? _askAt : Clock::time_point(); }

 private:
  using Take = void (ObjectTree::*)(sdbus::Message& signal);
  using Place = std::pair<std::string, std::string>;  // path and interface

  sdbus::Slot watch(sdbus::IConnection& connection, const std::string& rule, Take take);
  void ownerChanged(sdbus::Message& signal);
  void added(sdbus::Message& signal);
  void removed(sdbus::Message& signal);
  void changed(sdbus::Message& signal);
  void forgetAll();
  void askForAll();
  void read(const Place& place);
  void put(const Place& place, BusProperties properties);
  void drop(const std::string& path);

  BusCalls& _calls;
  Manager _manager = Manager::unknown;
  std::string _owner;        // the unique name whose signals count
  std::uint64_t _epoch = 0;  // of the owner: answers of an earlier one are late
  Clock::time_point _askAt;
  std::chrono::seconds _pause;
  bool _isCurrent = true;
  bool _newsMeanwhile = false;  // objects came or went while all were asked for
  BusObjects _objects;
  std::set<std::string> _wanted;  // paths
  std::set<std::string> _parts;   // of the objects, those that are there because they were wanted
  std::set<Place> _toRead;
  std::set<Place> _reading;
  std::set<Place> _unread;  // asked for in vain
  std::set<std::string> _gone;
  std::vector<sdbus::Slot> _watches;
};

}  // namespace qel::sources
