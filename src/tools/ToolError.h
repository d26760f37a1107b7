// How a subcommand of qelctl fails.
#pragma once

#include <sysexits.h>

#include <stdexcept>
#include <string>

namespace qel::tools {

// Ends the program with the code (sysexits) and one line "qelctl: WHAT: WHY".
class ToolError : public std::runtime_error {
 public:
  ToolError(int code, const std::string& what, const std::string& why)
      : std::runtime_error(what + ": " + why), _code(code) {}
  int code() const { return _code; }

 private:
  int _code;
};

}  // namespace qel::tools
