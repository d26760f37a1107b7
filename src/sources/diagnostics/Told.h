// Which metrics a packet said something about.
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>

namespace qel::diagnostics {

// In the order in which they were told, each once.
class Told {
 public:
  void tell(std::uint32_t metric) {
    if (!contains(metric) && _count < _metrics.size()) _metrics[_count++] = metric;
  }
  void clear() { _count = 0; }

  bool contains(std::uint32_t metric) const { return std::find(begin(), end(), metric) != end(); }
  bool empty() const { return _count == 0; }
  std::size_t size() const { return _count; }
  const std::uint32_t* begin() const { return _metrics.data(); }
  const std::uint32_t* end() const { return _metrics.data() + _count; }

 private:
  static constexpr std::size_t kMost = 31;  // as many as there are metrics
  std::array<std::uint32_t, kMost> _metrics{};
  std::size_t _count = 0;
};

}  // namespace qel::diagnostics
