// A client that reads packets from its stream and counts them.
#pragma once

#include <atomic>
#include <cstdint>
#include <memory>
#include <string>
#include <thread>

#include "harness/Proxy.h"

namespace qel::trials {

// Registered, configured as the viewer is and with events on until the end of this object; reads
// on a thread of its own. Throws sdbus::Error without a service.
class PlainClient {
 public:
  static constexpr const char* kName = "soak-client";

  explicit PlainClient(const std::string& busAddress);
  ~PlainClient();
  PlainClient(const PlainClient&) = delete;
  PlainClient& operator=(const PlainClient&) = delete;

  std::uint64_t events() const { return _events; }

 private:
  void read();

  const std::unique_ptr<sdbus::IConnection> _connection;
  Proxy _proxy;
  sdbus::UnixFd _stream;
  std::atomic<std::uint64_t> _events = 0;
  std::atomic<bool> _stopping = false;
  std::thread _thread;
};

}  // namespace qel::trials
