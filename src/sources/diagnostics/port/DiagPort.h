// A modem's diagnostics port.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "sources/diagnostics/port/FrameReader.h"
#include "sources/diagnostics/requests/Request.h"

namespace qel::diagnostics {

// Open for as long as it exists. One thread; nothing waits.
class DiagPort {
 public:
  virtual ~DiagPort() = default;

  // Readable when something has come, or when the port is lost.
  virtual int descriptor() const = 0;

  // Hands over packets of what has come, a turn's worth at most: the rest keeps the descriptor
  // readable. False when the port is lost.
  virtual bool receive(const FrameReader::Take& take) = 0;

  // False when it cannot be written now.
  virtual bool send(const Request& request) = 0;

  virtual const FrameReader::Counts& counts() const = 0;

  // Others may change what we have set.
  virtual bool isShared() const { return false; }
};

// Why a port cannot be opened.
struct PortTrouble {
  enum class Kind : std::uint8_t { absent, held, denied, failed };
  Kind kind = Kind::failed;
  std::string words;  // what the system says
};

// "@NAME" is a router's socket, "/dev/diag" the device of Android's kernels, anything else a
// terminal or a device that has packets' bytes. Null when it cannot be opened.
std::unique_ptr<DiagPort> openPort(const std::string& address, PortTrouble& trouble);

}  // namespace qel::diagnostics
