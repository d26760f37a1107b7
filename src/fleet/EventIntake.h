// Live events into the queue.
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <string_view>

#include "base/Clock.h"
#include "fleet/EventQueue.h"
#include "recording/privacy/IdentityHider.h"
#include "tesk/Message.h"

namespace qel::fleet {

// What is sent of an event.
enum class EventForm : std::uint8_t {
  recorded,  // its line of a recording
  decoded,   // its record in the units of the tables: see DecodedLine.h
};

// Any thread. Each event is on the disk before take() returns.
class EventIntake {
 public:
  struct Counts {
    std::uint64_t undecodable = 0;  // left out: without a form, or of a payload nobody can read
    std::uint64_t stripped = 0;     // sent without a value of unknown meaning
  };

  // Without a hider identities are kept. `added` is called after each event, with the size of its
  // line; or with 0 when it is lost.
  EventIntake(EventQueue& queue, EventForm form, std::unique_ptr<IdentityHider> hider,
              std::function<void(std::size_t bytes)> added, const Clock& clock = systemClock());

  void take(std::string_view eventName, const tesk::Message& event);
  Counts counts() const;

 private:
  EventQueue& _queue;
  const EventForm _form;
  const std::unique_ptr<IdentityHider> _hider;
  const std::function<void(std::size_t)> _added;
  const Clock& _clock;
  mutable std::mutex _mutex;
  std::uint64_t _shapeless = 0;
};

}  // namespace qel::fleet
