// The works that are measured: each is done once for every one of its payloads.
#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "PhoneMix.h"

namespace qel::bench {

// Does a work for one payload, by its position.
using Step = std::function<void(std::size_t payload)>;

struct Work {
  std::string group;     // what is done
  std::string_view who;  // by whom: "ours", or a peer
  // Prepares what the work starts from. The payloads must outlive what it returns.
  Step (*prepare)(const std::vector<Payload>& payloads);
  const std::vector<Payload>* payloads;  // for as long as the program runs
};

// Those over the phone's mix, then decoding class by class. The first of each group is what the
// others are compared with.
std::vector<Work> works();

}  // namespace qel::bench
