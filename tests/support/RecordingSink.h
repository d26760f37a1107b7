// A log sink that keeps its lines for a test to read.
#pragma once

#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "base/LogSink.h"

namespace qel::testing {

class RecordingSink final : public LogSink {
 public:
  void write(std::string_view line) override {
    const std::lock_guard lock(_mutex);
    _lines.emplace_back(line);
  }
  std::vector<std::string> lines() const {
    const std::lock_guard lock(_mutex);
    return _lines;
  }
  void clear() {
    const std::lock_guard lock(_mutex);
    _lines.clear();
  }

 private:
  mutable std::mutex _mutex;
  std::vector<std::string> _lines;
};

// The system log, captured for as long as this lives.
class CapturedSystemLog {
 public:
  CapturedSystemLog() { setSystemLog(_sink); }
  ~CapturedSystemLog() { setSystemLog(nullptr); }
  std::vector<std::string> lines() const { return _sink->lines(); }
  void clear() { _sink->clear(); }

 private:
  std::shared_ptr<RecordingSink> _sink = std::make_shared<RecordingSink>();
};

// Standard output, captured for as long as this lives.
class CapturedStandardOutput {
 public:
  CapturedStandardOutput() { setStandardOutput(_sink); }
  ~CapturedStandardOutput() { setStandardOutput(nullptr); }
  std::vector<std::string> lines() const { return _sink->lines(); }
  void clear() { _sink->clear(); }

 private:
  std::shared_ptr<RecordingSink> _sink = std::make_shared<RecordingSink>();
};

}  // namespace qel::testing
