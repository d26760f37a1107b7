// Writes a recording, event by event.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "base/Bytes.h"
#include "recording/RecordedEvent.h"

namespace qel {

class LineCompressor;

// Each event is handed to the system before write() returns, so that a file left behind by a
// killed process reads up to its last whole event. One thread. Closed by the destructor at last.
class RecordingWriter {
 public:
  // Replaces the file; gzip when the name ends in ".gz". Nothing when it cannot be opened; `error`
  // is then one line, "FILE: WHY".
  static std::unique_ptr<RecordingWriter> create(const std::string& path, std::string& error);
  ~RecordingWriter();
  RecordingWriter(const RecordingWriter&) = delete;
  RecordingWriter& operator=(const RecordingWriter&) = delete;

  // False when the file could not be written; from then on nothing is written any more.
  bool write(const RecordedEvent& event);
  // Ends the file. False when it is not whole.
  bool close();

  std::uint64_t eventsWritten() const { return _eventsWritten; }
  // After a false: one line, "FILE: WHY".
  const std::string& error() const { return _error; }

 private:
  RecordingWriter(std::string path, int descriptor);
  bool put(ByteView bytes);
  bool fail(int code);

  std::string _path;
  int _descriptor;
  std::unique_ptr<LineCompressor> _compressor;  // none: plain text
  std::uint64_t _eventsWritten = 0;
  std::string _error;
};

}  // namespace qel
