// Why a port cannot be opened, from what the system says.
#pragma once

#include <cerrno>
#include <system_error>

#include "sources/diagnostics/port/DiagPort.h"

namespace qel::diagnostics {

inline PortTrouble systemTrouble(int error) {
  using Kind = PortTrouble::Kind;
  const auto kindOf = [error] {
    switch (error) {
      case ENOENT:
      case ENODEV:
      case ENXIO:
      case ENOTDIR:
      case ECONNREFUSED:  // nobody has that socket
        return Kind::absent;
      case EBUSY:
        return Kind::held;
      case EACCES:
      case EPERM:
        return Kind::denied;
      default:
        return Kind::failed;
    }
  };
  return {kindOf(), std::generic_category().message(error)};
}

}  // namespace qel::diagnostics
