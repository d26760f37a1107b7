// Lines to a file descriptor, one at a time or in batches.
#pragma once

#include <chrono>
#include <functional>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>

#include "base/LogSink.h"

namespace qel {

// Writes all of `text`; the error number of the write that failed, else 0.
int writeAll(int descriptor, std::string_view text);

// One line, one write to the descriptor, which stays the caller's. After a failed write nothing
// more is written.
class DescriptorSink final : public LogSink {
 public:
  explicit DescriptorSink(int descriptor) : _descriptor(descriptor) {}
  void write(std::string_view line) override;

 private:
  std::mutex _mutex;
  std::string _line;
  int _descriptor;
  int _error = 0;
};

// Collects lines and writes them by the batch, and what is left on flush and at its end. To a
// terminal every line goes at once.
class BatchingSink final : public LogSink {
 public:
  using Clock = std::chrono::steady_clock;

  // `lineWaits` is called, on the thread that writes, when a line begins to wait.
  explicit BatchingSink(int descriptor, std::function<void()> lineWaits = {});
  ~BatchingSink() override;
  void write(std::string_view line) override;
  void flush() override;
  // For a reader who wants to see lines soon: flushes when the last write is a moment ago. Else
  // tells when it will be, if lines wait. A quiet sink so writes at once, a busy one by the batch.
  std::optional<Clock::time_point> flushWhenDue(Clock::time_point now);
  // The error number of the first write that failed, else 0; nothing is written after it.
  int error();

 private:
  void flushLocked();

  const int _descriptor;
  const bool _isTerminal;
  const std::function<void()> _lineWaits;
  std::mutex _mutex;
  std::string _waiting;
  Clock::time_point _lastWrite;
  int _error = 0;
};

}  // namespace qel
