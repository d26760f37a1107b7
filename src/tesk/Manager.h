// Client library of the baseband manager service.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

#include "base/DispatchQueue.h"
#include "tesk/Message.h"
#include "tesk/Transport.h"

namespace tesk::client {

// A client's connection. Shared by its holders; the connection ends with the last of them.
class Manager;

// Work that a handler may join to an event's delivery. Delivery goes on without waiting for it.
class DispatchGroup {};

// Runs on the manager's queue.
using EventHandler = std::function<void(const Message& event, DispatchGroup& group)>;

// Opens a connection under the client name; events arrive on the queue, which the manager shares,
// and wait there within the limits of an EventBacklog. An empty handle when there is no way to the
// service; every call below takes an empty handle too.
std::shared_ptr<Manager> CreateManager(std::string_view clientName,
                                       std::shared_ptr<qel::DispatchQueue> queue);

// Installs the handler of the events of that name, in place of an earlier one.
void RegisterEventHandler(std::shared_ptr<Manager> manager, std::string_view eventName,
                          EventHandler handler);

// Start and stop the delivery of events to the registered handlers. An event that no handler is
// registered for is dropped.
void EventsOn(std::shared_ptr<Manager> manager);
void EventsOff(std::shared_ptr<Manager> manager);

// How many events were dropped because they came faster than the handlers took them.
std::uint64_t DroppedEvents(const std::shared_ptr<Manager>& manager);

// Sends a request and waits for its answer. Service out of reach: a code that is not 0.
CommandResult PerformCommand(std::shared_ptr<Manager> manager, std::string_view command,
                             const Message& request, Message& reply);

}  // namespace tesk::client
