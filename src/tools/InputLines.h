// The lines of standard input.
#pragma once

#include <string>
#include <string_view>

namespace qel::tools {

// Holds one line and what was read with it. One thread.
class InputLines {
 public:
  enum class Outcome { line, tooLong, end };

  // A line may have so many bytes, its newline not among them.
  explicit InputLines(std::size_t longest) : _longest(longest) {}

  // Whether the next one is there already, so that next() waits for nobody.
  bool isThere();
  // The line is valid until the next call. After tooLong there is no next one. A ToolError when
  // standard input cannot be read.
  Outcome next(std::string_view& line);

 private:
  bool fill();

  const std::size_t _longest;
  std::string _read;  // from standard input
  std::size_t _taken = 0;
  std::size_t _searched = 0;  // no newline up to here
};

}  // namespace qel::tools
