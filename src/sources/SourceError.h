// Why a source cannot be had.
#pragma once

#include <string>

namespace qel::sources {

struct SourceError {
  int exitCode = 0;     // of sysexits(3): what a program should end with
  std::string message;  // one line
};

}  // namespace qel::sources
