// A recording in one file, or in a row of files of bounded size or age.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "recording/RecordingWriter.h"

namespace qel {

struct RecordingLimits {
  std::optional<std::uint64_t> fileBytes;  // a file that has reached them is finished
  std::optional<std::chrono::milliseconds> fileAge;
  unsigned filesKept = 5;                              // of the finished ones; at least 1
  std::uint64_t freeBytes = std::uint64_t{64} << 20U;  // to be left on the disk; 0: any
};

// FILE is the one being written. A finished one becomes FILE.1, what was FILE.1 becomes FILE.2, and
// so on; the oldest goes. One thread. After a false nothing more is written and error() tells.
class RotatingRecording {
 public:
  using TimePoint = std::chrono::steady_clock::time_point;
  using Existing = RecordingWriter::Existing;

  // Nothing when it cannot be begun; `error` is then one line, "FILE: WHY". With `refused`, none of
  // the files that would come to an end may be there.
  static std::unique_ptr<RotatingRecording> create(const std::string& path,
                                                   const RecordingLimits& limits, Existing existing,
                                                   TimePoint now, std::string& error);
  // To a descriptor, which stays the caller's. Nothing limits it.
  static std::unique_ptr<RotatingRecording> onDescriptor(int descriptor, const std::string& name);

  bool write(const RecordedEvent& event, TimePoint now);
  // What is to be done from time to time, with or without events: keeps what was written safe from
  // a loss of power, and looks at the file's age and the disk's free space.
  bool tend(TimePoint now);
  bool close();

  // Over all files.
  std::uint64_t events() const { return _finishedEvents + _writer->eventsWritten(); }
  // Events whose line no reader would take.
  std::uint64_t eventsLeftOut() const { return _finishedLeftOut + _writer->eventsLeftOut(); }
  std::uint64_t bytes() const { return _finishedBytes + _writer->bytesWritten(); }
  std::uint64_t filesFinished() const { return _filesFinished; }

  const std::string& error() const { return _error; }
  // Of the system call that failed; 0 for other errors.
  int errorNumber() const { return _writer->errorNumber(); }

 private:
  RotatingRecording(std::string path, const RecordingLimits& limits,
                    std::unique_ptr<RecordingWriter> writer, TimePoint now);
  bool isFull(TimePoint now) const;
  bool rotate(TimePoint now);
  bool check(bool done);

  const std::string _path;  // empty: no file that could be renamed
  const RecordingLimits _limits;
  std::unique_ptr<RecordingWriter> _writer;
  TimePoint _begun;
  TimePoint _synced;
  std::uint64_t _finishedEvents = 0;
  std::uint64_t _finishedLeftOut = 0;
  std::uint64_t _finishedBytes = 0;
  std::uint64_t _filesFinished = 0;
  std::string _error;
};

}  // namespace qel
