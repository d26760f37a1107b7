#include "tools/watch/Watch.h"

#include <unistd.h>

#include <algorithm>
#include <utility>

#include "base/Clock.h"
#include "tools/watch/HomeView.h"
#include "tools/watch/RecordingsView.h"
#include "ui/kit/RunLoop.h"

namespace qel::watch {
namespace {

using namespace std::chrono_literals;

constexpr auto kBetweenFrames = 200ms;
constexpr auto kWhileBehind = 50ms;

std::vector<std::size_t> choosable(const Sheet& sheet) {
  std::vector<std::size_t> rows;
  for (std::size_t i = 0; i < sheet.rows.size(); ++i) {
    if (!sheet.rows[i].id.empty()) rows.push_back(i);
  }
  return rows;
}

}  // namespace

Watch::Watch(Terminal& terminal, TerminalSignals& signals, tools::MainLoop& loop, Desk& desk,
             History& history)
    : _terminal(terminal),
      _signals(signals),
      _loop(loop),
      _desk(desk),
      _history(history),
      _recorderKeys(desk.recorder),
      _wasThere(desk.feed.reach == Feed::Reach::there) {
  _views.push_back(std::make_unique<HomeView>(_desk, _screens));
  _desk.playback.setOnChanged([this] { _isTouched = true; });
  if (_desk.recorder) _desk.recorder->setOnChanged([this] { _isTouched = true; });
  _loop.watchInput(STDIN_FILENO);
  _loop.watchInput(_signals.descriptor());
}

void Watch::run() {
  do {
    takeSignals();
    takeKeys();
    runTimers();
    drawWhenDue();
  } while (!_isLeft && !_terminal.isClosed() && !_signals.isHungUp() && _loop.runOnce(nextTurn()));
  _desk.playback.setOnChanged({});
  if (_desk.recorder) _desk.recorder->setOnChanged({});
  while (_views.size() > 1) _views.pop_back();  // the stack of screens is taken down from its top
}

// A recording goes on at a service that came back.
void Watch::feedChanged() {
  _isTouched = true;
  const bool isThere = _desk.feed.reach == Feed::Reach::there;
  const bool wasThere = std::exchange(_wasThere, isThere);
  if (isThere && !wasThere && _desk.recorder) _desk.recorder->serviceCameBack();
}

void Watch::takeSignals() {
  _signals.clear();
  if (_signals.takeStop()) {
    _terminal.stopAndGoOn();
    _signals.listenAgain();
    _isTouched = true;
  }
  if (_signals.takeResize()) {
    _terminal.measure();
    _isTouched = true;
    _drawnAt = {};
  }
}

void Watch::takeKeys() {
  while (const auto press = _terminal.pressed()) {
    take(*press);
    _isTouched = true;
    _drawnAt = {};  // what a key does is seen at once
  }
}

void Watch::take(const KeyPress& press) {
  if (_recorderKeys.take(press) || _views.back()->take(press)) return;
  if (takeForPlayback(press, _desk.playback)) return;
  if (!takeEverywhere(press)) moveTo(press);
}

bool Watch::takeEverywhere(const KeyPress& press) {
  switch (press.key) {
    case Key::escape:
      back();
      return true;
    case Key::enter:
      if (!_views.back()->chosen.empty()) open(_views.back()->open(_views.back()->chosen));
      return true;
    case Key::character:
      _isLeft = press.character == 'q';
      if (auto view = viewOfLetter(press.character, _desk)) {
        while (_views.size() > 1) _views.pop_back();
        open(std::move(view));
      }
      return true;
    default:
      return false;
  }
}

// To another row, or, on a page without any to choose, on by lines.
void Watch::moveTo(const KeyPress& press) {
  View& view = *_views.back();
  const std::size_t page = std::max<std::size_t>(1, _terminal.visibleRows(_sheet));
  const auto rows = choosable(_sheet);
  const bool isByRow = !rows.empty();
  const std::size_t count = isByRow ? rows.size() : _sheet.rows.size();
  if (count == 0) return;
  std::size_t place = std::min(view.top, count - 1);
  if (isByRow) {
    const auto at = std::ranges::find_if(
        rows, [&](std::size_t row) { return _sheet.rows[row].id == view.chosen; });
    place = at == rows.end() ? 0 : static_cast<std::size_t>(at - rows.begin());
  }
  const std::size_t last = isByRow ? count - 1 : count - std::min(count, page);
  switch (press.key) {
    case Key::up:
      place -= std::min<std::size_t>(place, 1);
      break;
    case Key::down:
      ++place;
      break;
    case Key::pageUp:
      place -= std::min(place, page);
      break;
    case Key::pageDown:
      place += page;
      break;
    case Key::home:
      place = 0;
      break;
    case Key::end:
      place = last;
      break;
    default:
      return;
  }
  place = std::min(place, last);
  if (isByRow) {
    view.chosen = _sheet.rows[rows[place]].id;
    if (place == 0) view.top = 0;
  } else {
    view.top = place;
  }
}

void Watch::open(std::unique_ptr<View> view) {
  if (view) _views.push_back(std::move(view));
}

void Watch::back() {
  if (_views.size() > 1) _views.pop_back();
}

void Watch::runTimers() {
  RunLoop::main().fireDue(Clock::now());
  _recorderKeys.runTimer(Clock::now());
  const auto tick = _desk.playback.untilNextTick();
  if (tick && *tick <= 0ms) _desk.playback.tick();
}

bool Watch::isChanged() {
  const bool isDue = _changesAtMs && systemClock().nowMs() >= *_changesAtMs;
  return _isTouched || isDue || _history.version() != _drawnVersion ||
         _views.back()->needsDrawing();
}

void Watch::drawWhenDue() {
  const auto now = Clock::now();
  if (!isChanged() || now - _drawnAt < kBetweenFrames || _terminal.isBehind()) return;
  _isTouched = false;
  _drawnAt = now;
  _drawnVersion = _history.version();
  Sheet sheet = _views.back()->sheet(_terminal.size());
  for (Row& row : playbackFoot(_desk.playback)) sheet.foot.push_back(std::move(row));
  for (Row& row : _recorderKeys.foot(_terminal.size())) sheet.foot.push_back(std::move(row));
  _changesAtMs = _views.back()->changesAtMs();
  _sheet = std::move(sheet);
  _terminal.draw(_sheet, lookAt(_sheet));
}

// The chosen row, or the first one where it is gone, and the rows around it.
Look Watch::lookAt(const Sheet& sheet) {
  View& view = *_views.back();
  const std::size_t visible = _terminal.visibleRows(sheet);
  const auto rows = choosable(sheet);
  Look look;
  if (!rows.empty()) {
    const auto found = std::ranges::find_if(
        rows, [&](std::size_t row) { return sheet.rows[row].id == view.chosen; });
    look.chosen = found == rows.end() ? rows.front() : *found;
    view.chosen = sheet.rows[*look.chosen].id;
    if (*look.chosen < view.top) view.top = *look.chosen;
    if (visible > 0 && *look.chosen >= view.top + visible) view.top = *look.chosen + 1 - visible;
  }
  const std::size_t most = sheet.rows.size() - std::min(sheet.rows.size(), visible);
  view.top = std::min(view.top, most);
  look.top = view.top;
  return look;
}

std::optional<Watch::Clock::time_point> Watch::nextTurn() {
  const auto now = Clock::now();
  auto next = RunLoop::main().nextDue();
  const auto sooner = [&next](Clock::time_point at) { next = next ? std::min(*next, at) : at; };
  if (isChanged()) sooner(std::max(_drawnAt + kBetweenFrames, now));
  if (_terminal.isBehind()) sooner(now + kWhileBehind);
  if (const auto tick = _desk.playback.untilNextTick()) sooner(now + *tick);
  if (const auto turn = _recorderKeys.nextTurn()) sooner(*turn);
  if (_changesAtMs) {
    const std::uint64_t nowMs = systemClock().nowMs();
    sooner(now + std::chrono::milliseconds(*_changesAtMs - std::min(*_changesAtMs, nowMs)));
  }
  return next;
}

}  // namespace qel::watch
