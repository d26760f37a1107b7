// The recorder's connection to the service: a client of its own, beside any viewer.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "base/Bytes.h"
#include "tesk/Transport.h"

namespace qel::capture {

// Who records: the name of the client, and the number of its application, under which the service
// keeps what it asks for.
struct RecorderIdentity {
  std::string name;
  std::int64_t application;
};
// The viewer itself is application 2.
inline const RecorderIdentity kConsoleRecorder = {"qelctl-record", 3};
inline const RecorderIdentity kViewersRecorder = {"qelwatch-record", 4};
inline const RecorderIdentity kPublisher = {"qelctl-publish", 5};
inline const RecorderIdentity kExporter = {"qelctl-exporter", 6};

// Main thread. Events go to the sink on a thread of the connection's own. The end of this ends the
// delivery and, when no other of its name is at work, clears its configuration.
class RecordConnection {
 public:
  // With the bus of the connector it asks there for others of its name; without it is the only one.
  RecordConnection(tesk::Connector& connector, RecorderIdentity identity,
                   std::optional<std::string> bus, Bytes configuration, tesk::EventSink sink);
  ~RecordConnection();
  RecordConnection(const RecordConnection&) = delete;
  RecordConnection& operator=(const RecordConnection&) = delete;

  // Installs the configuration, switches delivery on and asks for the SIM files, as the viewer
  // does; again, too, at a service that came back. Code 0 when events will come.
  tesk::CommandResult begin();

  // Ends the delivery now. How many events the service dropped because they were not recorded as
  // fast as they came; 0 also when that is not known: nobody can be asked, or another recorder of
  // its name is at work.
  std::uint64_t end();

 private:
  tesk::CommandResult install();
  void querySimFiles();
  void clear();

  const RecorderIdentity _identity;
  const std::optional<std::string> _bus;
  const Bytes _configuration;
  const std::unique_ptr<tesk::Transport> _transport;
  bool _ended = false;
};

}  // namespace qel::capture
