// What the bus says to a call.
#pragma once

#include <sdbus-c++/Error.h>
#include <functional>
#include <string>

namespace qel::testing {

// The name of the error that the call throws.
inline std::string errorOf(const std::function<void()>& call) {
  try {
    call();
  } catch (const sdbus::Error& error) {
    return error.getName();
  }
  return "no error";
}

}  // namespace qel::testing
