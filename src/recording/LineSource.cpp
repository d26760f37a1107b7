#include "recording/LineSource.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <zlib.h>

#include <cerrno>
#include <cstring>

namespace qel {
namespace {

constexpr std::size_t kChunkBytes = 64 * 1024;
constexpr std::size_t kLongestLineBytes = 16 * 1024 * 1024;

}  // namespace

std::unique_ptr<LineSource> LineSource::open(const std::string& path, std::string& error) {
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
  // zlib reads a file that does not begin as gzip as it stands.
  gzFile file = ::gzdopen(descriptor, "rb");
  if (!file) {
    ::close(descriptor);
    error = std::strerror(ENOMEM);
    return nullptr;
  }
  return std::unique_ptr<LineSource>(new LineSource(file));
}

LineSource::~LineSource() { ::gzclose(_file); }

bool LineSource::fill() {
  if (_ended) return false;
  _chunk.resize(kChunkBytes);
  _position = 0;
  const int count = ::gzread(_file, _chunk.data(), kChunkBytes);
  _chunk.resize(count > 0 ? static_cast<std::size_t>(count) : 0);
  if (count > 0) return true;
  _ended = true;
  int code = Z_OK;
  const char* const text = ::gzerror(_file, &code);
  if (code == Z_BUF_ERROR) {
    _streamCutOff = true;
  } else if (count < 0) {
    _errorIsDamage = code != Z_ERRNO;
    _error = _errorIsDamage ? "damaged gzip data" : text;
  }
  return false;
}

LineSource::Outcome LineSource::next(std::string& line) {
  line.clear();
  bool tooLong = false;
  while (_position < _chunk.size() || fill()) {
    const std::size_t newline = _chunk.find('\n', _position);
    const std::size_t stop = newline == std::string::npos ? _chunk.size() : newline;
    if (line.size() + (stop - _position) > kLongestLineBytes) {
      tooLong = true;
      line.clear();
    }
    if (!tooLong) line.append(_chunk, _position, stop - _position);
    _position = stop;
    if (newline == std::string::npos) continue;
    ++_position;
    return tooLong ? Outcome::tooLong : Outcome::line;
  }
  if (!_error.empty()) return Outcome::failed;
  if (tooLong) return Outcome::tooLong;
  return line.empty() ? Outcome::end : Outcome::unfinished;
}

}  // namespace qel
