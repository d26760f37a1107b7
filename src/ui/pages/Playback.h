// An opened recording on the screens, in place of the live values: its moment, and how it moves.
#pragma once

#include <array>
#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/Clock.h"
#include "history/Viewpoint.h"
#include "history/recorded/RecordedHistory.h"
#include "metrics/MetricValidator.h"

namespace qel {

// What the face of it shows, all words ready.
struct PlaybackView {
  enum class State : std::uint8_t { live, opening, open };
  State state = State::live;
  std::string title;         // the file's name
  std::string progressText;  // while it is opened: "Opening drive.jsonl.gz: 42 %"
  float progress = 0;        // 0 to 1, while it is opened
  float position = 0;        // 0 to 1, of its length
  std::string positionText;  // "0:12:34 of 1:02:03"
  std::string momentText;    // the time of day there, as in the tables
  bool isPlaying = false;
  int speed = 1;
  std::string speedText;           // "10x"
  bool hasNext = false;            // happening behind the moment
  bool hasPrevious = false;        // and before it
  std::vector<std::string> notes;  // about the file, a sentence each
  std::string error;               // why the last one was not opened; empty: it was
};

// Main thread only. While a recording is open, the store of the shown dispatcher holds the moment's
// values, so that every table shows it without knowing; live events go to another dispatcher, and
// are shown again by close() as if nothing had been.
class Playback {
 public:
  using TimePoint = std::chrono::steady_clock::time_point;
  using Now = std::function<TimePoint()>;

  static constexpr std::array kSpeeds = {1, 2, 5, 10, 30, 60};

  // The dispatcher whose store is shown, and the history that listens to it; both outlive this. The
  // clock is the live history's.
  Playback(std::shared_ptr<MetricValidator> shown, History& live,
           const Clock& clock = systemClock(), Now now = std::chrono::steady_clock::now);
  ~Playback();
  Playback(const Playback&) = delete;
  Playback& operator=(const Playback&) = delete;

  // Called after every change of the view.
  void setOnChanged(std::function<void()> onChanged) { _onChanged = std::move(onChanged); }

  // Begins to open the file; tick() goes on with it. What was open before is shown until it is
  // opened, and stays where that fails.
  void open(const std::string& path);
  void giveUpOpening();
  // Back to the live values.
  void close();

  void play();
  void pause();
  void setSpeed(int speed);  // the nearest of kSpeeds
  void jumpTo(std::uint64_t timeMs);
  void jumpToShare(float share);  // 0 to 1 of its length
  void step(std::chrono::milliseconds by);
  void toNextHappening();
  void toPreviousHappening();

  // How long it is, from now, until tick() is to be called; nothing: there is nothing to do until
  // somebody does something.
  std::optional<std::chrono::milliseconds> untilNextTick() const;
  // Opens on for some milliseconds, or moves as far as the time that went by takes it.
  void tick();

  const PlaybackView& view() const { return _view; }
  bool isOpen() const { return _recorded != nullptr; }
  std::uint64_t momentMs() const { return _momentMs; }
  // What pages show: of the moment, or live.
  Viewpoint viewpoint() const;

 private:
  void openOn();
  void show();
  void moveTo(std::uint64_t timeMs);
  void playOn();
  void park();
  void unpark();
  void describe();
  void changed();

  const std::shared_ptr<MetricValidator> _shown;
  History& _live;
  const Clock& _clock;
  const Now _now;
  std::function<void()> _onChanged;
  std::unique_ptr<RecordedHistory> _opening;
  std::string _openingName;
  std::unique_ptr<RecordedHistory> _recorded;
  std::string _name;
  std::shared_ptr<MetricValidator> _parked;  // takes live events while a recording is open
  std::uint64_t _momentMs = 0;
  TimePoint _movedAt;
  PlaybackView _view;
};

}  // namespace qel
