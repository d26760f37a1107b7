// Lines of a text file, plain or gzip, one at a time.
#pragma once

#include <cstddef>
#include <memory>
#include <string>

struct gzFile_s;

namespace qel {

// Holds one chunk and one line of the file, never more. One thread.
class LineSource {
 public:
  enum class Outcome {
    line,        // a line that ended with a newline
    unfinished,  // the last bytes of the file, without a newline
    tooLong,     // a line beyond the limit; its rest was skipped
    end,         // nothing left
    failed,      // the file cannot be read on: see error()
  };

  // Nothing when the file cannot be opened; `error` then says why.
  static std::unique_ptr<LineSource> open(const std::string& path, std::string& error);
  ~LineSource();
  LineSource(const LineSource&) = delete;
  LineSource& operator=(const LineSource&) = delete;

  Outcome next(std::string& line);

  // At the end: the gzip stream stopped in the middle.
  bool streamCutOff() const { return _streamCutOff; }
  // After `failed`.
  const std::string& error() const { return _error; }
  bool errorIsDamage() const { return _errorIsDamage; }

 private:
  explicit LineSource(gzFile_s* file) : _file(file) {}
  // False at the end of the file, or on failure.
  bool fill();

  gzFile_s* _file;
  std::string _chunk;
  std::size_t _position = 0;
  bool _ended = false;
  bool _streamCutOff = false;
  bool _errorIsDamage = false;
  std::string _error;
};

}  // namespace qel
