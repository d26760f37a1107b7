// The metrics of a raw log, to be played at the pace of its clock.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>

#include "sources/EventSequence.h"
#include "sources/diagnostics/files/RawLogEvents.h"

namespace qel::diagnostics {

// A query is answered with the newest event of the metric that has passed.
class DiagnosticsSequence final : public sources::EventSequence {
 public:
  DiagnosticsSequence(const std::string& path, unsigned radio);

  std::optional<sources::SourceEvent> next() override;
  void passed(const sources::SourceEvent& event) override;
  sources::SourceAnswer query(std::uint32_t metric) override;
  sources::SourceCondition condition() const override;
  sources::SourceFacts facts() const override;

 private:
  std::unique_ptr<RawLogEvents> _events;  // none: it can no longer be opened
  std::map<std::uint32_t, sources::SourceEvent> _newest;
  bool _ended = false;
};

}  // namespace qel::diagnostics
