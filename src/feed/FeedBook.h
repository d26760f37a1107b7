// What feeds a viewer, kept up to date by what its connection tells.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "base/Clock.h"
#include "history/History.h"
#include "tesk/bus/BusConnector.h"
#include "ui/pages/Feed.h"

namespace qel {

// Main thread, but for what it hands out: those may be called on any thread and outlive it. Every
// change of service and modem and every loss is a happening of the history too.
class FeedBook final : public std::enable_shared_from_this<FeedBook> {
 public:
  // The text by which the user chose a source; empty: the service on this bus.
  FeedBook(const std::string& source, std::string bus, const Clock& clock = systemClock());

  const Feed& feed() const { return _feed; }
  // Where happenings go; none: nowhere. It must outlive this.
  void setHistory(History* history) { _history = history; }
  // Called after every change.
  void setObserver(std::function<void()> observer) { _observer = std::move(observer); }

  // For the connection.
  tesk::bus::ReachabilityObserver reachability();
  tesk::bus::ConditionObserver condition();
  // So many events were dropped so far.
  void noteDropped(std::uint64_t dropped);

 private:
  void changeReach(bool isReachable, const std::string& why);
  void changeCondition(const tesk::bus::Condition& condition);
  Feed::Reach reachOf(const std::string& why) const;
  void happen(HappeningKind kind, std::string text);
  void changed() const;

  const std::string _bus;
  const Clock& _clock;
  Feed _feed;
  History* _history = nullptr;
  std::function<void()> _observer;
  bool _wasThere = false;
};

// The kind of a source and the name to show, by the text that chose it.
Feed feedOf(const std::string& source);

}  // namespace qel
