// What live lost because it came too fast.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <utility>

namespace qel::tools {

// Says it through `say`, every ten seconds at most, and what is unsaid at the end. Main thread
// only.
class LossReport {
 public:
  using Clock = std::chrono::steady_clock;

  explicit LossReport(std::function<void(const std::string&)> say) : _say(std::move(say)) {}

  // So many events were dropped so far.
  void note(std::uint64_t dropped, Clock::time_point now) {
    if (_saidAt && now - *_saidAt < std::chrono::seconds(10)) return;
    _saidAt = now;
    end(dropped);
  }

  void end(std::uint64_t dropped) {
    if (std::exchange(_said, dropped) == dropped) return;
    _say(std::to_string(dropped) + " events left out, which came faster than they were taken");
  }

 private:
  const std::function<void(const std::string&)> _say;
  std::optional<Clock::time_point> _saidAt;
  std::uint64_t _said = 0;
};

}  // namespace qel::tools
