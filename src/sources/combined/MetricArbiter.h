// Decides, event by event, which of two sources is heard about a metric.
#pragma once

#include <cstdint>
#include <map>
#include <vector>

#include "sources/SourceEvent.h"
#include "sources/combined/MetricPreference.h"

namespace qel::sources {

// The better source of a metric is heard from its first event on; the other one until then, and
// again when the better one is lost. One thread at a time.
class MetricArbiter {
 public:
  // ModemManager's metrics come again every few seconds: one that has stayed away for so long has
  // no value there any more.
  static constexpr std::uint64_t kManagerSilentMs = 15'000;

  // Whether the event is to be sent.
  bool lets(SourcePart part, const SourceEvent& event);
  // That source tells nothing for now. What the other one last said in its place is to be sent.
  std::vector<SourceEvent> lose(SourcePart part);

 private:
  struct Entry {
    bool isHeld = false;                // the better one has a value
    std::uint64_t toldMs = 0;           // by the better one
    std::vector<SourceEvent> withheld;  // the other's newest, at most one
  };

  std::map<std::uint32_t, Entry> _entries;  // by metric, of which there are few
};

}  // namespace qel::sources
