#include "recording/RecordingWriter.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <utility>

#include "recording/EventLine.h"
#include "recording/LineCompressor.h"
#include "recording/LineLimits.h"

namespace qel {
namespace {

// It tells where a phone has been.
constexpr mode_t kFileMode = 0600;

ByteView bytesOf(std::string_view text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

// Empties a file that was there and takes it away from everybody else. Empty, or why that fails.
std::string takeOver(int descriptor) {
  struct stat status {};
  if (::fstat(descriptor, &status) != 0) return std::strerror(errno);
  if (!S_ISREG(status.st_mode)) return {};
  // Whoever owns a file reads it whatever its mode says.
  if (status.st_uid != ::geteuid()) return "belongs to another user";
  if (::fchmod(descriptor, kFileMode) != 0 || ::ftruncate(descriptor, 0) != 0) {
    return std::strerror(errno);
  }
  return {};
}

}  // namespace

std::unique_ptr<RecordingWriter> RecordingWriter::create(const std::string& path,
                                                         std::string& error, Existing existing) {
  const int whenThere = existing == Existing::refused ? O_EXCL : 0;
  const int descriptor =
      ::open(path.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC | whenThere, kFileMode);
  std::string why = descriptor < 0 ? std::strerror(errno) : takeOver(descriptor);
  if (!why.empty()) {
    if (descriptor >= 0) ::close(descriptor);
    error = path + ": " + why;
    return nullptr;
  }
  return std::unique_ptr<RecordingWriter>(
      new RecordingWriter(path, descriptor, path.ends_with(".gz")));
}

std::unique_ptr<RecordingWriter> RecordingWriter::onDescriptor(int descriptor, std::string name) {
  const int own = ::fcntl(descriptor, F_DUPFD_CLOEXEC, 0);
  return std::unique_ptr<RecordingWriter>(new RecordingWriter(std::move(name), own, false));
}

RecordingWriter::RecordingWriter(std::string path, int descriptor, bool compressed)
    : _path(std::move(path)), _descriptor(descriptor) {
  if (compressed) _compressor = std::make_unique<LineCompressor>();
}

RecordingWriter::~RecordingWriter() { close(); }

bool RecordingWriter::fail(int code) {
  _errorNumber = code;
  _error = _path + ": " + std::strerror(code);
  return false;
}

bool RecordingWriter::put(ByteView bytes) {
  while (!bytes.empty()) {
    const ssize_t count = ::write(_descriptor, bytes.data(), bytes.size());
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) return fail(errno);
    _bytesWritten += static_cast<std::uint64_t>(count);
    bytes = bytes.subspan(static_cast<std::size_t>(count));
  }
  return true;
}

bool RecordingWriter::write(const RecordedEvent& event) {
  if (!_error.empty()) return false;
  if (_descriptor < 0) return fail(EBADF);
  std::string line = hasReadableForm(event) ? eventLine(event) : "";
  if (line.empty() || line.size() > kLongestLineBytes) {
    ++_eventsLeftOut;
    return true;
  }
  line += '\n';
  if (!put(_compressor ? ByteView(_compressor->line(line)) : bytesOf(line))) return false;
  ++_eventsWritten;
  return true;
}

void RecordingWriter::sync() const {
  // Pipes have no disk: that this fails there is as it should be.
  if (_descriptor >= 0) ::fdatasync(_descriptor);
}

bool RecordingWriter::close() {
  if (_descriptor < 0) return _error.empty();
  if (_compressor && _error.empty()) put(_compressor->end());
  // Network file systems report a full disk only here.
  if (::close(std::exchange(_descriptor, -1)) != 0 && _error.empty()) fail(errno);
  return _error.empty();
}

}  // namespace qel
