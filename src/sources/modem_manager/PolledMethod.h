// A method of a modem that is called again and again, and given up when it is refused.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

#include "sources/modem_manager/BusCalls.h"
#include "sources/modem_manager/SaidOnce.h"

namespace qel::sources {

struct MethodRow {
  const char* interface;
  const char* member;
  const char* deniedAdvice;       // one line: what is missing, and what would allow it
  const char* unsupportedAdvice;  // one line
};

// One modem's. One thread; never waits: at most one call is under way.
class PolledMethod {
 public:
  using Clock = std::chrono::steady_clock;
  using Take = std::function<void(sdbus::MethodReply& reply)>;  // may throw sdbus::Error

  // `forget` when the last answer no longer holds: the call is refused, or has failed three times.
  PolledMethod(const MethodRow& row, std::string modem, Take take, std::function<void()> forget)
      : _row(row), _modem(std::move(modem)), _take(std::move(take)), _forget(std::move(forget)) {}

  // Calls when that is due. `identity` names the modem to whoever reads the log once.
  void step(BusCalls& calls, SaidOnce& said, const std::string& identity, Clock::time_point now,
            std::chrono::milliseconds period);
  // The next step calls, if it may.
  void callSoon() { _due = {}; }
  Clock::time_point due() const;
  // There has been an answer, or an error instead.
  bool isSettled() const { return _settled; }

 private:
  void failed(const sdbus::Error& error, SaidOnce& said, const std::string& identity);

  const MethodRow& _row;
  const std::string _modem;
  const Take _take;
  const std::function<void()> _forget;
  bool _underWay = false;
  bool _off = false;
  bool _settled = false;
  int _failures = 0;  // in a row
  Clock::time_point _due;
};

}  // namespace qel::sources
