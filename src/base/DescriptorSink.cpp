#include "base/DescriptorSink.h"

#include <unistd.h>

#include <cerrno>
#include <utility>

namespace qel {

int writeAll(int descriptor, std::string_view text) {
  while (!text.empty()) {
    const ssize_t written = ::write(descriptor, text.data(), text.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return errno;
    text.remove_prefix(static_cast<std::size_t>(written));
  }
  return 0;
}

void DescriptorSink::write(std::string_view line) {
  const std::lock_guard lock(_mutex);
  if (_error != 0) return;
  _line.assign(line);
  _line += '\n';
  _error = writeAll(_descriptor, _line);
}

BatchingSink::BatchingSink(int descriptor, std::function<void()> lineWaits)
    : _descriptor(descriptor),
      _isTerminal(::isatty(descriptor) == 1),
      _lineWaits(std::move(lineWaits)) {}

BatchingSink::~BatchingSink() { flush(); }

void BatchingSink::write(std::string_view line) {
  constexpr std::size_t kBatch = 65536;
  bool begins = false;
  {
    const std::lock_guard lock(_mutex);
    begins = _waiting.empty();
    _waiting += line;
    _waiting += '\n';
    if (_isTerminal || _waiting.size() >= kBatch) flushLocked();
    begins = begins && !_waiting.empty();
  }
  if (begins && _lineWaits) _lineWaits();
}

void BatchingSink::flush() {
  const std::lock_guard lock(_mutex);
  flushLocked();
}

std::optional<BatchingSink::Clock::time_point> BatchingSink::flushWhenDue(Clock::time_point now) {
  constexpr auto kPause = std::chrono::milliseconds(20);
  const std::lock_guard lock(_mutex);
  if (_waiting.empty()) return std::nullopt;
  if (now < _lastWrite + kPause) return _lastWrite + kPause;
  flushLocked();
  _lastWrite = now;
  return std::nullopt;
}

int BatchingSink::error() {
  const std::lock_guard lock(_mutex);
  return _error;
}

void BatchingSink::flushLocked() {
  if (_error == 0) _error = writeAll(_descriptor, _waiting);
  _waiting.clear();
}

}  // namespace qel
