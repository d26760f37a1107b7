// The happenings, in the order in which they became known.
#pragma once

#include <cstdint>
#include <deque>

#include "base/Value.h"
#include "history/Happening.h"

namespace qel {

// A report on its way to what follows from it.
struct Report {
  std::int64_t metric;
  const Dictionary& record;
  std::uint64_t timeMs;  // of reception
  std::uint64_t atMs;    // the same, but never before that of another report
};

// Beyond `most` the oldest go.
class HappeningLog {
 public:
  explicit HappeningLog(std::size_t most) : _most(most) {}

  // `atMs` never goes back.
  void add(Happening happening, std::uint64_t atMs);
  void add(const Report& report, HappeningKind kind, std::optional<Technology> technology,
           std::string text);

  const std::deque<Happening>& all() const { return _happenings; }
  std::uint64_t gone() const { return _gone; }
  // How many are not after this time.
  std::size_t until(std::uint64_t atMs) const;

 private:
  std::size_t _most;
  std::uint64_t _gone = 0;
  std::deque<Happening> _happenings;
  std::deque<std::uint64_t> _atMs;  // of each
};

}  // namespace qel
