// One registered client of the service on the bus.
#pragma once

#include <sdbus-c++/sdbus-c++.h>
#include <memory>
#include <string>

#include "service/ServiceCore.h"
#include "service/bus/EventStream.h"

namespace qel::service {

// Belongs to the thread of the bus front; its session's events come on others.
class BusClient {
 public:
  // Opens a session whose events go into a new socket. `backlogBegins` and `backlogs` as for
  // EventStream. Throws sdbus::Error when no socket can be made.
  BusClient(std::shared_ptr<ServiceCore> core, const std::string& clientName,
            std::function<void()> backlogBegins, std::shared_ptr<Backlogs> backlogs);
  ~BusClient();
  BusClient(const BusClient&) = delete;
  BusClient& operator=(const BusClient&) = delete;

  // The client's end of the socket, once.
  sdbus::UnixFd takeClientEnd() { return std::move(_clientEnd); }

  Session& session() { return *_session; }
  EventStream& stream() { return *_stream; }

 private:
  const std::shared_ptr<ServiceCore> _core;
  sdbus::UnixFd _clientEnd;
  std::shared_ptr<EventStream> _stream;
  std::shared_ptr<Session> _session;
};

}  // namespace qel::service
