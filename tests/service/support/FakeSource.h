// A source that sends what a test says, when it says so.
#pragma once

#include <memory>
#include <string>
#include <utility>

#include "sources/EventSource.h"
#include "tesk/Constants.h"

namespace qel::testing {

// What a test keeps in hand of a source that the core owns.
struct FakeSourceState {
  int starts = 0;
  int stops = 0;
  std::weak_ptr<sources::EventReceiver> receiver;
  std::shared_ptr<sources::ListenerSignal> listeners;
  std::uint32_t queried = 0;
  sources::SourceAnswer answer;

  sources::EventReceiver::Taken send(const sources::SourceEvent& event) const {
    return receiver.lock()->take(event);
  }
};

class FakeSource final : public sources::EventSource {
 public:
  explicit FakeSource(std::shared_ptr<FakeSourceState> state) : _state(std::move(state)) {}

  void start(std::weak_ptr<sources::EventReceiver> receiver,
             std::shared_ptr<sources::ListenerSignal> listeners) override {
    ++_state->starts;
    _state->receiver = std::move(receiver);
    _state->listeners = std::move(listeners);
  }
  void stop() override { ++_state->stops; }
  sources::SourceAnswer query(std::uint32_t metric) override {
    _state->queried = metric;
    return _state->answer;
  }
  std::string description() const override { return "a fake"; }

 private:
  std::shared_ptr<FakeSourceState> _state;
};

// An LTE RRC state that decodes.
inline const Bytes kRrcPayload = {0x08, 0xE8, 0x07, 0x10, 0x03, 0x20, 0xFA, 0x01};

inline sources::SourceEvent metricEvent(std::uint32_t metric, std::uint64_t timeMs = 1000,
                                        Bytes payload = kRrcPayload) {
  return {timeMs,
          tesk::kEventMetric,
          {{tesk::kKeyMetricID, std::int64_t{metric} + 0x3C0000},
           {tesk::kKeyProfileID, std::int64_t{0}},
           {tesk::kKeyPayload, std::move(payload)}}};
}

inline sources::SourceEvent triggerEvent(std::int64_t trigger) {
  return {1000, tesk::kEventTrigger, {{tesk::kKeyTriggerID, trigger}}};
}

}  // namespace qel::testing
