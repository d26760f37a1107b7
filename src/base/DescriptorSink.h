// Lines to a file descriptor, one at a time or in batches.
#pragma once

#include <mutex>
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

// Collects lines and writes them by the batch, and what is left on flush and at its end.
class BatchingSink final : public LogSink {
 public:
  explicit BatchingSink(int descriptor) : _descriptor(descriptor) {}
  ~BatchingSink() override;
  void write(std::string_view line) override;
  void flush();
  // The error number of the first write that failed, else 0; nothing is written after it.
  int error();

 private:
  void flushLocked();

  std::mutex _mutex;
  std::string _waiting;
  int _descriptor;
  int _error = 0;
};

}  // namespace qel
