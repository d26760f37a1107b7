// Keeps lines as bytes in memory, as a batch for a file would be.
#pragma once

#include <string>

#include "base/LogSink.h"

namespace qel::bench {

class MemorySink final : public LogSink {
 public:
  void write(std::string_view line) override {
    constexpr std::size_t kBatch = 65536;
    if (_lines.size() > kBatch) _lines.clear();
    _lines += line;
    _lines += '\n';
  }

  // Those of the batch in hand.
  const std::string& lines() const { return _lines; }

 private:
  std::string _lines;
};

}  // namespace qel::bench
