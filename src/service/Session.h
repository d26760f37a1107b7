// One client of the service: its name, its application, its delivery switch and its sink.
#pragma once

#include <atomic>
#include <cstdint>
#include <map>
#include <mutex>
#include <optional>
#include <string>

#include "service/ConfigurationStore.h"
#include "service/Counters.h"
#include "service/EventSubject.h"
#include "tesk/Transport.h"

namespace qel::service {

// Any thread. The lock is held while the sink runs, so that no event is in flight any more when
// eventsOff or close have returned; it is recursive, so that the sink itself may call them.
class Session {
 public:
  enum class Offer {
    delivered,
    notWanted,     // listens, but its configuration leaves the event out
    unconfigured,  // events are on, but nothing is configured
    off,
  };

  Session(std::string clientName, tesk::EventSink sink, const ConfigurationStore& configurations,
          std::optional<std::int64_t> application);

  const std::string& clientName() const { return _clientName; }
  std::optional<std::int64_t> application() const;
  void setApplication(std::int64_t application);

  // False when nothing changed: they were on, or the session is closed.
  bool eventsOn();
  void eventsOff();
  // Ends delivery for good.
  void close();

  // Delivers the event if this client listens and wants it.
  Offer offer(const sources::SourceEvent& event, const EventSubject& subject);
  // Delivers what the client asked for, whatever its configuration. False when events are off.
  bool answer(const sources::SourceEvent& event);
  // Counts an event that went past for want of a listener here.
  void pass(Offer missed);

  SessionStatus status() const;

 private:
  bool wants(const DeviceConfiguration& configuration, const sources::SourceEvent& event,
             const EventSubject& subject);
  void deliver(const sources::SourceEvent& event);

  const std::string _clientName;
  const tesk::EventSink _sink;
  const ConfigurationStore& _configurations;

  mutable std::mutex _applicationMutex;
  std::optional<std::int64_t> _application;

  std::recursive_mutex _deliveryMutex;
  bool _closed = false;
  std::map<std::int64_t, std::uint64_t> _deliveredAtMs;  // of metrics with a period

  std::atomic<bool> _on = false;
  std::atomic<std::uint64_t> _delivered = 0;
  std::atomic<std::uint64_t> _droppedByConfiguration = 0;
  std::atomic<std::uint64_t> _droppedWhileOff = 0;
};

}  // namespace qel::service
