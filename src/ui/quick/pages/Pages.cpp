#include "ui/quick/pages/Pages.h"

#include <algorithm>
#include <chrono>
#include <utility>

namespace qel {
namespace {

using namespace std::chrono_literals;

constexpr std::chrono::milliseconds kShortestInterval = 500ms;
constexpr std::chrono::milliseconds kShortestWhilePlaying = 100ms;
constexpr std::chrono::milliseconds kLongestWait = 24h;

constexpr QLatin1StringView kFirst{"first"};
constexpr QLatin1StringView kSignals{"signals"};
constexpr QLatin1StringView kHappenings{"happenings"};
constexpr QLatin1StringView kRecordings{"recordings"};

std::optional<std::uint64_t> earlier(std::optional<std::uint64_t> a,
                                     std::optional<std::uint64_t> b) {
  if (!a || !b) return a ? a : b;
  return std::min(*a, *b);
}

}  // namespace

Pages::Pages(QObject* parent) : QObject(parent), _playback(_validator, _history, nullptr) {
  _validator->setObserver(&_history);
  _soon.setSingleShot(true);
  connect(&_soon, &QTimer::timeout, this, &Pages::refresh);
  connect(&_later, &BootTimer::timeout, this, &Pages::refresh);
  _curves.setAsk([this] { refresh(); });
  _happenings.setAsk([this] { refresh(); });
  _sheet.setAsk([this] { refresh(); });
  connect(&_playback, &PlaybackModel::changed, this, &Pages::playbackChanged);
  connect(&_recorder, &RecorderModel::changed, this, &Pages::recorderChanged);
}

Pages::~Pages() {
  _playback.disconnect(this);
  _playback.close();
  _validator->setObserver(nullptr);
}

void Pages::setFeed(const Feed& feed) {
  if (std::exchange(_knowsFeed, true) && _feed == feed) return;
  const bool cameBack = _feed.reach != Feed::Reach::there && feed.reach == Feed::Reach::there;
  _feed = feed;
  if (cameBack && _recorder.control()) _recorder.control()->serviceCameBack();
  refresh();
}

void Pages::setInSight(const QString& screen) {
  const QString before = std::exchange(_inSight, screen);
  if (before == screen) return;
  _sheet.close();
  if (before == kRecordings) _recordings.leave();
  if (screen == kRecordings) _recordings.enter(_growing);
  refresh();
}

void Pages::setShown(bool shown) {
  if (std::exchange(_isShown, shown) == shown) return;
  _later.stop();
  refresh();
  emit shownChanged();
}

void Pages::look() {
  if (!_isShown) return;
  if (_seen != _playback.playback().viewpoint().history->version()) refreshSoon(kShortestInterval);
}

void Pages::tableDrawn() {
  if (!_sheet.isOpen()) return;
  _sheet.tableDrawn();
  refresh();
}

void Pages::refreshSoon(std::chrono::milliseconds interval) {
  if (_soon.isActive()) return;
  const auto since = _sinceRefresh.isValid() ? std::chrono::milliseconds(_sinceRefresh.elapsed())
                                             : kShortestInterval;
  _soon.start(std::max(0ms, interval - since));
}

void Pages::openRecording(const QString& name) {
  const std::string path = _recordings.pathOf(name);
  if (!path.empty()) _playback.open(path);
}

void Pages::playbackChanged() {
  const Playback& playback = _playback.playback();
  const auto moment = playback.isOpen() ? std::optional(playback.momentMs()) : std::nullopt;
  if (std::exchange(_moment, moment) != moment) refreshSoon(kShortestWhilePlaying);
}

void Pages::recorderChanged() {
  const RecordingControl* control = _recorder.control();
  const std::string growing = control ? control->fileName() : std::string();
  const bool isOther = std::exchange(_growing, growing) != growing;
  if (isOther && _inSight == kRecordings) _recordings.enter(_growing);
}

// While a recording is open it is what feeds the screens.
Feed Pages::feed() const {
  if (!_playback.isOpen()) return _feed;
  Feed feed;
  feed.kind = Feed::Kind::recording;
  feed.name = _playback.title().toStdString();
  return feed;
}

void Pages::refresh() {
  _soon.stop();
  if (!_isShown) return;
  _sinceRefresh.start();
  const Viewpoint view = _playback.playback().viewpoint();
  const Feed source = feed();
  _seen = view.history->version();
  Freshness fresh = qel::freshness(source, view);
  const auto changesAtMs = earlier(fresh.changesAtMs, refreshInSight(view, source));
  if (_knowsFeed) _freshness.take(std::move(fresh));
  const auto shownMoment = view.isLive ? std::nullopt : std::optional(view.nowMs);
  if (std::exchange(_shownMoment, shownMoment) != shownMoment) emit momentChanged();
  waitUntil(view.isLive ? changesAtMs : std::nullopt, view.nowMs);
}

std::optional<std::uint64_t> Pages::refreshInSight(const Viewpoint& view, const Feed& feed) {
  if (_inSight == kFirst) {
    NowPage page = nowPage(view, feed);
    const auto changesAtMs = page.changesAtMs;
    _now.take(std::move(page));
    return changesAtMs;
  }
  if (_inSight == kSignals) _curves.take(signalsPage(view, _curves.range()));
  if (_inSight == kHappenings) _happenings.take(happeningsPage(view, _happenings.filter()));
  return _sheet.refresh(view);
}

void Pages::waitUntil(std::optional<std::uint64_t> changesAtMs, std::uint64_t nowMs) {
  if (!changesAtMs) return _later.stop();
  const std::uint64_t left = *changesAtMs > nowMs ? *changesAtMs - nowMs : 0;
  const auto wait = std::chrono::milliseconds(std::min<std::uint64_t>(left, kLongestWait.count()));
  _later.start(std::max(wait, kShortestInterval));
}

}  // namespace qel
