#include "sources/modem_manager/PolledMethod.h"

namespace qel::sources {
namespace {

// A modem that is busy for a while is where it was.
constexpr int kMostFailures = 3;

}  // namespace

void PolledMethod::step(BusCalls& calls, SaidOnce& said, const std::string& identity,
                        Clock::time_point now, std::chrono::milliseconds period) {
  if (_off || _underWay || now < _due) return;
  _due = now + period;
  _underWay = true;
  calls.call(
      _modem, _row.interface, _row.member,
      [this](sdbus::MethodReply& reply) {
        _underWay = false;
        _settled = true;
        _take(reply);
        _failures = 0;
      },
      [this, &said, identity](const sdbus::Error& error) { failed(error, said, identity); });
}

void PolledMethod::failed(const sdbus::Error& error, SaidOnce& said, const std::string& identity) {
  _underWay = false;
  _settled = true;
  const Refusal refusal = refusalOf(error);
  if (refusal != Refusal::none || ++_failures >= kMostFailures) _forget();
  if (refusal == Refusal::none) return;
  _off = true;
  said.say(identity, refusal == Refusal::denied ? _row.deniedAdvice : _row.unsupportedAdvice);
}

PolledMethod::Clock::time_point PolledMethod::due() const {
  return _off || _underWay ? Clock::time_point::max() : _due;
}

}  // namespace qel::sources
