#include "recording/RotatingRecording.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <utility>

namespace qel {
namespace {

using namespace std::chrono_literals;

// A loss of power costs this much at most; more often would wear the phone's flash memory.
constexpr auto kSyncEvery = 5s;

std::string directoryOf(const std::string& path) {
  const auto parent = std::filesystem::path(path).parent_path();
  return parent.empty() ? "." : parent.string();
}

std::string numbered(const std::string& path, unsigned number) {
  return path + "." + std::to_string(number);
}

bool rotates(const RecordingLimits& limits) {
  return limits.fileBytes.has_value() || limits.fileAge.has_value();
}

// Files that come and go survive a loss of power only when their directory is written too.
void syncDirectory(const std::string& directory) {
  const int descriptor = ::open(directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (descriptor < 0) return;
  ::fsync(descriptor);
  ::close(descriptor);
}

// A file that is there and takes up no disk, such as a device.
bool isNoFile(const std::string& path) {
  struct stat status {};
  return ::stat(path.c_str(), &status) == 0 && !S_ISREG(status.st_mode);
}

// Empty when enough is free, or nobody knows.
std::string spaceError(const std::string& path, std::uint64_t wanted) {
  struct statvfs disk {};
  if (wanted == 0 || isNoFile(path) || ::statvfs(directoryOf(path).c_str(), &disk) != 0) return {};
  const std::uint64_t free = std::uint64_t{disk.f_bavail} * disk.f_frsize;
  if (free >= wanted) return {};
  return path + ": " + std::to_string(free >> 20U) + " MB are free on the disk, " +
         std::to_string(wanted >> 20U) + " MB must stay free";
}

// Empty when no file stands in the way of one that would be renamed.
std::string standingInTheWay(const std::string& path, const RecordingLimits& limits) {
  if (!rotates(limits)) return {};
  for (unsigned i = 1; i <= limits.filesKept; ++i) {
    struct stat status {};
    const std::string name = numbered(path, i);
    if (::lstat(name.c_str(), &status) == 0) return name + ": " + std::strerror(EEXIST);
  }
  return {};
}

// Empty when the path is free or a regular file: nothing else can be finished and renamed.
std::string wrongKind(const std::string& path, const RecordingLimits& limits) {
  struct stat status {};
  if (!rotates(limits) || ::lstat(path.c_str(), &status) != 0 || S_ISREG(status.st_mode)) return {};
  return path + ": not a regular file";
}

}  // namespace

std::unique_ptr<RotatingRecording> RotatingRecording::create(const std::string& path,
                                                             const RecordingLimits& limits,
                                                             Existing existing, TimePoint now,
                                                             std::string& error) {
  error = spaceError(path, limits.freeBytes);
  if (error.empty()) error = wrongKind(path, limits);
  if (error.empty() && existing == Existing::refused) error = standingInTheWay(path, limits);
  if (!error.empty()) return nullptr;
  auto writer = RecordingWriter::create(path, error, existing);
  if (!writer) return nullptr;
  syncDirectory(directoryOf(path));
  return std::unique_ptr<RotatingRecording>(
      new RotatingRecording(path, limits, std::move(writer), now));
}

std::unique_ptr<RotatingRecording> RotatingRecording::onDescriptor(int descriptor,
                                                                   const std::string& name) {
  RecordingLimits none;
  none.freeBytes = 0;
  return std::unique_ptr<RotatingRecording>(
      new RotatingRecording("", none, RecordingWriter::onDescriptor(descriptor, name), {}));
}

RotatingRecording::RotatingRecording(std::string path, const RecordingLimits& limits,
                                     std::unique_ptr<RecordingWriter> writer, TimePoint now)
    : _path(std::move(path)),
      _limits(limits),
      _writer(std::move(writer)),
      _begun(now),
      _synced(now) {}

bool RotatingRecording::check(bool done) {
  if (!done && _error.empty()) _error = _writer->error();
  return _error.empty();
}

bool RotatingRecording::isFull(TimePoint now) const {
  if (_writer->eventsWritten() == 0) return false;
  if (_limits.fileBytes && _writer->bytesWritten() >= *_limits.fileBytes) return true;
  return _limits.fileAge && now - _begun >= *_limits.fileAge;
}

bool RotatingRecording::rotate(TimePoint now) {
  _writer->sync();
  if (!check(_writer->close())) return false;
  // A number that is not taken leaves nothing to rename.
  for (unsigned i = _limits.filesKept; i > 1; --i) {
    std::rename(numbered(_path, i - 1).c_str(), numbered(_path, i).c_str());
  }
  if (std::rename(_path.c_str(), numbered(_path, 1).c_str()) != 0) {
    _error = numbered(_path, 1) + ": " + std::strerror(errno);
    return false;
  }
  auto next = RecordingWriter::create(_path, _error, Existing::refused);
  if (!next) return false;
  syncDirectory(directoryOf(_path));
  _finishedEvents += _writer->eventsWritten();
  _finishedLeftOut += _writer->eventsLeftOut();
  _finishedBytes += _writer->bytesWritten();
  ++_filesFinished;
  _writer = std::move(next);
  _begun = now;
  return true;
}

bool RotatingRecording::write(const RecordedEvent& event, TimePoint now) {
  if (!_error.empty()) return false;
  if (isFull(now) && !rotate(now)) return false;
  if (_writer->eventsWritten() == 0) _begun = now;
  return check(_writer->write(event));
}

bool RotatingRecording::tend(TimePoint now) {
  if (!_error.empty()) return false;
  if (isFull(now) && !rotate(now)) return false;
  if (now - _synced >= kSyncEvery) {
    _writer->sync();
    _synced = now;
  }
  if (!_path.empty()) _error = spaceError(_path, _limits.freeBytes);
  return _error.empty();
}

bool RotatingRecording::close() {
  _writer->sync();
  return check(_writer->close());
}

}  // namespace qel
