#include "feed/FeedBook.h"

#include <algorithm>
#include <array>
#include <string_view>
#include <utility>

#include "base/DispatchQueue.h"
#include "sources/diagnostics/port/PortName.h"
#include "tesk/bus/Reasons.h"

namespace qel {
namespace {

using tesk::bus::Condition;

struct ReachOfReason {
  std::string_view reason;
  Feed::Reach reach;
};

constexpr std::array kReaches = {
    ReachOfReason{tesk::bus::kNoPermission, Feed::Reach::noPermission},
    ReachOfReason{tesk::bus::kTooManyClients, Feed::Reach::tooManyClients},
    ReachOfReason{tesk::bus::kNoAnswer, Feed::Reach::noAnswer},
    ReachOfReason{tesk::bus::kBusy, Feed::Reach::busy},
    ReachOfReason{tesk::bus::kRefused, Feed::Reach::refused},
    ReachOfReason{tesk::bus::kNoBus, Feed::Reach::noBus},
};

// Words for the condition of a source that has no modem to read.
constexpr std::array<std::string_view, 9> kWithoutModem = {
    "absent", "no-bus",    "no-modem-manager", "no-port", "held",
    "failed", "no-rights", "silent",           "refused"};

// "drive.jsonl" of "/tmp/drive.jsonl,speed=2".
std::string fileIn(std::string_view text) {
  text = text.substr(0, text.find(','));
  return std::string(text.substr(text.rfind('/') + 1));
}

}  // namespace

Feed feedOf(const std::string& source) {
  constexpr std::string_view kRecording = "recording:";
  constexpr std::string_view kDiagnostics = "diag:";
  Feed feed;
  if (source.empty()) {
    feed.kind = Feed::Kind::service;
    feed.reach = Feed::Reach::unknown;
  } else if (source.starts_with("simulated")) {
    feed.kind = Feed::Kind::simulated;
  } else if (source.starts_with(kRecording)) {
    feed.kind = Feed::Kind::recording;
    feed.name = fileIn(std::string_view(source).substr(kRecording.size()));
  } else if (source.starts_with(kDiagnostics) &&
             !diagnostics::isPortName(source.substr(kDiagnostics.size()))) {
    feed.kind = Feed::Kind::rawLog;
    feed.name = fileIn(std::string_view(source).substr(kDiagnostics.size()));
  } else {
    feed.kind = Feed::Kind::modem;
  }
  return feed;
}

FeedBook::FeedBook(const std::string& source, std::string bus, const Clock& clock)
    : _bus(std::move(bus)), _clock(clock), _feed(feedOf(source)) {}

tesk::bus::ReachabilityObserver FeedBook::reachability() {
  return [weak = weak_from_this()](bool isReachable, const std::string& why) {
    MainQueue::shared().async([weak, isReachable, why] {
      if (const auto self = weak.lock()) self->changeReach(isReachable, why);
    });
  };
}

tesk::bus::ConditionObserver FeedBook::condition() {
  return [weak = weak_from_this()](const Condition& condition) {
    MainQueue::shared().async([weak, condition] {
      if (const auto self = weak.lock()) self->changeCondition(condition);
    });
  };
}

void FeedBook::noteDropped(std::uint64_t dropped) {
  if (dropped <= _feed.dropped) return;
  const std::uint64_t more = dropped - std::exchange(_feed.dropped, dropped);
  happen(HappeningKind::gap, std::to_string(more) + (more == 1 ? " report" : " reports") +
                                 " left out, which came faster than they could be taken");
  changed();
}

// A bus that knows how to start the service never says that there is none: on the system bus that
// means that it is not installed.
Feed::Reach FeedBook::reachOf(const std::string& why) const {
  const auto* found = std::ranges::find(kReaches, why, &ReachOfReason::reason);
  if (found != kReaches.end()) return found->reach;
  const bool isUnknownToTheBus = why == tesk::bus::kNotThere && !_wasThere && _bus == "system";
  return isUnknownToTheBus ? Feed::Reach::notInstalled : Feed::Reach::notRunning;
}

void FeedBook::changeReach(bool isReachable, const std::string& why) {
  const bool isThere = _feed.reach == Feed::Reach::there;
  if (isThere && !isReachable) {
    _feed.lostSinceMs = _clock.nowMs();
    happen(HappeningKind::service, "Service lost: " + why);
  }
  if (!isThere && isReachable) {
    _feed.lostSinceMs.reset();
    happen(HappeningKind::service, _wasThere ? "Service found again" : "Service found");
  }
  _wasThere = _wasThere || isReachable;
  _feed.reach = isReachable ? Feed::Reach::there : reachOf(why);
  changed();
}

void FeedBook::changeCondition(const Condition& condition) {
  _feed.condition = condition.line;
  _feed.state = condition.state;
  _feed.reason = condition.reason;
  _feed.hasEnded = condition.state == "ended";
  const bool hasNameOfItsOwn =
      _feed.kind == Feed::Kind::recording || _feed.kind == Feed::Kind::rawLog;
  if (!hasNameOfItsOwn) _feed.name = condition.model;
  const bool isWithout = std::ranges::find(kWithoutModem, condition.state) != kWithoutModem.end();
  const bool isKnown = !condition.state.empty();
  if (isKnown && isWithout != std::exchange(_feed.isWithoutModem, isWithout)) {
    happen(HappeningKind::modem, (isWithout ? "Modem lost: " : "Modem found: ") + condition.line);
  }
  changed();
}

void FeedBook::happen(HappeningKind kind, std::string text) {
  if (!_history) return;
  Happening happening;
  happening.timeMs = _clock.nowMs();
  happening.kind = kind;
  happening.text = std::move(text);
  _history->add(std::move(happening));
}

void FeedBook::changed() const {
  if (_observer) _observer();
}

}  // namespace qel
