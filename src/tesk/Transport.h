// How messages reach the baseband manager service: over a bus, or within the process.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

#include "tesk/Message.h"

namespace tesk {

// What a command came to. Code 0 is success.
struct CommandResult {
  std::int32_t code = 0;
  std::string message;
};

// The service cannot be reached at all.
inline constexpr std::int32_t kServiceUnreachable = static_cast<std::int32_t>(0xE020E001);

// Takes one event of the stream with that name. Any thread.
using EventSink = std::function<void(std::string_view eventName, Message event)>;

// One client's connection. Made by a Connector; its calls come from any one thread at a time.
// Events go to the sink from eventsOn to eventsOff; after the destructor has returned no more come.
class Transport {
 public:
  virtual ~Transport() = default;
  virtual CommandResult performCommand(std::string_view command, const Message& request,
                                       Message& reply) = 0;
  virtual void eventsOn() = 0;
  virtual void eventsOff() = 0;
};

// Opens connections.
class Connector {
 public:
  virtual ~Connector() = default;
  // Nothing when the service cannot be reached and never will be.
  virtual std::unique_ptr<Transport> connect(std::string_view clientName, EventSink sink) = 0;
};

// The way by which CreateManager connects; none: it gives an empty handle. Set at start-up.
void setConnector(std::shared_ptr<Connector> connector);
const std::shared_ptr<Connector>& connector();

}  // namespace tesk
