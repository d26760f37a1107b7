// A recording opened whole: what happened in it, and the store as it was at any of its moments.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "history/History.h"
#include "history/Viewpoint.h"
#include "recording/RecordingReader.h"

namespace qel {

// Main thread only. Read in pieces, so that a window stays alive meanwhile, and given up by
// destroying it. Bad lines and payloads that cannot be decoded are left out and counted. Nothing is
// logged.
class RecordedHistory {
 public:
  struct Limits {
    std::size_t bytes = 128 * 1024 * 1024;  // of events in memory; what follows is not opened
    std::size_t happenings = 200'000;       // the same
    std::size_t checkpoints = 512;          // copies of the store; beyond them every second goes
    std::size_t eventsBetween = 1024;       // two checkpoints, at first
  };

  // Nothing when the file cannot be opened.
  static std::unique_ptr<RecordedHistory> open(const std::string& path, RecordingFault& fault);
  static std::unique_ptr<RecordedHistory> open(const std::string& path, RecordingFault& fault,
                                               const Limits& limits);
  ~RecordedHistory();

  // Reads on, by so many events at most. False once there is nothing left to read.
  bool readOn(std::size_t events);
  // How much of the file has been read, from 0 to 1.
  float progress() const;

  // Once all is read. Times are of reception; one that goes back counts as the one before it. After
  // a clock that was set back by more than a minute they go on from there; an event alone that was
  // a minute ahead counts as the one before it.
  std::uint64_t beginMs() const;  // of the first event; 0 for an empty recording
  std::uint64_t endMs() const;
  std::uint64_t events() const;
  // What a reader must know about the file, a sentence each: cut off, bad lines, too large.
  std::vector<std::string> notes() const;

  const History& history() const;
  // As it was after the last event that is not after this time. Valid until the next call.
  const MetricStore& storeAt(std::uint64_t timeMs);
  Viewpoint viewpointAt(std::uint64_t timeMs);

  // When the next one happens after this time, or the last one before it.
  std::optional<std::uint64_t> nextHappening(std::uint64_t timeMs) const;
  std::optional<std::uint64_t> previousHappening(std::uint64_t timeMs) const;

 private:
  struct State;
  explicit RecordedHistory(std::unique_ptr<State> state);
  const std::unique_ptr<State> _state;
};

}  // namespace qel
