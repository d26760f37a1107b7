#include "base/NonBlockingWriter.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <string>

namespace qel {
namespace {

// The name of a pseudo-terminal's other side stands for a new one each time it is opened.
bool isOtherSide(int terminal) {
  unsigned number = 0;
  return ::ioctl(terminal, TIOCGPTN, &number) == 0;
}

int openAgain(int descriptor) {
  if (isOtherSide(descriptor)) return -1;
  const std::string name = "/proc/self/fd/" + std::to_string(descriptor);
  return ::open(name.c_str(), O_WRONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC);
}

bool isWritable(int descriptor, std::chrono::milliseconds longest) {
  pollfd asked{descriptor, POLLOUT, 0};
  return ::poll(&asked, 1, static_cast<int>(longest.count())) > 0;
}

}  // namespace

NonBlockingWriter::Kind NonBlockingWriter::kindOf(int descriptor) {
  struct stat status {};
  ::fstat(descriptor, &status);
  if (S_ISSOCK(status.st_mode)) return Kind::socket;
  return S_ISFIFO(status.st_mode) || ::isatty(descriptor) == 1 ? Kind::stream : Kind::file;
}

NonBlockingWriter::NonBlockingWriter(int descriptor)
    : _descriptor(descriptor),
      _kind(kindOf(descriptor)),
      _own(_kind == Kind::stream ? openAgain(descriptor) : -1) {}

NonBlockingWriter::~NonBlockingWriter() {
  if (_own >= 0) ::close(_own);
}

std::size_t NonBlockingWriter::writeSome(std::string_view text) {
  if (_kind == Kind::stream && _own < 0) {
    if (!isWritable(_descriptor, std::chrono::milliseconds(0))) return 0;
    text = text.substr(0, PIPE_BUF);
  }
  const int descriptor = _own >= 0 ? _own : _descriptor;
  const ssize_t count = _kind == Kind::socket
                            ? ::send(descriptor, text.data(), text.size(), MSG_DONTWAIT)
                            : ::write(descriptor, text.data(), text.size());
  if (count >= 0) return static_cast<std::size_t>(count);
  if (errno != EAGAIN && errno != EINTR) _error = errno;
  return 0;
}

std::size_t NonBlockingWriter::write(std::string_view text) {
  std::size_t written = 0;
  while (_error == 0 && written < text.size()) {
    const std::size_t count = writeSome(text.substr(written));
    if (count == 0) break;
    written += count;
  }
  return written;
}

void NonBlockingWriter::wait(std::chrono::milliseconds longest) const {
  isWritable(_own >= 0 ? _own : _descriptor, longest);
}

int writeBriefly(int descriptor, std::string_view text, std::chrono::milliseconds longest) {
  using Clock = std::chrono::steady_clock;
  const auto end = Clock::now() + longest;
  NonBlockingWriter writer(descriptor);
  text.remove_prefix(writer.write(text));
  while (!text.empty() && writer.error() == 0) {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(end - Clock::now());
    if (left.count() <= 0) break;
    writer.wait(left);
    text.remove_prefix(writer.write(text));
  }
  return writer.error();
}

}  // namespace qel
