// A modem's diagnostics port on a pseudo-terminal, with a thread that answers.
#pragma once

#include <chrono>
#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "base/WakeUp.h"
#include "sources/diagnostics/port/FrameReader.h"
#include "support/diagnostics/ModemBrain.h"

namespace qel::diagnostics::test {

// There from the constructor until it is unplugged. Any thread.
class PseudoModem {
 public:
  explicit PseudoModem(ModemBrain brain = {});
  ~PseudoModem();
  PseudoModem(const PseudoModem&) = delete;
  PseudoModem& operator=(const PseudoModem&) = delete;

  // Of the terminal; another modem has another.
  const std::string& path() const { return _path; }

  void unplug();

  // Goes out as it is, whatever was asked for, as far as there is room.
  void sendBytes(ByteView bytes);
  void send(ByteView packet);
  // Only when the modem was told to send such logs.
  bool sendLog(std::uint16_t code, ByteView body, std::uint64_t timeMs);
  // Again and again from now on what that makes, that often; nothing ends it.
  void stream(unsigned perSecond, std::function<Bytes()> nextBytes);

  // With the modem's memory, which nobody changes meanwhile.
  template <class Look>
  auto with(Look look) {
    const std::lock_guard lock(_mutex);
    return look(_brain);
  }

 private:
  void play();
  void receive();
  void streamDue();

  std::string _path;
  int _master;
  const WakeUp _wakeUp;
  std::mutex _mutex;  // guards what follows but the thread
  ModemBrain _brain;
  FrameReader _frames;
  bool _ending = false;
  std::function<Bytes()> _nextBytes;
  std::chrono::nanoseconds _pause{0};
  std::chrono::steady_clock::time_point _streamAt = std::chrono::steady_clock::time_point::max();
  std::thread _thread;
};

}  // namespace qel::diagnostics::test
