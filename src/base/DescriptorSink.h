// Lines to a file descriptor, one at a time or in batches.
#pragma once

#include <unistd.h>

#include <chrono>
#include <cstdint>
#include <functional>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "base/LogSink.h"
#include "base/NonBlockingWriter.h"

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
// terminal every line goes at once, without what a terminal would obey.
class BatchingSink final : public LogSink {
 public:
  using Clock = std::chrono::steady_clock;

  // What happens when the reader takes nothing: a full pipe, a terminal that was stopped.
  enum class SlowReader {
    isWaitedFor,  // no line is lost
    losesLines,   // writing never waits: lines do, up to kMostWaiting; then they are dropped until
                  // half of that is read, and a line in their place says how many
  };
  static constexpr std::size_t kMostWaiting = std::size_t{1} << 20;  // bytes

  // `lineWaits` is called, on the thread that writes, when a line begins to wait.
  explicit BatchingSink(int descriptor, std::function<void()> lineWaits = {},
                        SlowReader slowReader = SlowReader::isWaitedFor);
  ~BatchingSink() override;
  void write(std::string_view line) override;
  // A text for a terminal to obey. It is written, or dropped, as a whole.
  void draw(std::string_view text);
  // All that waits. A reader who loses lines has a moment for it.
  void flush() override;
  // What goes without waiting.
  void flushWhatGoes();
  // For a reader who wants to see lines soon: flushes when the last write is a moment ago. Else
  // tells when it will be, if lines wait. A quiet sink so writes at once, a busy one by the batch.
  std::optional<Clock::time_point> flushWhenDue(Clock::time_point now);

  // Both before other threads write. While it waits for its reader the sink asks `givesUp` several
  // times a second; after a yes it waits no more.
  void setSlowReader(SlowReader slowReader) { _slowReader = slowReader; }
  void setGivesUp(std::function<bool()> givesUp) { _givesUp = std::move(givesUp); }

  // Whether lines wait for their reader.
  bool isBehind();
  // The error number of the first write that failed, else 0; nothing is written after it.
  int error();

 private:
  void add(std::string_view text);
  void writeSome();
  void waitAndWrite();

  const bool _isTerminal;
  const std::function<void()> _lineWaits;
  SlowReader _slowReader;
  std::function<bool()> _givesUp;
  std::mutex _mutex;
  NonBlockingWriter _writer;
  std::string _waiting;
  std::uint64_t _dropped = 0;  // since the last line that found room
  Clock::time_point _lastWrite;
  bool _isBehind = false;
};

// Each line at once to standard error, for people to see beside the rest. Never waits.
class StandardErrorSink final : public LogSink {
 public:
  void write(std::string_view line) override;

 private:
  BatchingSink _sink{STDERR_FILENO, {}, BatchingSink::SlowReader::losesLines};
};

}  // namespace qel
