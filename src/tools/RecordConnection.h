// The recorder's connection to the service: a client of its own, beside any viewer.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "base/Bytes.h"
#include "tesk/Transport.h"
#include "tesk/bus/BusConnector.h"

namespace qel::tools {

// Main thread. Events go to the sink on a thread of the connection's own. The end of this ends the
// delivery and, when no other recorder is at work, clears the recorder's configuration.
class RecordConnection {
 public:
  RecordConnection(std::string bus, Bytes configuration, tesk::EventSink sink,
                   tesk::bus::ReachabilityObserver observer, tesk::bus::AnswerWaitMaker makeWait);
  ~RecordConnection();
  RecordConnection(const RecordConnection&) = delete;
  RecordConnection& operator=(const RecordConnection&) = delete;

  // Installs the configuration, switches delivery on and asks for the SIM files, as the viewer
  // does; again, too, at a service that came back. Code 0 when events will come.
  tesk::CommandResult begin();

  // Ends the delivery now. How many events the service dropped because they were not recorded as
  // fast as they came; 0 also when it does not tell: it is away, or another recorder is at work.
  std::uint64_t end();

 private:
  tesk::CommandResult install();
  void querySimFiles();

  const std::string _bus;
  const Bytes _configuration;
  const std::unique_ptr<tesk::Transport> _transport;
  bool _ended = false;
};

}  // namespace qel::tools
