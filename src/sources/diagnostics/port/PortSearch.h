// Where the machine's diagnostics ports are.
#pragma once

#include <memory>
#include <string>
#include <vector>

namespace qel::diagnostics {

struct FoundPort {
  std::string address;  // as openPort takes it
  std::string modem;    // the modem's own device in /sys, as ModemManager names it; may be empty

  friend bool operator==(const FoundPort&, const FoundPort&) = default;
};

// One thread; nothing waits.
class PortSearch {
 public:
  virtual ~PortSearch() = default;
  // The likeliest first.
  virtual std::vector<FoundPort> ports() = 0;
  // That of a port that need not be among them; empty when it cannot be told.
  virtual std::string modemOf(const std::string& address) = 0;
  // Readable once there may be other ports than before; none is -1.
  virtual int descriptor() const { return -1; }
  virtual void clear() {}
};

// By what udev knows: terminals with the property ID_MM_PORT_TYPE_QCDM, nodes of the class wwan
// whose type is QCDM, then "@diag", which nobody can look for.
std::unique_ptr<PortSearch> makeUdevPortSearch();

}  // namespace qel::diagnostics
