#include "sources/diagnostics/session/DiagnosticsSession.h"

#include <algorithm>
#include <utility>

namespace qel::diagnostics {
namespace {

constexpr int kMostTimes = 2;
constexpr unsigned kEvents = 4096;  // 12 bits

Bytes eventBits(const std::function<bool(std::uint16_t id)>& wanted) {
  Bytes bits;
  for (unsigned id = 0; id < kEvents; ++id) {
    if (!wanted(static_cast<std::uint16_t>(id))) continue;
    bits.resize(id / 8 + 1);
    bits[id / 8] = static_cast<std::uint8_t>(bits[id / 8] | 1U << id % 8);
  }
  return bits;
}

}  // namespace

DiagnosticsSession::DiagnosticsSession(DiagPort& port, PacketSink& sink, WantedPackets wanted,
                                       const SessionTiming& timing, Clock::time_point now)
    : _port(port),
      _sink(sink),
      _wanted(std::move(wanted)),
      _timing(timing),
      _now(now),
      _heardAt(now),
      _checkedAt(now) {
  planStart();
  go();
}

// Off first: a program that ended without a word has left its logs on.
void DiagnosticsSession::planStart() {
  plan({Request::eventsOff()});
  plan({Request::messagesOff()});
  plan({Request::logsOff(), Need::mustBeGood});
  plan({});
  plan({Request::build(), {}, [this](ByteView answer) { _build = buildIn(answer); }});
  plan({Request::version(), {}, [this](ByteView answer) { _version = versionIn(answer); }});
  plan({Request::logRanges(), Need::mustBeGood, [this](ByteView answer) {
          if (const auto ranges = rangesIn(answer)) _masks = masksOf(*ranges, _wanted.log);
          planMasks();
        }});
}

void DiagnosticsSession::planMasks() {
  _anyMaskSet = false;
  for (const LogMask& mask : _masks) {
    plan({Request::setLogMask(mask), Need::mustAnswer, [this](ByteView) { _anyMaskSet = true; }});
  }
  const Bytes events = eventBits(_wanted.event);
  if (events.empty()) return;
  plan({Request::eventMask(events)});
  plan({Request::eventsOn()});
}

void DiagnosticsSession::planCheck() {
  plan({Request::build(), Need::mustAnswer});
  for (const LogMask& mask : _masks) {
    plan({Request::getLogMask(mask.equipment()), {}, [this, &mask](ByteView answer) {
            if (saysMask(answer, mask)) return;
            ++_replacedMasks;
            plan({Request::setLogMask(mask), Need::mustAnswer});
          }});
  }
}

void DiagnosticsSession::planOff() {
  plan({Request::logsOff()});
  plan({Request::eventsOff()});
}

void DiagnosticsSession::receive(Clock::time_point now) {
  _now = now;
  if (isOver()) return;
  const bool isOpen = _port.receive([this](ByteView packet) {
    _heard = true;
    _heardAt = _now;
    _packets.take(packet);
  });
  if (!isOpen) _state = State::lost;
}

void DiagnosticsSession::step(Clock::time_point now) {
  _now = now;
  if (isOver()) return;
  if (_begun && now >= _saidAt + (_steps.front().request ? _timing.answer : _timing.drain)) {
    unanswered();
  }
  if (!isOver() && _steps.empty() && now >= checkDue()) check(now);
}

DiagnosticsSession::Clock::time_point DiagnosticsSession::due() const {
  if (isOver()) return Clock::time_point::max();
  if (!_begun) return checkDue();
  return _saidAt + (_steps.front().request ? _timing.answer : _timing.drain);
}

DiagnosticsSession::Clock::time_point DiagnosticsSession::checkDue() const {
  if (_state != State::listening) return Clock::time_point::max();
  if (_port.isShared()) return _checkedAt + _timing.sharedCheck;
  return std::max(_heardAt, _checkedAt) + _timing.quietCheck;
}

void DiagnosticsSession::listen(bool on, Clock::time_point now) {
  const Goal goal = on ? Goal::listen : Goal::rest;
  if (isOver() || _goal == goal || _goal == Goal::end) return;
  _now = now;
  _goal = goal;
  if (_steps.empty()) stepsDone();
}

void DiagnosticsSession::check(Clock::time_point now) {
  if (_state != State::listening || !_steps.empty()) return;
  _now = now;
  _checkedAt = now;
  planCheck();
  go();
}

void DiagnosticsSession::end(Clock::time_point now) {
  if (isOver() || _goal == Goal::end) return;
  _now = now;
  _goal = Goal::end;
  _steps.clear();
  _begun = false;
  _state = State::resting;
  planOff();
  go();
}

void DiagnosticsSession::go() {
  if (_begun || isOver()) return;
  if (_steps.empty()) return stepsDone();
  _begun = true;
  _times = 0;
  say();
}

void DiagnosticsSession::say() {
  ++_times;
  _saidAt = _now;
  if (_steps.front().request) _port.send(*_steps.front().request);
}

void DiagnosticsSession::finishStep() {
  _steps.pop_front();
  _begun = false;
  go();
}

void DiagnosticsSession::unanswered() {
  const Step& step = _steps.front();
  if (!step.request) return finishStep();
  if (_times < kMostTimes && _goal != Goal::end) return say();
  if (!_heard || step.need != Need::canDoWithout) {
    _state = State::silent;
  } else {
    finishStep();
  }
}

// What there is to do when nothing is left to say.
void DiagnosticsSession::stepsDone() {
  const bool isOn = _state == State::listening;
  if (_state == State::starting) {
    _state = _anyMaskSet ? State::listening : State::refused;
    _checkedAt = _now;
    if (_goal == Goal::listen || isOver()) return;
    return stepsDone();
  }
  if (_goal == Goal::end) {
    _state = State::ended;
  } else if (_goal == Goal::rest && isOn) {
    _state = State::resting;
    planOff();
    go();
  } else if (_goal == Goal::listen && _state == State::resting) {
    _state = State::starting;
    planMasks();
    go();
  }
}

void DiagnosticsSession::answer(ByteView packet) {
  if (!_begun || !_steps.front().request) return;
  const Request::Answer answer = _steps.front().request->answerIn(packet);
  if (answer == Request::Answer::none) return;
  // Held here: what takes the answer may plan more.
  const Step step = _steps.front();
  if (answer == Request::Answer::good && step.take) step.take(packet);
  if (answer == Request::Answer::refused && step.need == Need::mustBeGood) {
    _state = State::refused;
  } else {
    finishStep();
  }
}

void DiagnosticsSession::log(const LogPacket& packet) {
  if (wants(packet.code)) {
    _sink.log(packet);
  } else {
    ++_unwanted;
  }
}

void DiagnosticsSession::event(const ModemEvent& event) {
  if (_anyMaskSet && _state <= State::listening && _wanted.event(event.id)) {
    _sink.event(event);
  } else {
    ++_unwanted;
  }
}

bool DiagnosticsSession::wants(std::uint16_t code) const {
  if (!_anyMaskSet || _state > State::listening) return false;
  const unsigned item = code & (kMostItems - 1);
  return std::ranges::any_of(_masks, [&](const LogMask& mask) {
    return mask.equipment() == code >> 12 && item < mask.items() &&
           (mask.bits()[item / 8] >> item % 8 & 1) != 0;
  });
}

}  // namespace qel::diagnostics
