// A modem that speaks AT commands, for the real ModemManager to drive.
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "base/WakeUp.h"

namespace qel::testing {

// What the modem answers. A change of the last four is told without being asked (27.007, clauses
// 7.2, 10.1.20 and 10.1.22).
struct AtModem {
  std::string imei = "350000000000011";
  std::string imsi = "001011234567890";
  std::string iccid = "8900101234567890123";
  std::string operatorCode = "00101";
  std::uint32_t rsrp = 50;  // +CESQ: 0 to 97, and 255 for not known
  std::uint32_t rsrq = 20;  // 0 to 34
  int registration = 1;     // +CEREG: 1 home, 2 searching, 3 denied, 5 roaming
  int technology = 7;       // 7 LTE, 2 UMTS, 0 GSM
  std::uint32_t area = 0x1A2B;
  std::uint32_t cellId = 0x1C2D3FF;
  friend bool operator==(const AtModem&, const AtModem&) = default;
};

// Listens on two sockets of the abstract namespace, whose names no other process has, with a thread
// of its own. Any thread.
class AtSimulator {
 public:
  explicit AtSimulator(AtModem modem = {});
  ~AtSimulator();
  AtSimulator(const AtSimulator&) = delete;
  AtSimulator& operator=(const AtSimulator&) = delete;

  const std::vector<std::string>& ports() const { return _ports; }
  void change(const std::function<void(AtModem&)>& edit);
  // The commands that were not understood, to find out what a ModemManager misses.
  std::vector<std::string> unknownCommands() const;

 private:
  struct Line {
    int descriptor;
    std::string received;
    bool dataMode = false;  // a call is up: no command is understood any more
  };

  void live();
  void accept(int listener);
  bool receive(Line& line);
  std::string answer(Line& line, const std::string& command);
  void send(const Line& line, const std::string& text);

  std::vector<std::string> _ports;
  std::vector<int> _listeners;
  std::vector<Line> _lines;  // the thread only, when it runs
  const WakeUp _wakeUp;
  std::atomic<bool> _stopping = false;
  mutable std::mutex _mutex;  // guards from here on
  AtModem _modem;
  std::map<std::string, std::string> _contexts;  // as +CGDCONT defines them, by identifier
  std::vector<std::string> _unasked;             // to be told on every line
  std::vector<std::string> _unknown;
  std::thread _thread;
};

}  // namespace qel::testing
