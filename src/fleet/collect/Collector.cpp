#include "fleet/collect/Collector.h"

#include <poll.h>
#include <sys/ioctl.h>

#include <algorithm>
#include <limits>
#include <utility>

#include "fleet/LinkWait.h"
#include "fleet/collect/DatabaseAddress.h"

namespace qel::fleet {
namespace {

using namespace std::chrono_literals;

constexpr auto kAnswerPatience = 60s;  // of the broker, for a greeting
constexpr auto kKeepAlive = 60s;
constexpr auto kBetweenBrokenLines = 60s;
constexpr auto kEndPatience = 5s;
constexpr std::uint32_t kLargestPacket = 4 * 1024 * 1024;

// More than one batch, so that the broker goes on while one is stored.
std::uint16_t mostUnderWay(std::size_t batch) {
  return static_cast<std::uint16_t>(
      std::min<std::size_t>(2 * batch, std::numeric_limits<std::uint16_t>::max()));
}

bool hasInput(int descriptor) {
  int bytes = 0;
  return ::ioctl(descriptor, FIONREAD, &bytes) == 0 && bytes > 0;
}

}  // namespace

Collector::Collector(CollectSettings settings, Say say)
    : _settings(std::move(settings)),
      _say(std::move(say)),
      _batch(_settings.batch, _settings.every) {
  LinkSettings& link = _settings.link;
  link.client = "qelcollect-" + _settings.name;
  link.keepAlive = kKeepAlive;
  link.subscription = Subscription{
      "$share/" + _settings.group + "/qelwatch/+/+", mostUnderWay(_settings.batch), kLargestPacket,
      _settings.sessionAge, [this](std::string_view topic, std::string_view payload) {
        _batch.add(topic, payload, Clock::now());
      }};
}

std::optional<CollectEnd> Collector::run(const std::function<bool()>& isToEnd,
                                         const WakeUp& wakeUp) {
  _isToEnd = isToEnd;
  while (!isToEnd() && !_end) step(wakeUp);
  if (_link && _link->state() == BrokerLink::State::open) leave();
  endLink();
  return _end;
}

void Collector::step(const WakeUp& wakeUp) {
  const auto now = Clock::now();
  if (!_database && now >= _databaseRetries.next()) openDatabase();
  if (_database && !_link && now >= _linkRetries.next()) openLink();
  if (_batch.due() && now >= *_batch.due()) storeBatch();
  sayBroken();
  if (!_end) wait(nextTime(), wakeUp);
}

void Collector::sayOnce(const std::string& line) {
  if (std::exchange(_said, line) != line) _say(line);
}

void Collector::openDatabase() {
  DatabaseTrouble trouble;
  _database = FleetDatabase::open(_settings.database, {_settings.patience, _isToEnd}, trouble);
  if (!_database) {
    const bool isRefused = trouble.kind == DatabaseTrouble::Kind::away && !_hadDatabase &&
                           isDatabaseOpen(_settings.database);
    if (isRefused) trouble.kind = DatabaseTrouble::Kind::refused;
    loseDatabase(trouble);
    return;
  }
  if (!_said.empty()) sayOnce(_hadDatabase ? "database: back" : "database: there");
  _hadDatabase = true;
}

void Collector::loseDatabase(const DatabaseTrouble& trouble) {
  endLink();
  _database.reset();
  _databaseRetries.failed(Clock::now());
  const std::string line = "database: " + trouble.why;
  const bool mayComeBack =
      trouble.kind == DatabaseTrouble::Kind::away || trouble.kind == DatabaseTrouble::Kind::silent;
  if (!mayComeBack && !_settings.keepsTrying) {
    _end = CollectEnd{trouble.kind == DatabaseTrouble::Kind::layout, line};
  } else {
    sayOnce(line + "; messages wait at the broker");
  }
}

void Collector::openLink() {
  LinkFailure failure;
  _link = BrokerLink::open(
      _settings.link, [](int, const std::string&) {}, failure);
  _lastTraffic = Clock::now();
  if (!_link) loseLink(failure);
}

// What is not acknowledged comes again over the next link, if the broker still has it.
void Collector::endLink() {
  _link.reset();
  _batch.clear();
}

// What has come is stored: a broker that was killed has forgotten it. The failure is its own, for
// the link's goes with it.
void Collector::loseLink(LinkFailure failure) {
  if (!_batch.isEmpty()) keepBatch();
  endLink();
  _linkRetries.failed(Clock::now());
  if (failure.isRefusal && !_hadLink && !_settings.keepsTrying) {
    _end = CollectEnd{false, broker() + failure.why};
  } else {
    sayOnce(broker() + failure.why + "; trying again");
  }
}

void Collector::turn(short revents) {
  const auto before = _link->state();
  if (revents != 0) _lastTraffic = Clock::now();
  bool isReadable = (revents & (POLLIN | POLLERR | POLLHUP)) != 0;
  do {
    _link->turn(isReadable);
    isReadable = _link->state() != BrokerLink::State::ended && hasInput(_link->descriptor());
  } while (isReadable && !_batch.isFull() && !_link->wantsToWrite());
  const bool isOpen = _link->state() == BrokerLink::State::open;
  if (_link->state() == BrokerLink::State::ended) {
    loseLink(_link->failure());
  } else if (!isOpen && Clock::now() - _lastTraffic >= kAnswerPatience) {
    loseLink({"the broker does not answer"});
  } else if (isOpen && before != BrokerLink::State::open) {
    sayOnce(broker() + (std::exchange(_hadLink, true) ? "connected again" : "connected") + " as " +
            _settings.name + " of " + _settings.group);
  }
}

bool Collector::keepBatch() {
  DatabaseTrouble trouble;
  if (!_database->store(_batch.messages(), _counts.database, trouble)) {
    loseDatabase(trouble);
    return false;
  }
  _databaseRetries.succeeded();
  _counts.broken += _batch.broken();
  _batch.clear();
  return true;
}

void Collector::storeBatch() {
  if (!keepBatch()) return;
  _linkRetries.succeeded();
  _link->acknowledge();
  turn(0);
}

void Collector::sayBroken() {
  if (_counts.broken == _brokenSaid) return;
  const auto now = Clock::now();
  if (_nextBrokenLine && now < *_nextBrokenLine) return;
  _nextBrokenLine = now + kBetweenBrokenLines;
  const auto count = _counts.broken - std::exchange(_brokenSaid, _counts.broken);
  _say(broker() + std::to_string(count) +
       (count == 1 ? " message is none of a phone, " : " messages are none of a phone, the last ") +
       _batch.whyBroken());
}

std::optional<Collector::Clock::time_point> Collector::nextTime() const {
  if (!_database) return _databaseRetries.next();
  if (!_link) return _linkRetries.next();
  const auto now = Clock::now();
  auto next = now + kKeepAlive / 4;
  if (const auto due = _batch.due()) next = std::min(next, *due);
  if (_nextBrokenLine && _counts.broken > _brokenSaid) next = std::min(next, *_nextBrokenLine);
  return next;
}

void Collector::wait(std::optional<Clock::time_point> until, const WakeUp& wakeUp) {
  const short revents = waitForLink(_link.get(), wakeUp, until);
  if (_link) turn(revents);
}

// What has come is stored, and the broker hears of it; it keeps the session.
void Collector::leave() {
  if (!_batch.isEmpty()) storeBatch();
  const auto last = Clock::now() + kEndPatience;
  const WakeUp nobody;
  while (_link && _link->wantsToWrite() && Clock::now() < last) wait(last, nobody);
  if (!_link || !_batch.isEmpty()) return;  // what came meanwhile comes again
  _link->sayGoodbye();
  _link->turn(false);
}

}  // namespace qel::fleet
