// A program that has the modem's port and shares it out on an abstract socket.
#pragma once

#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "base/WakeUp.h"
#include "support/diagnostics/ModemBrain.h"

namespace qel::diagnostics::test {

// One packet a message; answers and logs go to every client. Any thread.
class FakeRouter {
 public:
  explicit FakeRouter(ModemBrain brain = {});
  ~FakeRouter();
  FakeRouter(const FakeRouter&) = delete;
  FakeRouter& operator=(const FakeRouter&) = delete;

  const std::string& address() const { return _address; }

  void send(ByteView packet);

  template <class Look>
  auto with(Look look) {
    const std::lock_guard lock(_mutex);
    return look(_brain);
  }

 private:
  void play();
  void receive(std::size_t client);

  std::string _address;
  int _listener;
  const WakeUp _wakeUp;
  std::mutex _mutex;  // guards what follows but the thread
  ModemBrain _brain;
  std::vector<int> _clients;
  bool _ending = false;
  std::thread _thread;
};

}  // namespace qel::diagnostics::test
