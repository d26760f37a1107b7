// The works that are measured: each is done once for every one of its payloads.
#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "Payload.h"

namespace qel::bench {

// Does a work for one payload, by its position.
using Step = std::function<void(std::size_t payload)>;

struct Work {
  std::string group;     // what is done
  std::string_view who;  // by whom: "ours", or a peer
  std::string_view mix;  // on which payloads
  // Prepares what the work starts from. The payloads must outlive what it returns.
  Step (*prepare)(const std::vector<Payload>& payloads);
  const std::vector<Payload>* payloads;  // for as long as the program runs
  std::size_t pieces;  // what the figures are for one of: the payloads, or the elements in them
};

// Those over the mixes, then decoding class by class, then lists, for an element. A group stands
// together, in it who does it, in that the mixes. The first of each group is what the others are
// compared with. The mixes must stay.
std::vector<Work> works(const std::vector<Mix>& mixes);

}  // namespace qel::bench
