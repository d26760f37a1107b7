// The port that is wished, wherever it is now.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "sources/diagnostics/port/DiagPort.h"
#include "sources/diagnostics/port/PortSearch.h"

namespace qel::diagnostics {

// A modem that comes back may have another name: once a port was open, its modem is what is looked
// for first. One thread.
class PortFinder {
 public:
  // `wish`: a port's address; empty: the likeliest one.
  PortFinder(std::string wish, std::unique_ptr<PortSearch> search)
      : _wish(std::move(wish)), _search(std::move(search)) {}

  // Null when none can be opened: then trouble() says why, of the port that it would have been.
  std::unique_ptr<DiagPort> open();

  const FoundPort& port() const { return _port; }
  const PortTrouble& trouble() const { return _trouble; }

  // To be waited for while there is no port; -1 when nothing tells.
  int descriptor() const { return _search->descriptor(); }
  // Clears it: whether there are other ports now than open() has tried, or rights to others.
  bool hasChanged();

 private:
  struct Sight {
    FoundPort port;
    bool isAllowed;  // always true of a router

    friend bool operator==(const Sight&, const Sight&) = default;
  };
  static std::vector<Sight> look(const std::vector<FoundPort>& ports);
  // What to try, in order, of the ports that are known.
  std::vector<FoundPort> candidates(std::vector<FoundPort> ports);

  const std::string _wish;
  const std::unique_ptr<PortSearch> _search;
  std::vector<Sight> _tried;
  std::string _modem;  // of the port that was open last
  FoundPort _port;
  PortTrouble _trouble;
};

}  // namespace qel::diagnostics
