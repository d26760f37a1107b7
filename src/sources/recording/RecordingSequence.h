// The events of a recording, as they were recorded.
#pragma once

#include <map>
#include <memory>
#include <string>

#include "recording/RecordingReader.h"
#include "sources/EventSequence.h"
#include "sources/SourceError.h"

namespace qel::sources {

// Metric events by their 16-bit identifier.
using EventOfMetric = std::map<std::uint32_t, SourceEvent>;

// Reads the whole recording once. Nothing when it is not whole and sound, or holds no event: then
// `error` says why. `firsts` gets the first event of every metric, but for very large events and
// for more metrics than any modem has.
bool checkRecording(const std::string& path, EventOfMetric& firsts, SourceError& error);

// Plays the file from its beginning, again and again when it loops. A query is answered with the
// newest event of the metric that has passed, else with the first in the file.
class RecordingSequence final : public EventSequence {
 public:
  RecordingSequence(std::string path, bool loops, std::shared_ptr<const EventOfMetric> firsts);

  std::optional<SourceEvent> next() override;
  bool beginsAnew() const override { return _beginsAnew; }
  void passed(const SourceEvent& event) override;
  SourceAnswer query(std::uint32_t metric) override;
  SourceCondition condition() const override;

 private:
  std::optional<SourceEvent> read();
  bool reopen();

  const std::string _path;
  const bool _loops;
  const std::shared_ptr<const EventOfMetric> _firsts;
  std::unique_ptr<RecordingReader> _reader;
  EventOfMetric _newest;
  bool _beginsAnew = false;
  bool _ended = false;
};

}  // namespace qel::sources
