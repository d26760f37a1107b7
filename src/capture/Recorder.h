// Live events into a recording.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>

#include "base/Clock.h"
#include "base/TimeAsleep.h"
#include "recording/RotatingRecording.h"
#include "recording/privacy/IdentityHider.h"
#include "tesk/Message.h"

namespace qel::capture {

// An event of the stream of that name as a recording holds it. Nothing for other streams, which are
// no part of one.
std::optional<RecordedEvent> recordedEvent(std::string_view eventName, const tesk::Message& event,
                                           std::uint64_t timeMs);

// Any thread. Each event is written before take() returns: a disk that is slow holds the event
// stream up, and the service counts what is lost by it. Where the device slept for five seconds or
// more the recording says so.
class Recorder {
 public:
  struct Progress {
    std::uint64_t events = 0;
    std::uint64_t bytes = 0;
    std::uint64_t filesFinished = 0;
    std::uint64_t marks = 0;
    std::uint64_t unrecordable = 0;  // events without a form in a recording, or undecodable
    std::uint64_t stripped = 0;      // events recorded without a value of unknown meaning
  };

  // How long the device has slept so far.
  using Asleep = std::function<std::chrono::milliseconds()>;

  // Without a hider identities are kept.
  Recorder(std::unique_ptr<RotatingRecording> recording, std::unique_ptr<IdentityHider> hider,
           const Clock& clock = systemClock(), Asleep asleep = timeAsleep);

  // An event of the stream of that name, received now. Other streams are no part of a recording.
  void take(std::string_view eventName, const tesk::Message& event);
  // Sets a mark now. False when it could not be written: see error().
  bool mark();
  // To be called every second or so. False when nothing more can be recorded: see error().
  bool tend();
  // Ends the recording. False when it is not whole.
  bool close();

  Progress progress() const;
  std::string error() const;
  int errorNumber() const;

 private:
  bool isRecordable(RecordedEvent& event);
  // Before anything else that comes after a sleep.
  void noteSleep();
  // With the sleep that was noted: recordings are so old and so long by it.
  RotatingRecording::TimePoint now() const;

  mutable std::mutex _mutex;
  const std::unique_ptr<RotatingRecording> _recording;
  const std::unique_ptr<IdentityHider> _hider;
  const Clock& _clock;
  const Asleep _asleep;
  std::chrono::milliseconds _slept;  // as last looked at
  std::uint64_t _shapeless = 0;
  std::uint64_t _marks = 0;
};

}  // namespace qel::capture
