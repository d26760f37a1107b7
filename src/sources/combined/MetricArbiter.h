// Decides, event by event, which of two sources is heard about a metric.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <vector>

#include "sources/SourceEvent.h"
#include "sources/combined/MetricPreference.h"

namespace qel::sources {

// The better source of a metric is heard from its first event on; the other one until then, and
// again when the better one is lost. One thread at a time.
class MetricArbiter {
 public:
  // Whether the event is to be sent. One that is not is kept, to stand in.
  bool lets(SourcePart part, const SourceEvent& event);
  // The better source of the metric has no value of it any more.
  void release(std::uint32_t metric) { _entries.erase(metric); }
  // That source tells nothing for now. What the other one last said in its place is to be sent,
  // if it still has a value of it.
  std::vector<SourceEvent> lose(SourcePart part);

 private:
  struct Entry {
    bool isHeld = false;                  // the better one has a value
    std::optional<SourceEvent> withheld;  // the other's newest
  };

  std::map<std::uint32_t, Entry> _entries;  // by metric, of which there are few
};

}  // namespace qel::sources
