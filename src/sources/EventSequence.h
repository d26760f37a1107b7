// The events of a source one after the other, without threads or clocks.
#pragma once

#include <cstdint>
#include <optional>

#include "sources/EventSource.h"
#include "sources/SourceEvent.h"

namespace qel::sources {

// One thread at a time.
class EventSequence {
 public:
  virtual ~EventSequence() = default;
  // In time order; nothing at the end.
  virtual std::optional<SourceEvent> next() = 0;
  // Whether the event given last is the first of another round of the same events.
  virtual bool beginsAnew() const { return false; }
  // That event's moment has come.
  virtual void passed(const SourceEvent& /*event*/) {}
  // The metric as it is at the moment, by its 16-bit identifier.
  virtual SourceAnswer query(std::uint32_t metric) = 0;
  // What is to be known about where the events are from.
  virtual SourceFacts facts() const { return {}; }
  // How it is with what the events are from; changes with the end of the events at most.
  virtual SourceCondition condition() const { return {}; }
};

}  // namespace qel::sources
