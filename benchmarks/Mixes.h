// The mixes of payloads that everything is measured on.
#pragma once

#include <vector>

#include "Payload.h"

namespace qel::bench {

// "busy" and "usual", drawn. Takes "--recording FILE", as often as it stands there, out of the
// arguments; "recorded" then are the payloads of those files. A file that cannot be read or has
// nothing to measure ends the program with one line.
std::vector<Mix> takeMixes(std::vector<char*>& arguments);

}  // namespace qel::bench
