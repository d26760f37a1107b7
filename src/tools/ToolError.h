// How a subcommand of qelctl fails.
#pragma once

#include <sysexits.h>

#include <stdexcept>
#include <string>

namespace qel::tools {

// Ends the program with the code (sysexits) and one line "qelctl: WHAT: WHY".
class ToolError : public std::runtime_error {
 public:
  ToolError(int code, const std::string& whatAndWhy)
      : std::runtime_error(whatAndWhy), _code(code) {}
  ToolError(int code, const std::string& what, const std::string& why)
      : ToolError(code, what + ": " + why) {}
  int code() const { return _code; }

 private:
  int _code;
};

}  // namespace qel::tools
