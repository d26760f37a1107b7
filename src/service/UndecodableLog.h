// Log lines about events that are not delivered, a few at a time.
#pragma once

#include <cstdint>
#include <mutex>
#include <optional>
#include <string_view>

#include "base/Clock.h"

namespace qel::service {

// At most one line in ten seconds, with the number of those kept back since. Any thread.
class UndecodableLog {
 public:
  explicit UndecodableLog(const Clock& clock) : _clock(clock) {}
  void note(std::string_view reason);

 private:
  const Clock& _clock;
  std::mutex _mutex;
  std::optional<std::uint64_t> _lastLineMs;
  std::uint64_t _keptBack = 0;
};

}  // namespace qel::service
