// Reads a recording, event by event.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "recording/LineSource.h"
#include "recording/RecordedEvent.h"

namespace qel {

// Why a recording cannot be read: one line, "FILE: WHY" or "FILE:LINE: WHY".
struct RecordingFault {
  enum class Kind { notOpened, badData, notRead };
  Kind kind = Kind::notOpened;
  std::string message;
  std::string inFile = {};  // the same without the file, "line 3: WHY"; empty: it was not opened

  // What a program should end with, of sysexits(3).
  int exitCode() const;
};

// JSON Lines, plain or gzip whatever the file is called. One line in memory at a time. One thread.
class RecordingReader {
 public:
  enum class BadLines { fail, skip };

  // Nothing when the file cannot be opened.
  static std::unique_ptr<RecordingReader> open(const std::string& path, BadLines badLines,
                                               RecordingFault& fault);

  // The next event. Nothing at the end: of the recording, or by a fault.
  std::optional<RecordedEvent> next();

  // Set when reading ended early.
  const std::optional<RecordingFault>& fault() const { return _fault; }
  // Set at the end when the last line, or the compressed stream, was cut off in the middle (power
  // loss). One line like a fault's; what was whole has been read.
  const std::optional<std::string>& cutOff() const { return _cutOff; }
  // Lines passed over with BadLines::skip.
  std::uint64_t skippedLines() const { return _skippedLines; }
  // How much of the file was read, from 0 to 1; 0 where that cannot be told.
  float share() const { return _lines->share(); }
  // How much text that was, decompressed.
  std::uint64_t bytes() const { return _lines->bytes(); }
  // Number of the line read last, from 1.
  std::uint64_t lineNumber() const { return _lineNumber; }

 private:
  RecordingReader(std::string path, BadLines badLines, std::unique_ptr<LineSource> lines);
  std::string at(const std::string& reason) const;
  // An event of the line; else the line is counted, or ends the reading.
  std::optional<RecordedEvent> take(LineSource::Outcome outcome);
  void reject(const std::string& reason);
  void fail(RecordingFault::Kind kind, const std::string& reason);

  std::string _path;
  BadLines _badLines;
  std::unique_ptr<LineSource> _lines;
  std::string_view _line;
  std::optional<RecordingFault> _fault;
  std::optional<std::string> _cutOff;
  std::uint64_t _skippedLines = 0;
  std::uint64_t _lineNumber = 0;
  bool _ended = false;
};

}  // namespace qel
