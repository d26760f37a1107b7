// Messages that wait to be stored together.
#pragma once

#include <chrono>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "fleet/collect/PhoneMessage.h"

namespace qel::fleet {

// One thread.
class Batch {
 public:
  using Clock = std::chrono::steady_clock;

  Batch(std::size_t mostMessages, std::chrono::milliseconds patience)
      : _most(mostMessages), _patience(patience) {}

  // Whatever came: also a message that is none must be acknowledged in its turn.
  void add(std::string_view topic, std::string_view payload, Clock::time_point now);
  void clear();

  bool isEmpty() const { return _received == 0; }
  bool isFull() const { return _received >= _most || _weight >= kMostBytes; }
  // When it is to be stored at the latest; nothing while it is empty. Earlier than its patience
  // where a burst has stopped: the broker may wait for answers.
  std::optional<Clock::time_point> due() const;

  std::span<const PhoneMessage> messages() const { return _messages; }
  // Those that were none, and why the last one was.
  std::uint64_t broken() const { return _broken; }
  const std::string& whyBroken() const { return _whyBroken; }

 private:
  static constexpr std::size_t kMostBytes = 64 * 1024 * 1024;

  const std::size_t _most;
  const std::chrono::milliseconds _patience;
  std::vector<PhoneMessage> _messages;
  std::size_t _received = 0;
  std::size_t _weight = 0;
  Clock::time_point _first;
  Clock::time_point _last;
  std::uint64_t _broken = 0;
  std::string _whyBroken;
};

}  // namespace qel::fleet
