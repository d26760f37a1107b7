// What something was, from when on.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <iterator>

namespace qel {

// Times never go back. Beyond `most` changes the oldest go: what was before them is not known.
template <class What>
class Timeline {
 public:
  explicit Timeline(std::size_t most) : _most(most) {}

  void set(std::uint64_t fromMs, What what) {
    _changes.push_back({fromMs, std::move(what)});
    if (_changes.size() > _most) _changes.pop_front();
  }

  // The one that holds at this time; null before the first.
  const What* at(std::uint64_t atMs) const {
    const auto after = afterTime(atMs);
    return after == _changes.begin() ? nullptr : &std::prev(after)->what;
  }
  const What* newest() const { return _changes.empty() ? nullptr : &_changes.back().what; }
  // Since when it holds; 0 before the first.
  std::uint64_t since(std::uint64_t atMs) const {
    const auto after = afterTime(atMs);
    return after == _changes.begin() ? 0 : std::prev(after)->fromMs;
  }

 private:
  struct Change {
    std::uint64_t fromMs;
    What what;
  };

  typename std::deque<Change>::const_iterator afterTime(std::uint64_t atMs) const {
    return std::upper_bound(
        _changes.begin(), _changes.end(), atMs,
        [](std::uint64_t time, const Change& change) { return time < change.fromMs; });
  }

  std::size_t _most;
  std::deque<Change> _changes;
};

}  // namespace qel
