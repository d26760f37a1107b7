#include "export/PartFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <utility>

namespace qel {
PartFile::~PartFile() {
  if (_descriptor >= 0) ::close(_descriptor);
  if (_isThere) ::unlink(partPath().c_str());
}

bool PartFile::fail(int code) {
  _error = _path + ": " + std::strerror(code);
  return false;
}

bool PartFile::create() {
  constexpr std::string_view kEnding = ".part";
  _part = _path + ".XXXXXX" + std::string(kEnding);
  // It tells where a phone has been: the file is for its owner's eyes alone.
  _descriptor = ::mkostemps(_part.data(), static_cast<int>(kEnding.size()), O_CLOEXEC);
  if (_descriptor < 0) return fail(errno);
  _isThere = true;
  return true;
}

bool PartFile::write(std::string_view text) {
  while (!text.empty()) {
    const ssize_t count = ::write(_descriptor, text.data(), text.size());
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) return fail(errno);
    text.remove_prefix(static_cast<std::size_t>(count));
  }
  return true;
}

bool PartFile::complete() {
  if (::fsync(_descriptor) != 0) return fail(errno);
  return ::close(std::exchange(_descriptor, -1)) == 0 || fail(errno);
}

bool PartFile::takePlace() {
  if (std::rename(partPath().c_str(), _path.c_str()) != 0) return fail(errno);
  _isThere = false;
  return true;
}

}  // namespace qel
