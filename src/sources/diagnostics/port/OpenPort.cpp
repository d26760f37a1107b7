#include "sources/diagnostics/port/AndroidPort.h"
#include "sources/diagnostics/port/DevicePort.h"
#include "sources/diagnostics/port/DiagPort.h"
#include "sources/diagnostics/port/RouterPort.h"

namespace qel::diagnostics {

std::unique_ptr<DiagPort> openPort(const std::string& address, PortTrouble& trouble) {
  if (address.starts_with('@')) return RouterPort::open(address, trouble);
  if (address == "/dev/diag") return AndroidPort::open(address, trouble);
  return DevicePort::open(address, trouble);
}

}  // namespace qel::diagnostics
