// Stands between a program and a server, and keeps every byte.
#pragma once

#include <atomic>
#include <cstdint>
#include <mutex>
#include <string>
#include <thread>

namespace qel::testing {

// One connection at a time, until the end of this object.
class WireTap {
 public:
  explicit WireTap(std::uint16_t server);
  ~WireTap();
  WireTap(const WireTap&) = delete;
  WireTap& operator=(const WireTap&) = delete;

  std::uint16_t port() const { return _port; }
  // That the program has sent.
  std::string sent() const;

 private:
  void run();
  void carry(int client, int server);

  const std::uint16_t _server;
  int _listener = -1;
  std::uint16_t _port = 0;
  mutable std::mutex _mutex;
  std::string _sent;
  std::atomic<bool> _ending = false;
  std::thread _thread;
};

}  // namespace qel::testing
