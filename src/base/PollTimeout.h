// How long poll may wait.
#pragma once

#include <chrono>
#include <optional>

namespace qel {

// Milliseconds from now, rounded up, a day at the most; -1, for ever, without a moment or at the
// last one that there is. Any thread.
int pollTimeout(std::optional<std::chrono::steady_clock::time_point> moment);

// Of two such times the shorter one.
int shorterTimeout(int one, int other);

}  // namespace qel
