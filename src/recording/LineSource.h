// Lines of a text file, plain or gzip, one at a time.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "recording/FileBytes.h"

namespace qel {

// Holds one chunk and one line of the file, never more. One thread.
class LineSource {
 public:
  enum class Outcome : std::uint8_t {
    line,           // a line that ended with a newline
    unfinished,     // the last bytes of the file, without a newline
    tooLong,        // a line beyond the limit; its rest was skipped
    notCompressed,  // all that follows a compressed stream and is none
    end,            // nothing left
    failed,         // the file cannot be read on: see error()
  };

  // Nothing when the file cannot be opened; `error` then says why.
  static std::unique_ptr<LineSource> open(const std::string& path, std::string& error);

  // The line is valid until the next call.
  Outcome next(std::string_view& line);

  // At the end: the gzip stream stopped in the middle.
  bool streamCutOff() const { return _bytes->end() == FileBytes::End::cutOff; }
  // After `failed`.
  std::string error() const;
  bool errorIsDamage() const { return _bytes->end() == FileBytes::End::damaged; }

  // How much of the file was read, from 0 to 1.
  float share() const { return _bytes->share(); }
  // How much text that was, decompressed.
  std::uint64_t bytes() const { return _bytesRead; }

 private:
  explicit LineSource(std::unique_ptr<FileBytes> bytes) : _bytes(std::move(bytes)) {}
  // False at the end of the file, or on failure.
  bool fill();
  Outcome nextOfSeveralChunks(std::string_view& line);

  const std::unique_ptr<FileBytes> _bytes;
  std::string_view _chunk;
  std::string _parts;  // of a line that begins in one chunk and ends in another
  std::uint64_t _bytesRead = 0;
  bool _ended = false;
  bool _restTold = false;  // that there is something else behind the stream
};

}  // namespace qel
