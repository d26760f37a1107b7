#include "recording/FileBytes.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

#include "base/FatalError.h"

namespace qel {
namespace {

static_assert(sizeof(::off_t) == 8, "a recording may be larger than 2 GiB");

constexpr std::size_t kChunkBytes = 64 * 1024;
constexpr std::string_view kGzipMark = "\x1f\x8b";

}  // namespace

std::unique_ptr<FileBytes> FileBytes::open(const std::string& path, std::string& error) {
  const int descriptor = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
  if (descriptor < 0) {
    error = std::strerror(errno);
    return nullptr;
  }
  struct stat status {};
  if (::fstat(descriptor, &status) == 0 && S_ISDIR(status.st_mode)) {
    ::close(descriptor);
    error = std::strerror(EISDIR);
    return nullptr;
  }
  const auto size = S_ISREG(status.st_mode) ? static_cast<std::uint64_t>(status.st_size) : 0;
  return std::unique_ptr<FileBytes>(new FileBytes(descriptor, size));
}

FileBytes::FileBytes(int descriptor, std::uint64_t size)
    : _descriptor(descriptor), _size(size), _in(kChunkBytes), _out(kChunkBytes) {
  constexpr int kGzipOnly = 15 + 16;
  if (::inflateInit2(&_stream, kGzipOnly) != Z_OK) fatalError("out of memory for decompression");
}

FileBytes::~FileBytes() {
  ::inflateEnd(&_stream);
  ::close(_descriptor);
}

// What is left stays in front of what is read.
void FileBytes::fill() {
  std::copy(_left.begin(), _left.end(), _in.begin());
  const std::size_t kept = _left.size();
  // A signal ends the reading: whoever asked for that must not wait for the next bytes of a pipe.
  const ssize_t count = ::read(_descriptor, _in.data() + kept, _in.size() - kept);
  _left = {_in.data(), kept + static_cast<std::size_t>(std::max<ssize_t>(count, 0))};
  _fileEnded = count <= 0;
  if (count > 0) _taken += static_cast<std::uint64_t>(count);
  if (count < 0) {
    _error = std::strerror(errno);
    _end = End::failed;
  }
}

float FileBytes::share() const {
  if (_size == 0) return 0;
  return static_cast<float>(std::min(_taken, _size)) / static_cast<float>(_size);
}

// Whether what comes next is the beginning of a gzip stream, or of a part of one.
bool FileBytes::startsStream() {
  while (_left.size() < kGzipMark.size() && !_fileEnded) fill();
  return !_left.empty() && kGzipMark.starts_with(_left.substr(0, kGzipMark.size()));
}

std::string_view FileBytes::next() {
  if (_end) return {};
  if (!_compressed) _compressed = startsStream() && _left.size() >= kGzipMark.size();
  if (*_compressed) return inflated();
  if (_left.empty() && !_fileEnded) fill();
  if (_left.empty() && !_end) _end = End::whole;
  return std::exchange(_left, {});
}

std::string_view FileBytes::inflated() {
  _stream.next_out = reinterpret_cast<Bytef*>(_out.data());
  _stream.avail_out = static_cast<uInt>(_out.size());
  while (!_end && _stream.avail_out > 0) {
    if (!_inStream) {
      if (!startsStream()) {
        if (!_end) _end = _left.empty() ? End::whole : End::notCompressed;
        break;
      }
      ::inflateReset(&_stream);
      _inStream = true;
    }
    if (_left.empty()) {
      // What there is goes out before anything is waited for.
      if (_stream.avail_out < _out.size()) break;
      if (!_fileEnded) fill();
      if (_left.empty() && !_end) _end = End::cutOff;
      if (_end) break;
    }
    // zlib's interface lacks a const; it does not write to its input.
    _stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(_left.data()));
    _stream.avail_in = static_cast<uInt>(_left.size());
    const int code = ::inflate(&_stream, Z_NO_FLUSH);
    _left.remove_prefix(_left.size() - _stream.avail_in);
    if (code == Z_STREAM_END) {
      _inStream = false;
    } else if (code != Z_OK && code != Z_BUF_ERROR) {
      _end = End::damaged;
    }
  }
  return {_out.data(), _out.size() - _stream.avail_out};
}

}  // namespace qel
