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
  // What becomes of a file that is there already.
  enum class Existing : std::uint8_t { replaced, refused };

  // Gzip when the name ends in ".gz". Others than the owner may not read it, also when the file was
  // there; one that belongs to somebody else is refused. Nothing when it cannot be opened; `error`
  // is then one line, "FILE: WHY".
  static std::unique_ptr<RecordingWriter> create(const std::string& path, std::string& error,
                                                 Existing existing = Existing::replaced);
  // Plain text to a descriptor, which stays the caller's. `name` stands for the file in errors.
  static std::unique_ptr<RecordingWriter> onDescriptor(int descriptor, std::string name);
  ~RecordingWriter();
  RecordingWriter(const RecordingWriter&) = delete;
  RecordingWriter& operator=(const RecordingWriter&) = delete;

  // False when the file could not be written; from then on nothing is written any more. An event
  // whose line no reader would take is left out.
  bool write(const RecordedEvent& event);
  // Waits until what was written is on the disk, where there is one.
  void sync() const;
  // Ends the file. False when it is not whole.
  bool close();

  std::uint64_t eventsWritten() const { return _eventsWritten; }
  std::uint64_t eventsLeftOut() const { return _eventsLeftOut; }
  // As they are in the file.
  std::uint64_t bytesWritten() const { return _bytesWritten; }
  // After a false: one line, "FILE: WHY", and the error number.
  const std::string& error() const { return _error; }
  int errorNumber() const { return _errorNumber; }

 private:
  RecordingWriter(std::string path, int descriptor, bool compressed);
  bool put(ByteView bytes);
  bool fail(int code);

  std::string _path;
  int _descriptor;
  std::unique_ptr<LineCompressor> _compressor;  // none: plain text
  std::uint64_t _eventsWritten = 0;
  std::uint64_t _eventsLeftOut = 0;
  std::uint64_t _bytesWritten = 0;
  std::string _error;
  int _errorNumber = 0;
};

}  // namespace qel
