// Which diagnostics port, and which of its modem's radios.
#pragma once

#include <string>

namespace qel::diagnostics {

struct DiagnosticsChoice {
  std::string port;      // a device or "@NAME"; empty: the likeliest one
  unsigned radio = 1;    // 1, 2 …
  bool isMissed = true;  // whether it is worth a word that there is no port at all
};

}  // namespace qel::diagnostics
