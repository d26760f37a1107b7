// The standard output of qelctl.
#pragma once

#include <memory>
#include <optional>
#include <string_view>

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
  // Looks at how the writing went so far, also of lines that went to the sink directly.
  void check();
  // The same lines as a sink, for the dispatcher.
  const std::shared_ptr<BatchingSink>& sink() const { return _sink; }

 private:
  std::shared_ptr<BatchingSink> _sink;
};

}  // namespace qel::tools
