#include "service/sources/modem_manager/SignalRate.h"

#include "service/sources/modem_manager/Names.h"

namespace qel::service {
namespace {

// Between attempts, so that two clients that disagree do not call without end.
constexpr std::chrono::seconds kPause(5);

constexpr const char* kDenied =
    "signal levels come at the pace that other programs ask for: not allowed to set it (polkit "
    "action org.freedesktop.ModemManager1.Device.Control)";
constexpr const char* kUnsupported = "the modem has no signal levels to report";

std::optional<std::uint32_t> rateIn(const BusInterfaces& interfaces) {
  return busValue<std::uint32_t>(propertiesOf(interfaces, mm::kSignal), "Rate");
}

}  // namespace

void SignalRate::step(BusCalls& calls, SaidOnce& said, const std::string& identity,
                      const BusInterfaces& interfaces, Clock::time_point now) {
  const auto rateS = rateIn(interfaces);
  if (!rateS || _underWay) return;
  if (_foundS && *rateS == _wantedS) _seen = true;
  if (_foundS && _seen && *rateS != _wantedS) _foundS.reset();  // now it is another client's
  const bool fastEnough = *rateS != 0 && *rateS <= _wantedS;
  if (fastEnough || _off || now < _notBefore) return;
  _notBefore = now + kPause;
  _underWay = true;
  _seen = false;
  calls.call(
      _modem, mm::kSignal, "Setup",
      [this, found = *rateS](sdbus::MethodReply&) {
        _underWay = false;
        _foundS = found;
      },
      [this, &said, identity](const sdbus::Error& error) {
        _underWay = false;
        const Refusal refusal = refusalOf(error);
        if (refusal == Refusal::none) return;
        _off = true;
        said.say(identity, refusal == Refusal::denied ? kDenied : kUnsupported);
      },
      _wantedS);
}

void SignalRate::restore(BusCalls& calls, const BusInterfaces& interfaces) {
  const auto rateS = rateIn(interfaces);
  if (!_foundS || !rateS || (_seen && *rateS != _wantedS)) return;
  _underWay = true;
  const auto done = [this](const auto&) { _underWay = false; };
  calls.call(_modem, mm::kSignal, "Setup", done, done, *_foundS);
  _foundS.reset();
}

}  // namespace qel::service
