#include "sources/diagnostics/DiagnosticsRun.h"

#include <poll.h>

#include <algorithm>
#include <array>
#include <utility>

#include "base/Clock.h"
#include "base/LogSink.h"
#include "base/PollTimeout.h"
#include "sources/diagnostics/DiagnosticsCondition.h"
#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {
namespace {

using namespace std::chrono_literals;
using State = DiagnosticsSession::State;

WantedPackets allThatIsRead() {
  return {[](std::uint16_t code) { return findLog(code) != nullptr; },
          [](std::uint16_t id) { return findEvent(id) != nullptr; }};
}

}  // namespace

DiagnosticsSource::Run::Run(const DiagnosticsChoice& choice, const DiagnosticsWorld& world,
                            const DiagnosticsTiming& timing,
                            std::weak_ptr<sources::EventReceiver> receiver,
                            std::shared_ptr<sources::ListenerSignal> listeners)
    : _world(world),
      _timing(timing),
      _receiver(std::move(receiver)),
      _listeners(std::move(listeners)),
      _metrics(choice.radio, timing.period,
               [this](const sources::SourceEvent& event) { hand(event); }),
      _wish(choice.port),
      _isMissed(choice.isMissed || !choice.port.empty()),
      _generation(_listeners->generation()) {}

void DiagnosticsSource::Run::stop() {
  _stopping = true;
  _wakeUp.signal();
}

// Finds the port, lives with it until it is lost, pauses, and so on.
void DiagnosticsSource::Run::play() {
  PortFinder finder(_wish, _world.search());
  bool isFirst = true;
  auto pause = _timing.firstPause;
  while (!_stopping) {
    auto longest = _timing.longestPause;
    if (const auto port = finder.open()) {
      {
        const std::lock_guard lock(_factsMutex);
        _facts = {};
        _facts.port = finder.port().address;
        _facts.modem = finder.port().modem;
      }
      if (live(*port)) pause = _timing.firstPause;
    } else if (isFirst && finder.trouble().kind == PortTrouble::Kind::held) {
      rest(_timing.ending);  // a run before this one may just be leaving it
    } else {
      report(conditionWithoutPort(finder.trouble()));
      const bool isAbsent = finder.trouble().kind == PortTrouble::Kind::absent;
      if (_isMissed || !isAbsent) say(adviceWithoutPort(finder.port(), finder.trouble()));
      if (isAbsent && finder.descriptor() >= 0) longest = _timing.longestPauseWhenTold();
    }
    if (_stopping) break;
    isFirst = false;
    const auto end = Clock::now() + pause;
    pause = std::min(pause * 2, longest);
    if (waitForPorts(finder, end)) pause = _timing.firstPause;
  }
}

// Whether there are others before the end. What else udev does is no reason to try again.
bool DiagnosticsSource::Run::waitForPorts(PortFinder& finder, Clock::time_point end) {
  while (!_stopping && Clock::now() < end) {
    std::array<pollfd, 2> waited{pollfd{_wakeUp.descriptor(), POLLIN, 0},
                                 pollfd{finder.descriptor(), POLLIN, 0}};
    ::poll(waited.data(), waited.size(), pollTimeout(end));
    _wakeUp.clear();
    if (waited[1].revents == 0) continue;
    rest(_timing.firstPause);  // udev needs a moment for a device
    if (finder.hasChanged()) return true;
  }
  return false;
}

bool DiagnosticsSource::Run::live(DiagPort& port) {
  DiagnosticsSession session(port, _metrics, allThatIsRead(), _timing.session, Clock::now());
  _slept = _world.asleep();
  _endAt = Clock::time_point::max();
  bool hasListened = false;
  while (!session.isOver() && Clock::now() < _endAt) {
    wait(port, session);
    turn(port, session);
    hasListened = hasListened || session.state() == State::listening;
  }
  _metrics.forget();
  const FoundPort lost = {_facts.port, _facts.modem};
  {
    const std::lock_guard lock(_factsMutex);
    _facts = {};
  }
  report(conditionOf(session, false));
  if (!_stopping) say(adviceOf(session.state(), lost));
  return hasListened;
}

void DiagnosticsSource::Run::wait(const DiagPort& port, const DiagnosticsSession& session) {
  const auto until = std::min({session.due(), _metrics.due(), _endAt});
  std::array<pollfd, 2> waited{pollfd{_wakeUp.descriptor(), POLLIN, 0},
                               pollfd{port.descriptor(), POLLIN, 0}};
  ::poll(waited.data(), waited.size(), pollTimeout(until));
  if (waited[0].revents != 0) _wakeUp.clear();
  _readable = waited[1].revents != 0;
}

void DiagnosticsSource::Run::turn(DiagPort& port, DiagnosticsSession& session) {
  const auto now = Clock::now();
  _metrics.atTime(now, systemClock().nowMs());
  if (_stopping && _endAt == Clock::time_point::max()) {
    _endAt = now + _timing.ending;
    session.end(now);
  }
  noticeListeners();
  noticeSleep(session);
  if (_readable) session.receive(now);
  _metrics.refresh();
  const State before = session.state();
  session.listen(_anyoneListens, now);
  session.step(now);
  if (session.state() == State::resting && before != State::resting) _metrics.forget();
  noteFacts(port, session);
  // What is over is told once all that was known is forgotten.
  if (!session.isOver()) report(conditionOf(session, _metrics.knowsCell()));
}

void DiagnosticsSource::Run::noticeListeners() {
  const std::uint64_t now = _listeners->generation();
  if (std::exchange(_generation, now) == now) return;
  _anyoneListens = true;
  _metrics.sendAll();
}

void DiagnosticsSource::Run::noticeSleep(DiagnosticsSession& session) {
  constexpr auto kNap = 1s;
  const auto slept = _world.asleep();
  if (slept < std::exchange(_slept, slept) + kNap) return;
  _metrics.compareClocksAnew();
  session.check(Clock::now());
}

void DiagnosticsSource::Run::hand(const sources::SourceEvent& event) {
  if (_stopping) return;
  // Held no longer than this: letting go may be the end of the receiver and of the source.
  if (const auto taker = _receiver.lock()) {
    _anyoneListens = taker->take(event) == sources::EventReceiver::Taken::yes;
  } else {
    _stopping = true;
  }
}

void DiagnosticsSource::Run::report(const sources::SourceCondition& condition) {
  if (_stopping || condition == _reported) return;
  _reported = condition;
  if (const auto taker = _receiver.lock()) taker->conditionChanged(condition);
}

// The same thing again and again is said once.
void DiagnosticsSource::Run::say(const std::string& line) {
  if (line.empty() || line == _said) return;
  _said = line;
  systemLog().write("diag: " + line);
}

// New listeners do not shorten it.
void DiagnosticsSource::Run::rest(std::chrono::milliseconds pause) {
  const auto end = Clock::now() + pause;
  while (!_stopping && Clock::now() < end) {
    pollfd waited{_wakeUp.descriptor(), POLLIN, 0};
    ::poll(&waited, 1, pollTimeout(end));
    _wakeUp.clear();
  }
}

void DiagnosticsSource::Run::noteFacts(const DiagPort& port, const DiagnosticsSession& session) {
  const std::lock_guard lock(_factsMutex);
  _facts.frames = port.counts();
  _facts.unwantedPackets = session.unwantedPackets();
  _facts.replacedMasks = session.replacedMasks();
  if (_facts.version.has_value() != session.version().has_value()) {
    _facts.version = session.version();
  }
  if (_facts.build.has_value() != session.build().has_value()) _facts.build = session.build();
  _rate.note(_facts.frames.bytes, Clock::now());
}

sources::SourceFacts DiagnosticsSource::Run::facts() const {
  const PacketCounts counts = _metrics.counts();
  const std::lock_guard lock(_factsMutex);
  PortFacts facts = _facts;
  facts.bytesPerSecond = _rate.perSecond(Clock::now());
  return factsOf(facts, counts);
}

std::string DiagnosticsSource::Run::modem() const {
  const std::lock_guard lock(_factsMutex);
  return _facts.port.empty() ? "" : _facts.modem;
}

}  // namespace qel::diagnostics
