#include "history/recorded/RecordedHistory.h"

#include <algorithm>
#include <limits>
#include <utility>

#include "base/TimeZone.h"
#include "history/ToldHappening.h"
#include "history/recorded/OpenedRecording.h"
#include "history/recorded/QuietDispatcher.h"

namespace qel {
namespace {

constexpr std::size_t kAll = std::numeric_limits<std::size_t>::max();

// A clock that moves by more than this was set, or was wrong.
constexpr std::uint64_t kFarMs = 60'000;

// Everything stays: it is bounded by what is read at all.
History::Limits limitsOfHistory() {
  History::Limits limits;
  limits.series.recentMs = std::numeric_limits<std::uint64_t>::max();
  limits.series.mostRecent = kAll;
  limits.journal = {.ageMs = 0, .bytes = kAll};
  limits.mostHappenings = kAll;
  limits.mostNeighbourReports = kAll;
  return limits;
}

// A store, and when the next event may be that is not in it.
struct Checkpoint {
  std::uint64_t fromMs = 0;
  MetricStore store;
};

std::string counted(std::uint64_t count, const std::string& one, const std::string& many) {
  return count == 1 ? "1 " + one : std::to_string(count) + " " + many;
}

}  // namespace

struct RecordedHistory::State {
  State(std::unique_ptr<RecordingReader> opened, const Limits& given)
      : reader(std::move(opened)), limits(given), history(limitsOfHistory()), writer(&history) {}

  bool readOne();
  void arrive(RecordedEvent event);
  void takeHeld(const RecordedEvent* next);
  std::uint64_t placeOf(std::uint64_t timeMs);
  void take(const RecordedEvent& event, std::uint64_t timeMs);
  void keepCheckpoint();

  const std::unique_ptr<RecordingReader> reader;
  Limits limits;
  History history;
  QuietDispatcher writer;  // tells the history
  QuietDispatcher player;  // holds the store of the moment asked for last
  std::uint64_t playedToMs = 0;
  std::vector<Checkpoint> checkpoints = std::vector<Checkpoint>(1);
  std::size_t eventsSince = 0;  // the last checkpoint
  std::uint64_t beginMs = 0;
  std::uint64_t endMs = 0;
  std::uint64_t events = 0;
  std::uint64_t undecodable = 0;
  std::optional<RecordedEvent> held;  // far ahead of those before: what is the next one's time?
  std::uint64_t shiftMs = 0;          // since the clock was set back
  std::uint64_t timesBack = 0;
  std::uint64_t timesSetBack = 0;
  std::uint64_t timesAhead = 0;
  bool isTooLarge = false;
  bool hasEnded = false;
};

std::unique_ptr<RecordedHistory> RecordedHistory::open(const std::string& path,
                                                       RecordingFault& fault) {
  return open(path, fault, Limits());
}

std::unique_ptr<RecordedHistory> RecordedHistory::open(const std::string& path,
                                                       RecordingFault& fault,
                                                       const Limits& limits) {
  auto reader = openedRecording(path, fault);
  if (!reader) return nullptr;
  return std::unique_ptr<RecordedHistory>(
      new RecordedHistory(std::make_unique<State>(std::move(reader), limits)));
}

RecordedHistory::RecordedHistory(std::unique_ptr<State> state) : _state(std::move(state)) {}
RecordedHistory::~RecordedHistory() = default;

// Where there are too many, every second one goes, and those to come are twice as far apart.
void RecordedHistory::State::keepCheckpoint() {
  eventsSince = 0;
  checkpoints.push_back({endMs + 1, writer.store()});
  if (checkpoints.size() <= std::max<std::size_t>(limits.checkpoints, 2)) return;
  std::size_t kept = 0;
  for (std::size_t i = 0; i < checkpoints.size(); i += 2) {
    if (i != kept) checkpoints[kept] = std::move(checkpoints[i]);
    ++kept;
  }
  checkpoints.resize(kept);
  limits.eventsBetween *= 2;
}

// Where the clock went back a little, time stands; where it was set back, what comes then follows
// what came before, until the clock is as far again.
std::uint64_t RecordedHistory::State::placeOf(std::uint64_t timeMs) {
  if (timeMs >= endMs) shiftMs = 0;
  if (timeMs + shiftMs + kFarMs < endMs) {
    shiftMs = endMs - timeMs;
    ++timesSetBack;
  } else if (timeMs + shiftMs < endMs) {
    ++timesBack;
  }
  return std::clamp(timeMs + shiftMs, endMs, kLastRecordedMs);
}

// An event that was far ahead, and after which time goes on as before it, stands among the others.
void RecordedHistory::State::takeHeld(const RecordedEvent* next) {
  if (!held) return;
  const RecordedEvent event = std::move(*held);
  held.reset();
  const bool isAlone = next && next->timeMs + kFarMs < event.timeMs;
  if (isAlone) ++timesAhead;
  take(event, isAlone ? endMs : placeOf(event.timeMs));
}

void RecordedHistory::State::arrive(RecordedEvent event) {
  takeHeld(&event);
  if (events > 0 && event.timeMs > endMs + kFarMs) {
    held = std::move(event);
  } else {
    take(event, placeOf(event.timeMs));
  }
}

void RecordedHistory::State::take(const RecordedEvent& event, std::uint64_t timeMs) {
  if (events == 0) beginMs = timeMs;
  // Between two milliseconds, so that a moment has all its events or none.
  if (eventsSince >= limits.eventsBetween && timeMs > endMs) keepCheckpoint();
  endMs = timeMs;
  ++events;
  ++eventsSince;
  if (event.kind == RecordedKind::metric) {
    writer.take(event.entries, timeMs);
  } else if (auto told = happeningToldBy(event)) {
    told->timeMs = timeMs;
    history.add(std::move(*told));
  }
}

bool RecordedHistory::State::readOne() {
  auto event = reader->next();
  if (!event) {
    takeHeld(nullptr);
    return false;
  }
  if (event->kind == RecordedKind::metric && !QuietDispatcher::isReadable(event->entries)) {
    ++undecodable;
    return true;
  }
  // Marks and link failures are no reports that the journal holds.
  if (history.journal().bytes() >= limits.bytes ||
      history.happenings().size() >= limits.happenings) {
    isTooLarge = true;
    return false;
  }
  arrive(std::move(*event));
  return true;
}

bool RecordedHistory::readOn(std::size_t events) {
  State& state = *_state;
  for (; events > 0 && !state.hasEnded; --events) state.hasEnded = !state.readOne();
  return !state.hasEnded;
}

float RecordedHistory::progress() const {
  return _state->hasEnded ? 1.0F : _state->reader->share();
}

std::uint64_t RecordedHistory::beginMs() const { return _state->beginMs; }
std::uint64_t RecordedHistory::endMs() const { return _state->endMs; }
std::uint64_t RecordedHistory::events() const { return _state->events; }

std::vector<std::string> RecordedHistory::notes() const {
  const State& state = *_state;
  std::vector<std::string> notes;
  if (state.isTooLarge) {
    notes.push_back("Too large to be opened whole: it is shown up to " +
                    dateText(static_cast<double>(state.endMs), systemTimeZone()));
  }
  if (state.reader->fault())
    notes.push_back("It cannot be read on: " + state.reader->fault()->message);
  if (state.reader->cutOff()) notes.emplace_back("It was cut off at its end");
  if (const auto lines = state.reader->skippedLines()) {
    notes.push_back(
        counted(lines, "line is no event and is left out", "lines are no events and are left out"));
  }
  if (state.undecodable > 0) {
    notes.push_back(counted(state.undecodable, "report cannot be decoded and is left out",
                            "reports cannot be decoded and are left out"));
  }
  if (state.timesBack > 0) {
    notes.push_back("Its clock went back " + counted(state.timesBack, "time", "times") +
                    ": what came then stands at the time before");
  }
  if (state.timesSetBack > 0) {
    notes.push_back("Its clock was set back " + counted(state.timesSetBack, "time", "times") +
                    ": what came then is shown as if it had gone on");
  }
  if (state.timesAhead > 0) {
    notes.push_back("Its clock was ahead at " + counted(state.timesAhead, "event", "events") +
                    ", shown at the time before");
  }
  return notes;
}

const History& RecordedHistory::history() const { return _state->history; }

const MetricStore& RecordedHistory::storeAt(std::uint64_t timeMs) {
  State& state = *_state;
  timeMs = std::min(timeMs, kLastRecordedMs);
  const auto after = std::ranges::upper_bound(state.checkpoints, timeMs, {}, &Checkpoint::fromMs);
  const Checkpoint& before = *(after == state.checkpoints.begin() ? after : after - 1);
  if (timeMs + 1 < state.playedToMs || before.fromMs > state.playedToMs) {
    state.player.setStore(before.store);
    state.playedToMs = before.fromMs;
  }
  state.history.journal().visit(state.playedToMs, timeMs, [&state](const JournalEntry& entry) {
    const Dictionary event = {
        {kRecordedMetricKey, entry.row->identifier},
        {kRecordedPayloadKey, Bytes(entry.payload.begin(), entry.payload.end())}};
    state.player.take(event, entry.receivedMs);
  });
  state.playedToMs = timeMs + 1;
  return state.player.store();
}

Viewpoint RecordedHistory::viewpointAt(std::uint64_t timeMs) {
  Viewpoint viewpoint;
  viewpoint.history = &_state->history;
  viewpoint.store = &storeAt(timeMs);
  viewpoint.nowMs = timeMs;
  viewpoint.isLive = false;
  return viewpoint;
}

std::optional<std::uint64_t> RecordedHistory::nextHappening(std::uint64_t timeMs) const {
  const History& history = _state->history;
  const std::size_t next = history.happeningsUntil(timeMs);
  if (next >= history.happenings().size()) return std::nullopt;
  return history.happenings()[next].timeMs;
}

std::optional<std::uint64_t> RecordedHistory::previousHappening(std::uint64_t timeMs) const {
  const History& history = _state->history;
  const std::size_t before = timeMs == 0 ? 0 : history.happeningsUntil(timeMs - 1);
  if (before == 0) return std::nullopt;
  return history.happenings()[before - 1].timeMs;
}

}  // namespace qel
