#include "ui/pages/Playback.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "base/Amounts.h"
#include "base/TimeZone.h"
#include "connection/TeskWrapper.h"

namespace qel {
namespace {

using namespace std::chrono_literals;

constexpr auto kPieceOfOpening = 8ms;  // between two of them a window draws
constexpr std::size_t kEventsAtOnce = 256;
constexpr auto kPauseOfPlaying = 100ms;

std::string nameOf(const std::string& path) { return path.substr(path.rfind('/') + 1); }

std::string lengthText(std::uint64_t milliseconds) {
  return durationText(std::chrono::seconds(milliseconds / 1000));
}

std::string percentText(float share) {
  return std::to_string(static_cast<int>(std::floor(100 * share))) + " %";
}

}  // namespace

Playback::Playback(std::shared_ptr<MetricValidator> shown, History& live, const Clock& clock,
                   Now now)
    : _shown(std::move(shown)), _live(live), _clock(clock), _now(std::move(now)) {}

Playback::~Playback() {
  _onChanged = nullptr;
  close();
}

void Playback::changed() {
  describe();
  if (_onChanged) _onChanged();
}

void Playback::open(const std::string& path) {
  RecordingFault fault;
  _opening = RecordedHistory::open(path, fault);
  _openingName = nameOf(path);
  _view.error = _opening ? "" : fault.message;
  changed();
}

void Playback::giveUpOpening() {
  _opening.reset();
  changed();
}

void Playback::openOn() {
  const TimePoint end = _now() + kPieceOfOpening;
  bool isWhole = false;
  do {
    isWhole = !_opening->readOn(kEventsAtOnce);
  } while (!isWhole && _now() < end);
  if (!isWhole) return;
  if (_opening->events() == 0) {
    const auto notes = _opening->notes();
    _view.error = _openingName + ": no event in it" + (notes.empty() ? "" : ". " + notes.front());
    _opening.reset();
    return;
  }
  park();
  _recorded = std::move(_opening);
  _name = _openingName;
  _view.isPlaying = false;
  _momentMs = _recorded->beginMs();
  show();
}

// Live events go on, to a dispatcher of which nothing is shown.
void Playback::park() {
  if (_parked) return;
  _parked = MetricValidator::create(nullptr);
  static_cast<MetricStore&>(*_parked) = *_shown;
  _shown->setObserver(nullptr);
  _parked->setObserver(&_live, _clock);
  if (_shown->mySharedTeskInstance) _shown->mySharedTeskInstance->setDelegate(_parked);
}

void Playback::unpark() {
  if (!_parked) return;
  static_cast<MetricStore&>(*_shown) = *_parked;
  if (_shown->mySharedTeskInstance) _shown->mySharedTeskInstance->setDelegate(_shown);
  _shown->setObserver(&_live, _clock);
  _parked.reset();
}

void Playback::close() {
  _opening.reset();
  _recorded.reset();
  _view.isPlaying = false;
  unpark();
  changed();
}

void Playback::show() { static_cast<MetricStore&>(*_shown) = _recorded->storeAt(_momentMs); }

void Playback::moveTo(std::uint64_t timeMs) {
  _momentMs = std::clamp(timeMs, _recorded->beginMs(), _recorded->endMs());
  _movedAt = _now();
  show();
}

void Playback::jumpTo(std::uint64_t timeMs) {
  if (!_recorded) return;
  moveTo(timeMs);
  changed();
}

void Playback::jumpToShare(float share) {
  if (!_recorded) return;
  const auto length = static_cast<double>(_recorded->endMs() - _recorded->beginMs());
  const double part = std::clamp(static_cast<double>(share), 0.0, 1.0) * length;
  jumpTo(_recorded->beginMs() + static_cast<std::uint64_t>(part));
}

void Playback::step(std::chrono::milliseconds by) {
  const auto back = static_cast<std::uint64_t>(-std::min<std::int64_t>(by.count(), 0));
  const auto forth = static_cast<std::uint64_t>(std::max<std::int64_t>(by.count(), 0));
  jumpTo(std::max(_momentMs, back) - back + forth);
}

void Playback::toNextHappening() {
  const auto next = _recorded ? _recorded->nextHappening(_momentMs) : std::nullopt;
  if (next) jumpTo(*next);
}

void Playback::toPreviousHappening() {
  const auto previous = _recorded ? _recorded->previousHappening(_momentMs) : std::nullopt;
  if (previous) jumpTo(*previous);
}

void Playback::play() {
  if (!_recorded || _view.isPlaying) return;
  if (_momentMs >= _recorded->endMs()) moveTo(_recorded->beginMs());
  _view.isPlaying = true;
  _movedAt = _now();
  changed();
}

void Playback::pause() {
  if (!_view.isPlaying) return;
  playOn();
  _view.isPlaying = false;
  changed();
}

void Playback::setSpeed(int speed) {
  if (_view.isPlaying) playOn();
  _view.speed =
      *std::ranges::min_element(kSpeeds, {}, [speed](int each) { return std::abs(each - speed); });
  changed();
}

// As far as the time takes it that went by. What is less than a millisecond of the recording's is
// left for the next time.
void Playback::playOn() {
  using Milliseconds = std::chrono::duration<std::int64_t, std::milli>;
  const TimePoint now = _now();
  const auto passed = std::chrono::duration_cast<Milliseconds>((now - _movedAt) * _view.speed);
  if (passed.count() <= 0) return;
  const TimePoint movedAt = _movedAt + TimePoint::duration(passed) / _view.speed;
  moveTo(_momentMs + static_cast<std::uint64_t>(passed.count()));
  _movedAt = movedAt;
  if (_momentMs >= _recorded->endMs()) _view.isPlaying = false;
}

std::optional<std::chrono::milliseconds> Playback::untilNextTick() const {
  if (_opening) return 0ms;
  if (!_view.isPlaying) return std::nullopt;
  return std::max(
      0ms, std::chrono::ceil<std::chrono::milliseconds>(_movedAt + kPauseOfPlaying - _now()));
}

void Playback::tick() {
  if (!_opening && !_view.isPlaying) return;
  if (_view.isPlaying) playOn();
  if (_opening) openOn();
  changed();
}

Viewpoint Playback::viewpoint() const {
  if (_recorded) return {&_recorded->history(), _shown.get(), _momentMs, false};
  return {&_live, _shown.get(), _clock.nowMs(), true};
}

void Playback::describe() {
  using State = PlaybackView::State;
  _view.state = _opening ? State::opening : _recorded ? State::open : State::live;
  _view.progress = _opening ? _opening->progress() : 0;
  _view.progressText =
      _opening ? "Opening " + _openingName + ": " + percentText(_view.progress) : "";
  if (!_recorded) {
    const PlaybackView none;
    _view.title = none.title;
    _view.position = none.position;
    _view.positionText = none.positionText;
    _view.momentText = none.momentText;
    _view.hasNext = _view.hasPrevious = false;
    _view.notes.clear();
  } else {
    const std::uint64_t length = _recorded->endMs() - _recorded->beginMs();
    const std::uint64_t passed = _momentMs - _recorded->beginMs();
    _view.title = _name;
    _view.position = length == 0 ? 0 : static_cast<float>(passed) / static_cast<float>(length);
    _view.positionText = lengthText(passed) + " of " + lengthText(length);
    _view.momentText = dateText(static_cast<double>(_momentMs), systemTimeZone());
    _view.hasNext = _recorded->nextHappening(_momentMs).has_value();
    _view.hasPrevious = _recorded->previousHappening(_momentMs).has_value();
    _view.notes = _recorded->notes();
  }
  _view.speedText = std::to_string(_view.speed) + "x";
}

}  // namespace qel
