// Events of a recording into tables: one for each message class that occurs, and the happenings.
#pragma once

#include <cstdint>
#include <map>

#include "export/MetricTable.h"
#include "export/Table.h"
#include "history/History.h"
#include "history/recorded/QuietDispatcher.h"
#include "recording/RecordedEvent.h"
#include "recording/privacy/IdentityHider.h"

namespace qel {

// Main thread only. After a false the sink tells why.
class Exporter {
 public:
  struct Counts {
    std::uint64_t events = 0;   // that are in a table
    std::uint64_t without = 0;  // of no message class
    std::uint64_t rows = 0;
    std::uint64_t happenings = 0;
    std::size_t tables = 0;  // of message classes
  };

  // Without a hider identities are kept. Both must outlive this.
  Exporter(TableSink& sink, IdentityHider* hider);

  // The next event. Its payload must be one that can be decoded, see QuietDispatcher.
  bool take(RecordedEvent event);
  // After the last one.
  bool finish();

  const Counts& counts() const { return _counts; }

 private:
  bool report(const RecordedEvent& event);
  bool tellHappenings();

  TableSink& _sink;
  IdentityHider* const _hider;
  std::map<std::uint32_t, MetricTable> _tables;
  History _history;
  QuietDispatcher _dispatcher;
  std::uint64_t _happeningsTold = 0;
  Counts _counts;
};

}  // namespace qel
