// Where events come from: a modem, a simulated one, or a recording.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "base/Value.h"
#include "sources/ListenerSignal.h"
#include "sources/SourceCondition.h"
#include "sources/SourceEvent.h"
#include "sources/SourceFacts.h"

namespace qel::sources {

// Takes the events of a source. Any thread, one event at a time.
class EventReceiver {
 public:
  enum class Taken { yes, nobodyListens };

  virtual ~EventReceiver() = default;
  // nobodyListens: the event went nowhere and was not counted; a source that can wait offers it
  // again after the signal that it was started with.
  virtual Taken take(const SourceEvent& event) = 0;
  // How it is with what stands behind the source, at first and at every change.
  virtual void conditionChanged(const SourceCondition& /*condition*/) {}
};

// What a source has to say to a query: the event dictionary, or one line why not.
struct SourceAnswer {
  bool known = true;  // the metric has a value now
  std::string message;
  std::uint64_t timeMs = 0;
  Dictionary entries;
};

// Events come on a thread of the source's own. start, stop and query may come from any thread, also
// from within an event.
class EventSource {
 public:
  virtual ~EventSource() = default;

  // Begins anew. The receiver is held only while it takes an event.
  virtual void start(std::weak_ptr<EventReceiver> receiver,
                     std::shared_ptr<ListenerSignal> listeners) = 0;
  // Asks the events to end and does not wait: one may still be on its way.
  virtual void stop() = 0;

  // The metric as it is now, by its 16-bit identifier.
  virtual SourceAnswer query(std::uint32_t metric) = 0;

  // One line that names it.
  virtual std::string description() const = 0;

  // Any thread, at any time; empty when there is nothing to say.
  virtual SourceFacts facts() const { return {}; }
};

}  // namespace qel::sources
