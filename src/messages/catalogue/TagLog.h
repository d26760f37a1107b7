// The log lines about tags that are metric identifiers.
#pragma once

#include <cstddef>
#include <string_view>

namespace qel {

// Writes the line to the system log, or only counts it while the thread holds a CountedTagLines.
void writeTagLine(std::string_view line);

// For whoever examines bytes that their receiver will read, and log, again: as long as one is
// there, what its thread reads writes no such lines. The newest one counts.
class CountedTagLines {
 public:
  CountedTagLines();
  ~CountedTagLines();
  CountedTagLines(const CountedTagLines&) = delete;
  CountedTagLines& operator=(const CountedTagLines&) = delete;

  std::size_t count() const { return _count; }

 private:
  friend void writeTagLine(std::string_view line);

  std::size_t _count = 0;
  CountedTagLines* const _outer;
};

}  // namespace qel
