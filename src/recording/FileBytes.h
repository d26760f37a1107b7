// The bytes of a file, decompressed when it is gzip.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <zlib.h>

namespace qel {

// A file is gzip when it begins as gzip; it may then be several streams in a row, and nothing else.
// Holds two chunks of it, whatever it decompresses to. One thread.
class FileBytes {
 public:
  enum class End : std::uint8_t {
    whole,          // the end of the file
    cutOff,         // the compressed stream stopped in the middle
    notCompressed,  // something else follows the compressed stream
    damaged,        // the compressed stream is no gzip
    failed,         // the file cannot be read on: see error()
  };

  // Nothing when the file cannot be opened; `error` then says why.
  static std::unique_ptr<FileBytes> open(const std::string& path, std::string& error);
  ~FileBytes();
  FileBytes(const FileBytes&) = delete;
  FileBytes& operator=(const FileBytes&) = delete;

  // What comes next, valid until the next call. Nothing at the end.
  std::string_view next();
  // Why there was nothing.
  End end() const { return *_end; }
  // After `failed`.
  const std::string& error() const { return _error; }
  // How much of the file was read, from 0 to 1; 0 where that cannot be told, as of a pipe.
  float share() const;

 private:
  using Chunk = std::vector<char>;

  FileBytes(int descriptor, std::uint64_t size);
  std::string_view inflated();
  void fill();
  bool startsStream();

  const int _descriptor;
  const std::uint64_t _size;  // of the file when it was opened; 0 where it has none
  std::uint64_t _taken = 0;
  Chunk _in;
  std::string_view _left;  // of what was read from the file
  bool _fileEnded = false;
  std::optional<bool> _compressed;  // not known before the first bytes
  Chunk _out;
  z_stream _stream{};
  bool _inStream = false;
  std::optional<End> _end;
  std::string _error;
};

}  // namespace qel
