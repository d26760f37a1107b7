// A message bus of the test's own.
#pragma once

#include <sys/types.h>

#include <string>

namespace qel::testing {

// dbus-daemon on an address of its own, there until the end of this object. Any user may own and
// call anything, unless `policy` (elements of a busconfig) says otherwise.
class PrivateBus {
 public:
  explicit PrivateBus(const std::string& policy = "");
  ~PrivateBus();
  PrivateBus(const PrivateBus&) = delete;
  PrivateBus& operator=(const PrivateBus&) = delete;

  const std::string& address() const { return _address; }

  // Ends the daemon, and starts it again on the same address. A killed one ends nothing in order.
  void stop();
  void kill();
  void start();
  void signal(int number) const;
  pid_t pid() const { return _pid; }

 private:
  void end(int signalNumber);

  std::string _directory;
  std::string _address;
  pid_t _pid = 0;
};

}  // namespace qel::testing
