// The standard output of qelctl.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string_view>
#include <utility>

#include "base/DescriptorSink.h"

namespace qel::tools {

// Lines for standard output, batched unless it is a terminal, complete at the end and before a
// fatal error. When the reader has closed the pipe the program ends at once, quietly; any other
// failed write is a ToolError.
class Output {
 public:
  Output();

  void line(std::string_view text);
  void flush();
  // Writes what waits when the last write is a moment ago; else tells when that will be.
  std::optional<BatchingSink::Clock::time_point> flushWhenDue();
  // A text for a terminal to obey, written at once.
  void draw(std::string_view text);
  // For programs that go on whether anybody reads or not: lines are lost then, see BatchingSink.
  void goOnWithoutReader() { _sink->setSlowReader(BatchingSink::SlowReader::losesLines); }
  // Once that answers yes, a reader is waited for no more.
  void setGivesUp(std::function<bool()> givesUp) { _sink->setGivesUp(std::move(givesUp)); }
  // Whether lines wait for their reader.
  bool isBehind() { return _sink->isBehind(); }
  // Looks at how the writing went so far, also of lines that went to the sink directly.
  void check();
  // The same lines as a sink, for the dispatcher.
  const std::shared_ptr<BatchingSink>& sink() const { return _sink; }

 private:
  std::shared_ptr<BatchingSink> _sink;
};

}  // namespace qel::tools
