// Log lines about what clients and sources send and the service does not take, a few at a time.
#pragma once

#include <cstdint>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>

#include "base/Clock.h"

namespace qel::service {

// At most one line in ten seconds, with the number of those kept back since. Any thread.
class UndecodableLog {
 public:
  // Every line begins with the text.
  explicit UndecodableLog(const Clock& clock,
                          std::string_view beginning = "baseband event not delivered: ")
      : _clock(clock), _beginning(beginning) {}
  void note(std::string_view reason);

 private:
  const Clock& _clock;
  const std::string _beginning;
  std::mutex _mutex;
  std::optional<std::uint64_t> _lastLineMs;
  std::uint64_t _keptBack = 0;
};

}  // namespace qel::service
