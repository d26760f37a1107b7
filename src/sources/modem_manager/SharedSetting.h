// A setting of a modem that all clients of ModemManager share, such as how often it measures.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <chrono>
#include <functional>
#include <optional>
#include <string>
#include <tuple>
#include <utility>

#include "sources/modem_manager/BusCalls.h"
#include "sources/modem_manager/BusValues.h"
#include "sources/modem_manager/SaidOnce.h"

namespace qel::sources {

// The method that sets it, and what to say when that is refused.
struct SettingRow {
  const char* interface;
  const char* member;
  const char* deniedAdvice;       // one line: what is missing, and what would allow it
  const char* unsupportedAdvice;  // one line; null where nothing is missing then
  bool insists;                   // sets it again whenever another client has changed it
};

// Changes it where that is needed, and puts back what it found unless another client has changed it
// since. Put back to what was found here is also what another service like this one leaves when it
// ends: then it is changed once more. Whoever does that twice in a minute means it. One modem's.
// One thread; never waits.
template <class... Values>
class SharedSetting {
 public:
  using Clock = std::chrono::steady_clock;
  using Value = std::tuple<Values...>;
  using Read = std::optional<Value> (*)(const BusInterfaces& modem);
  // What it should be when it is that; the same when it may stay.
  using Want = std::function<Value(const Value& found)>;

  SharedSetting(const SettingRow& row, std::string modem, Read read, Want want)
      : _row(row), _modem(std::move(modem)), _read(read), _want(std::move(want)) {}

  // `identity` names the modem to whoever reads the log once.
  void step(BusCalls& calls, SaidOnce& said, const std::string& identity,
            const BusInterfaces& interfaces, Clock::time_point now) {
    const auto value = _read(interfaces);
    if (!value || _underWay) return;
    if (_found && *value == _set) _seen = true;
    if (_found && _seen && *value != _set) changedByAnother(*value, now);
    const Value wanted = _want(*value);
    if (wanted == *value || _off || now < _notBefore) return;
    _notBefore = now + kPause;
    _seen = false;
    _set = wanted;
    call(
        calls, wanted, [this, found = *value](sdbus::MethodReply&) { settled(found); },
        [this, &said, identity](const sdbus::Error& error) {
          _underWay = false;
          const Refusal refusal = refusalOf(error);
          if (refusal == Refusal::none) return;
          _off = true;
          const char* advice =
              refusal == Refusal::denied ? _row.deniedAdvice : _row.unsupportedAdvice;
          if (advice) said.say(identity, advice);
        });
  }

  void restore(BusCalls& calls, const BusInterfaces& interfaces) {
    const auto value = _read(interfaces);
    if (!_found || !value || (_seen && *value != _set)) return;
    const auto done = [this](const auto&) { _underWay = false; };
    call(calls, *std::exchange(_found, std::nullopt), done, done);
  }

  bool isUnderWay() const { return _underWay; }
  // Refused, or left to another client.
  bool isOff() const { return _off; }

 private:
  // Between attempts, so that two clients that disagree do not call without end.
  static constexpr std::chrono::seconds kPause{5};
  static constexpr std::chrono::seconds kMoment{60};

  void changedByAnother(const Value& value, Clock::time_point now) {
    const bool putBack = value == *_found && (!_putBackAt || now - *_putBackAt > kMoment);
    if (putBack) _putBackAt = now;
    _off = _off || !(_row.insists || putBack);
    _found.reset();  // now it is the other client's
  }

  void settled(const Value& found) {
    _underWay = false;
    _found = found;
  }

  void call(BusCalls& calls, const Value& value, BusCalls::Reply reply, BusCalls::Failure failure) {
    _underWay = true;
    std::apply(
        [&](const Values&... values) {
          calls.call(_modem, _row.interface, _row.member, std::move(reply), std::move(failure),
                     values...);
        },
        value);
  }

  const SettingRow& _row;
  const std::string _modem;
  const Read _read;
  const Want _want;
  std::optional<Value> _found;  // before it was changed here
  Value _set;                   // what it was changed to
  bool _seen = false;           // that has been announced
  bool _underWay = false;
  bool _off = false;
  Clock::time_point _notBefore;
  std::optional<Clock::time_point> _putBackAt;
};

}  // namespace qel::sources
