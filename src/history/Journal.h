// The payloads of the last minutes, as they came.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "base/Bytes.h"
#include "metrics/DispatchTable.h"

namespace qel {

// One report. The payload is valid until the journal takes the next one.
struct JournalEntry {
  const DispatchRow* row = nullptr;
  std::uint64_t receivedMs = 0;
  ByteView payload;
};

// In the order in which they came; the oldest go when they are too old or too many. The newest of
// each metric stays, whatever its age.
class Journal {
 public:
  struct Limits {
    std::uint64_t ageMs = 10 * 60 * 1000;  // 0: any
    std::size_t bytes = 4 * 1024 * 1024;   // of payloads and their places
  };

  Journal() = default;
  explicit Journal(const Limits& limits) : _limits(limits) {}

  void add(const DispatchRow& row, std::uint64_t receivedMs, ByteView payload);

  // Those of one metric within both times, oldest first.
  std::vector<JournalEntry> of(std::int64_t metric, std::uint64_t fromMs, std::uint64_t toMs) const;
  // The newest of one metric that is not after this time.
  std::optional<JournalEntry> last(std::int64_t metric, std::uint64_t atMs) const;

 private:
  Limits _limits;
};

}  // namespace qel
