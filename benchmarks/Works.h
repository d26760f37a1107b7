// The works that are measured: each is done once for every payload of the phone's mix.
#pragma once

#include <functional>
#include <span>
#include <string_view>

namespace qel::bench {

inline constexpr std::size_t kPayloads = 2000;

struct Work {
  std::string_view group;  // what is done
  std::string_view who;    // by whom: "ours", or a peer
  // Prepares what the work starts from; what it returns does the work for one payload.
  std::function<void(std::size_t payload)> (*prepare)();
};

std::span<const Work> works();

}  // namespace qel::bench
