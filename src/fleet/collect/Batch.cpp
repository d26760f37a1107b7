#include "fleet/collect/Batch.h"

#include <algorithm>
#include <utility>

#include "recording/JsonLine.h"

namespace qel::fleet {
namespace {

using namespace std::chrono_literals;

constexpr std::size_t kBurst = 10;  // the fewest messages that brokers let be under way
constexpr auto kQuiet = 20ms;

}  // namespace

void Batch::add(std::string_view topic, std::string_view payload, Clock::time_point now) {
  if (_received++ == 0) _first = now;
  _last = now;
  PhoneMessage message = readPhoneMessage(topic, payload);
  if (const auto* none = std::get_if<NoMessage>(&message)) {
    ++_broken;
    _whyBroken = quoted(topic) + ": " + none->why;
    return;
  }
  const auto* event = std::get_if<NumberedEvent>(&message);
  _weight += event ? weightOf(*event) : sizeof message;
  _messages.push_back(std::move(message));
}

void Batch::clear() {
  _messages.clear();
  _received = 0;
  _weight = 0;
  _broken = 0;
}

std::optional<Batch::Clock::time_point> Batch::due() const {
  if (isEmpty()) return std::nullopt;
  if (isFull()) return _first;
  const auto latest = _first + _patience;
  return _received < kBurst ? latest : std::min<Clock::time_point>(latest, _last + kQuiet);
}

}  // namespace qel::fleet
