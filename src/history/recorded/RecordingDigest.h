// What there is to say about a recording in a list.
#pragma once

#include <cstdint>
#include <memory>
#include <set>
#include <string>
#include <tuple>

#include "history/History.h"
#include "history/recorded/QuietDispatcher.h"
#include "recording/RecordingReader.h"

namespace qel {

// Reads a recording in pieces and keeps of it no more than this. Main thread only.
class RecordingDigest {
 public:
  // Nothing when the file cannot be opened.
  static std::unique_ptr<RecordingDigest> open(const std::string& path, RecordingFault& fault);

  // Reads on, by so many events at most. False once there is nothing left to read.
  bool readOn(std::size_t events);

  std::uint64_t events() const { return _events; }
  std::uint64_t lengthMs() const { return _endMs - _beginMs; }
  std::uint64_t beginMs() const { return _beginMs; }
  // Different serving cells; of more than 65,536 no more are counted.
  // One whose identity was not told is the one of the same channel and code that has one.
  std::size_t cells() const;
  // Why reading ended early, or empty.
  std::string fault() const { return _reader->fault() ? _reader->fault()->message : ""; }

 private:
  explicit RecordingDigest(std::unique_ptr<RecordingReader> reader);
  void take(const RecordedEvent& event);

  const std::unique_ptr<RecordingReader> _reader;
  History _history;
  QuietDispatcher _dispatcher;
  // Technology, channel, code and identity.
  using Key = std::tuple<Technology, std::uint64_t, std::uint64_t, std::uint64_t>;
  std::set<Key> _cells;
  std::uint64_t _events = 0;
  std::uint64_t _beginMs = 0;
  std::uint64_t _endMs = 0;
};

}  // namespace qel
