#include "base/DescriptorSink.h"

#include <unistd.h>

#include <cerrno>
#include <climits>
#include <utility>

#include "base/TerminalText.h"

namespace qel {
namespace {

std::string linesDropped(std::uint64_t count) {
  return "lines dropped because nobody read: " + std::to_string(count) + "\n";
}

// As many lines from the front as a pipe takes together or not at all, but one at least: a program
// that ends while nobody reads leaves no half line.
std::string_view wholeLines(std::string_view text) {
  if (text.size() <= PIPE_BUF) return text;
  const std::size_t end = text.rfind('\n', PIPE_BUF - 1);
  return text.substr(0, (end == std::string_view::npos ? text.find('\n') : end) + 1);
}

}  // namespace

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

BatchingSink::BatchingSink(int descriptor, std::function<void()> lineWaits, SlowReader slowReader)
    : _isTerminal(::isatty(descriptor) == 1),
      _lineWaits(std::move(lineWaits)),
      _slowReader(slowReader),
      _writer(descriptor) {}

BatchingSink::~BatchingSink() { flush(); }

void BatchingSink::write(std::string_view line) {
  if (_isTerminal) {
    draw(forTerminal(line));
  } else {
    draw(line);
  }
}

void BatchingSink::draw(std::string_view text) {
  constexpr std::size_t kBatch = 65536;
  bool begins = false;
  {
    const std::lock_guard lock(_mutex);
    begins = _waiting.empty();
    add(text);
    const bool wasLostAlone = _dropped > 0 && _waiting.empty();  // nobody else would say so
    if (_isTerminal || _waiting.size() >= kBatch || wasLostAlone) {
      _slowReader == SlowReader::isWaitedFor ? waitAndWrite() : writeSome();
    }
    begins = begins && !_waiting.empty();
  }
  if (begins && _lineWaits) _lineWaits();
}

void BatchingSink::add(std::string_view text) {
  const bool fits = _dropped == 0 && _waiting.size() + text.size() < kMostWaiting;
  if (!fits && _slowReader == SlowReader::losesLines) {
    ++_dropped;
    return;
  }
  _waiting += text;
  _waiting += '\n';
}

void BatchingSink::flush() {
  const std::lock_guard lock(_mutex);
  if (_slowReader == SlowReader::isWaitedFor) return waitAndWrite();
  constexpr auto kMoment = std::chrono::milliseconds(200);
  if (_dropped > 0) _waiting += linesDropped(std::exchange(_dropped, 0));
  const auto end = Clock::now() + kMoment;
  writeSome();
  while (!_waiting.empty() && Clock::now() < end) {
    _writer.wait(kMoment);
    writeSome();
  }
}

std::optional<BatchingSink::Clock::time_point> BatchingSink::flushWhenDue(Clock::time_point now) {
  constexpr auto kPause = std::chrono::milliseconds(20);
  constexpr auto kPauseBehind = std::chrono::milliseconds(100);
  const std::lock_guard lock(_mutex);
  if (_waiting.empty()) return std::nullopt;
  const auto due = _lastWrite + (_isBehind ? kPauseBehind : kPause);
  if (now < due) return due;
  _slowReader == SlowReader::isWaitedFor ? waitAndWrite() : writeSome();
  _lastWrite = now;
  if (_waiting.empty()) return std::nullopt;
  return now + kPauseBehind;
}

bool BatchingSink::isBehind() {
  const std::lock_guard lock(_mutex);
  return _isBehind;
}

int BatchingSink::error() {
  const std::lock_guard lock(_mutex);
  return _writer.error();
}

void BatchingSink::flushWhatGoes() {
  const std::lock_guard lock(_mutex);
  writeSome();
}

// What goes at once. Nobody will read what a failed write left.
void BatchingSink::writeSome() {
  const bool inPieces = _slowReader == SlowReader::losesLines;
  std::size_t written = 0;
  while (written < _waiting.size()) {
    const std::string_view left = std::string_view(_waiting).substr(written);
    const std::string_view piece = inPieces ? wholeLines(left) : left;
    const std::size_t count = _writer.write(piece);
    written += count;
    if (count < piece.size()) break;
  }
  _waiting.erase(0, written);
  if (_dropped > 0 && _waiting.size() <= kMostWaiting / 2) {
    _waiting += linesDropped(std::exchange(_dropped, 0));
  }
  if (_writer.error() != 0) _waiting.clear();
  _isBehind = !_waiting.empty();
}

void BatchingSink::waitAndWrite() {
  constexpr auto kPatience = std::chrono::milliseconds(100);
  writeSome();
  while (!_waiting.empty() && !(_givesUp && _givesUp())) {
    _writer.wait(kPatience);
    writeSome();
  }
}

void StandardErrorSink::write(std::string_view line) {
  _sink.write(line);
  _sink.flushWhatGoes();
}

}  // namespace qel
