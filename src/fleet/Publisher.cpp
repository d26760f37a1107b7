#include "fleet/Publisher.h"

#include <poll.h>

#include <algorithm>
#include <utility>

#include "base/Rendering.h"
#include "fleet/LinkWait.h"

namespace qel::fleet {
namespace {

using namespace std::chrono_literals;

constexpr auto kAnswerPatience = 60s;           // of the broker, for a message or a greeting
constexpr std::size_t kMostUnderWay = 500;      // messages
constexpr std::size_t kReadAtOnce = 64 * 1024;  // bytes of the queue

PublishSettings complete(PublishSettings settings) {
  settings.link.client = "qelwatch-" + settings.phone;
  settings.link.will = {"qelwatch/" + settings.phone + "/status", "offline"};
  return settings;
}

// The line with what tells a receiver whether one is missing, or came before.
std::string numbered(std::string line, std::uint32_t stream, std::uint64_t number) {
  line.pop_back();
  return line + ", \"stream\": " + std::to_string(stream) +
         ", \"number\": " + std::to_string(number) + '}';
}

}  // namespace

Publisher::Publisher(EventQueue& queue, PublishSettings settings, Say say)
    : _queue(queue),
      _settings(complete(std::move(settings))),
      _say(std::move(say)),
      _lostBefore(queue.counts().lost) {
  if (_queue.counts().waiting > 0) _fresh = 1;
  _thread = std::thread([this] { run(); });
}

Publisher::~Publisher() {
  _ending = true;
  _wakeUp.signal();
  if (_thread.joinable()) _thread.join();
}

void Publisher::queued(std::size_t bytes) {
  const std::size_t before = _fresh.fetch_add(std::max<std::size_t>(bytes, 1));
  const bool fillsBatch = before < _settings.batchBytes && before + bytes >= _settings.batchBytes;
  if (before == 0 || fillsBatch) _wakeUp.signal();
}

bool Publisher::end(std::chrono::milliseconds patience) {
  _ending = true;
  _wakeUp.signal();
  const auto last = Clock::now() + patience;
  while (!_hasEnded && Clock::now() < last) std::this_thread::sleep_for(5ms);
  return _hasEnded;
}

std::optional<std::string> Publisher::refusal() const {
  if (!_isRefused) return std::nullopt;
  return _refusal;
}

std::string Publisher::broker() const { return _settings.link.broker.text() + ": "; }

std::string Publisher::topic(std::string_view name) const {
  return "qelwatch/" + _settings.phone + "/" + std::string(name);
}

void Publisher::sayOnce(const std::string& line) {
  if (std::exchange(_said, line) != line) _say(line);
}

void Publisher::run() {
  while (!_ending && !_isRefused) {
    const auto now = Clock::now();
    if (!_firstFresh && _fresh > 0) _firstFresh = now;
    const bool isFirst = !_wasConnected && _retries.next() == Clock::time_point();
    if (!_link && now >= _retries.next() && (isFirst || _firstFresh)) connect();
    if (_link && _link->state() == BrokerLink::State::open && isBatchDue(now)) sendBatch();
    sayLosses();
    if (!_ending && !_isRefused) wait(nextTime(now));
  }
  if (_link && !_isRefused) leave();
  endLink();
  _hasEnded = true;
}

bool Publisher::isBatchDue(Clock::time_point now) const {
  if (!_isIntroduced) return false;
  if (_isSending) return true;
  return _firstFresh &&
         (_ending || now >= *_firstFresh + _settings.every || _fresh >= _settings.batchBytes);
}

void Publisher::connect() {
  LinkFailure failure;
  _link = BrokerLink::open(
      _settings.link,
      [this](int message, const std::string& refusal) { arrived(message, refusal); }, failure);
  _lastTraffic = Clock::now();
  if (_link) return;
  _retries.failed(_lastTraffic);
  note(failure);
}

// Why there is no link, for people.
void Publisher::note(const LinkFailure& failure) {
  if (!failure.isRefusal || _wasConnected || _settings.keepsTrying) {
    sayOnce(broker() + failure.why + "; events wait in the queue");
    return;
  }
  _refusal = broker() + failure.why;
  _isRefused = true;
  _say("");  // whoever waits looks
}

void Publisher::beginLink() {
  const auto waiting = _queue.counts().waiting;
  _greeting = broker() + (_wasConnected ? "connected again" : "connected as " + _settings.phone) +
              ", " + std::to_string(waiting) + " events waiting";
  _wasConnected = true;
  _toldOfQueue.clear();
  sendStatus("online");
  tellOfQueue();
  _isIntroduced = !isUnderWay();
  if (waiting > 0) {
    _isSending = true;
  } else {
    sayOnce(std::exchange(_greeting, {}));
  }
}

// What was under way goes again over the next link.
void Publisher::endLink() {
  if (!_link) return;
  _underWay.clear();
  forgetArrived();
  _arrived.clear();
  _queue.sendAgain();
  _sentUpTo = 0;
  _isSending = false;
  _isIntroduced = false;
  _turnedDown.clear();
  _link.reset();
}

void Publisher::turn(short revents) {
  const auto before = _link->state();
  if (revents != 0) _lastTraffic = Clock::now();
  const auto state = _link->turn((revents & (POLLIN | POLLERR | POLLHUP)) != 0);
  if (before == BrokerLink::State::greeting && state == BrokerLink::State::open) beginLink();
  forgetArrived();
  const bool isSilent = (isUnderWay() || state == BrokerLink::State::greeting) &&
                        Clock::now() - _lastTraffic >= kAnswerPatience;
  if (state == BrokerLink::State::ended) {
    loseLink(_link->failure());
  } else if (!_turnedDown.empty()) {
    loseLink({"the broker does not take messages to " + topic("…") + ": " + _turnedDown});
  } else if (isSilent) {
    loseLink({"the broker does not answer"});
  }
}

void Publisher::loseLink(LinkFailure failure) {  // of its own: the link's goes with it
  endLink();
  _retries.failed(Clock::now());
  if (_queue.counts().waiting > 0 && _fresh == 0) _fresh = 1;
  note(failure);
}

void Publisher::arrived(int message, const std::string& refusal) {
  const auto found = _underWay.find(message);
  if (found == _underWay.end()) return;
  const std::uint64_t number = found->second;
  _underWay.erase(found);
  if (!refusal.empty()) {
    _turnedDown = refusal;
  } else if (number != 0) {
    if (!_greeting.empty()) sayOnce(std::exchange(_greeting, {}));
    _retries.succeeded();
    _arrived.push_back(number);
    ++_sent;
  } else if (!isUnderWay()) {
    _isIntroduced = true;
  }
}

void Publisher::forgetArrived() {
  if (_arrived.empty() || (isUnderWay() && _arrived.size() < _forgetAt)) return;
  if (_queue.remove(_arrived)) {
    _arrived.clear();
    _forgetAt = kForgetTogether;
  } else {
    sayOnce(_queue.error());
    _forgetAt = 2 * _arrived.size();  // a full disk may stay full for long
  }
}

void Publisher::sayLosses() {
  if (_hasSaidLoss || _queue.counts().lost == _lostBefore) return;
  _hasSaidLoss = true;
  _say(_queue.error() + "; events are lost");
}

void Publisher::sendStatus(std::string_view status) {
  bool isTooLarge = false;
  const auto message = _link->send(topic("status"), status, BrokerLink::Retained::yes, isTooLarge);
  if (message) _underWay[*message] = 0;
}

void Publisher::tellOfQueue() {
  const auto counts = _queue.counts();
  const std::string text = jsonText(Dictionary{{"stream", _queue.stream()},
                                               {"dropped", counts.dropped},
                                               {"lost", counts.lost},
                                               {"too_large", counts.tooLarge},
                                               {"undecodable", _undecodable.load()}});
  if (std::exchange(_toldOfQueue, text) == text) return;
  bool isTooLarge = false;
  const auto message = _link->send(topic("queue"), text, BrokerLink::Retained::yes, isTooLarge);
  if (message) _underWay[*message] = 0;
}

// Some brokers hang up on who sends what they do not take, and their answer is lost where more had
// come meanwhile: so events wait until the first messages are answered.
bool Publisher::hasRoom() const { return _isIntroduced && _underWay.size() < kMostUnderWay; }

void Publisher::sendBatch() {
  if (!std::exchange(_isSending, true) || _firstFresh) {
    _firstFresh.reset();
    _fresh = 0;
  }
  if (!_queue.settle()) {
    sayOnce(_queue.error());
    _isSending = false;
    _fresh = 1;  // and so again after a while
    return;
  }
  while (_isSending && hasRoom()) _isSending = sendNext();
  if (!_isSending) tellOfQueue();
}

// Some events more. False when none is left, or the link has ended.
bool Publisher::sendNext() {
  const auto events = _queue.next(_sentUpTo, kReadAtOnce);
  for (const QueuedEvent& event : events) {
    bool isTooLarge = false;
    const auto message =
        _link->send(topic(event.metric), numbered(event.line, _queue.stream(), event.number),
                    BrokerLink::Retained::no, isTooLarge);
    if (!message && !isTooLarge) return false;
    if (message) {
      _underWay[*message] = event.number;
    } else {
      _queue.leaveOut();
      if (!std::exchange(_hasSaidTooLarge, true)) {
        _say(broker() + "the broker takes no message so large as event " +
             std::to_string(event.number) + ", which is left out, as are others like it");
      }
      _arrived.push_back(event.number);
    }
    _sentUpTo = event.number;
  }
  if (!events.empty()) _lastTraffic = Clock::now();
  return !events.empty();
}

std::optional<Publisher::Clock::time_point> Publisher::nextTime(Clock::time_point now) const {
  std::optional<Clock::time_point> next;
  const auto at = [&next](Clock::time_point time) { next = next ? std::min(*next, time) : time; };
  const bool hasWork = _firstFresh || _fresh > 0;
  if (!_link) {
    if (hasWork) at(_retries.next());
    return next;
  }
  const bool isOpen = _link->state() == BrokerLink::State::open;
  if (!isOpen || isUnderWay()) at(_lastTraffic + kAnswerPatience);
  if (_isIntroduced && hasWork && !_isSending) at(_firstFresh.value_or(now) + _settings.every);
  if (_isSending && hasRoom()) at(now);
  const auto keepAlive = _link->keepAlive();
  if (keepAlive.count() > 0) at(std::max(_lastTraffic + keepAlive, now + 1s));
  return next;
}

void Publisher::wait(std::optional<Clock::time_point> until) {
  const short revents = waitForLink(_link.get(), _wakeUp, until);
  if (_link) turn(revents);
}

// As much as goes within the patience of whoever waits for the end.
void Publisher::leave() {
  if (_link->state() != BrokerLink::State::open) return;
  const auto last = Clock::now() + 2s;
  _isSending = _isSending || _fresh > 0 || _firstFresh;
  const auto goOn = [this, last] {
    return _link && _link->state() == BrokerLink::State::open && Clock::now() < last;
  };
  while (goOn() && (_isSending || isUnderWay())) {
    if (_isSending && hasRoom()) sendBatch();
    wait(_isSending && hasRoom() ? Clock::now() : last);
  }
  if (!goOn()) return;
  sendStatus("offline");
  while (goOn() && isUnderWay()) wait(last);
  if (_link) _link->sayGoodbye();
}

}  // namespace qel::fleet
