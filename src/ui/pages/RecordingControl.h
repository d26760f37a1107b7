// Recording from the viewer: begin, mark, stop.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "base/Bytes.h"
#include "base/Clock.h"
#include "base/TimeAsleep.h"
#include "capture/RecordConnection.h"
#include "capture/Recorder.h"
#include "recording/RecordingsFolder.h"

namespace qel {

// What the face of it shows, all words ready.
struct RecordingControlView {
  bool isRecording = false;
  std::string text;        // "0:12:34, 1234 events, 56.7 kB"; empty when nothing is recorded
  std::string hiddenText;  // what is hidden and what is not, for whoever is about to begin
  std::string markText;    // "Mark 2", once one is set
  std::string outcome;     // of the last one: kept as which file, or why it ended
};

// Main thread only. Records over a connection of its own, so that nothing is missing that the
// screens leave out. Identities are always hidden. What is called while the service is waited for,
// which may let the window live on, is ignored; a stop is done afterwards. `now` goes on while the
// device sleeps, `asleep` tells how long it has slept.
class RecordingControl {
 public:
  using TimePoint = std::chrono::steady_clock::time_point;
  using Now = std::function<TimePoint()>;

  // What it takes to record: how the service is reached, and what to ask it for.
  struct Way {
    std::shared_ptr<tesk::Connector> connector;
    std::optional<std::string> bus;  // nothing: the service is within this process
    Bytes configuration;
  };

  RecordingControl(RecordingsFolder folder, Way way, const Clock& clock = systemClock(),
                   Now now = sleeplessNow, capture::Recorder::Asleep asleep = timeAsleep);
  ~RecordingControl();

  // Called after every change of the view.
  void setOnChanged(std::function<void()> onChanged) { _onChanged = std::move(onChanged); }

  void start();
  void mark();
  void stop();
  // The service came back: what was asked of it is asked anew. Where it refuses, this ends.
  void serviceCameBack();

  // When tick() is to be called next; nothing: not at all.
  std::optional<std::chrono::milliseconds> untilNextTick() const;
  void tick();

  const RecordingControlView& view() const { return _view; }
  // The file being recorded; empty: none.
  const std::string& fileName() const { return _fileName; }

 private:
  class Talk;
  bool begin();
  bool connect();
  void finish(const std::string& why);
  void describe();
  void changed();

  RecordingsFolder _folder;
  const Way _way;
  const Clock& _clock;
  const Now _now;
  const capture::Recorder::Asleep _asleep;
  std::function<void()> _onChanged;
  std::string _fileName;
  TimePoint _begun;
  std::uint64_t _room = 0;  // bytes that it may have
  bool _isTalking = false;  // to the service
  bool _isToStop = false;   // once it does no more
  std::unique_ptr<capture::Recorder> _recorder;
  std::unique_ptr<capture::RecordConnection> _connection;
  RecordingControlView _view;
};

}  // namespace qel
