#include "tesk/Manager.h"

#include <map>
#include <mutex>
#include <utility>

#include "tesk/EventBacklog.h"

namespace tesk::client {

// The handlers by event name, and the connection that feeds them. Events are taken from the
// transport's threads and run on the queue.
class Manager : public std::enable_shared_from_this<Manager> {
 public:
  explicit Manager(std::shared_ptr<qel::DispatchQueue> queue) : _queue(std::move(queue)) {}

  bool connect(std::string_view clientName) {
    const auto& way = connector();
    if (!way) return false;
    _transport = way->connect(clientName,
                              [weak = weak_from_this()](std::string_view eventName, Message event) {
                                if (const auto manager = weak.lock())
                                  manager->take(eventName, std::move(event));
                              });
    return _transport != nullptr;
  }

  Transport& transport() { return *_transport; }
  std::uint64_t dropped() const { return _backlog.dropped(); }

  void registerHandler(std::string_view eventName, EventHandler handler) {
    const std::lock_guard lock(_mutex);
    _handlers.insert_or_assign(std::string(eventName),
                               std::make_shared<EventHandler>(std::move(handler)));
  }

 private:
  void take(std::string_view eventName, Message event) {
    if (!_backlog.add({std::string(eventName), std::move(event).entries()})) return;
    _queue->async([weak = weak_from_this()] {
      if (const auto manager = weak.lock()) manager->deliverOne();
    });
  }

  // The handler is looked up on the queue, so that one registered meanwhile gets the event.
  void deliverOne() {
    auto event = _backlog.take();
    const auto handler = event ? handlerOf(event->name) : nullptr;
    if (!handler) return;
    DispatchGroup group;
    (*handler)(Message(std::move(event->entries)), group);
  }

  std::shared_ptr<EventHandler> handlerOf(const std::string& eventName) {
    const std::lock_guard lock(_mutex);
    const auto found = _handlers.find(eventName);
    return found == _handlers.end() ? nullptr : found->second;
  }

  const std::shared_ptr<qel::DispatchQueue> _queue;
  EventBacklog _backlog;
  std::mutex _mutex;
  std::map<std::string, std::shared_ptr<EventHandler>> _handlers;
  std::unique_ptr<Transport> _transport;
};

std::shared_ptr<Manager> CreateManager(std::string_view clientName,
                                       std::shared_ptr<qel::DispatchQueue> queue) {
  if (!queue) return nullptr;
  auto manager = std::make_shared<Manager>(std::move(queue));
  return manager->connect(clientName) ? manager : nullptr;
}

void RegisterEventHandler(std::shared_ptr<Manager> manager, std::string_view eventName,
                          EventHandler handler) {
  if (manager) manager->registerHandler(eventName, std::move(handler));
}

void EventsOn(std::shared_ptr<Manager> manager) {
  if (manager) manager->transport().eventsOn();
}

void EventsOff(std::shared_ptr<Manager> manager) {
  if (manager) manager->transport().eventsOff();
}

std::uint64_t DroppedEvents(const std::shared_ptr<Manager>& manager) {
  return manager ? manager->dropped() : 0;
}

CommandResult PerformCommand(std::shared_ptr<Manager> manager, std::string_view command,
                             const Message& request, Message& reply) {
  if (!manager) return {kServiceUnreachable, "baseband manager service not reachable"};
  return manager->transport().performCommand(command, request, reply);
}

}  // namespace tesk::client
