// The events of a recording, as they were recorded.
#pragma once

#include <map>
#include <memory>
#include <string>

#include "recording/RecordingReader.h"
#include "sources/EventSequence.h"
#include "sources/SourceError.h"

namespace qel::sources {

// What answers queries: one event of each metric, by its 16-bit identifier. But for very large
// events, and for more metrics than any modem has: a file may hold as much as it likes.
class EventOfMetric {
 public:
  // The first that comes of each metric, or the newest.
  void keepFirst(SourceEvent event);
  void keepNewest(const SourceEvent& event);
  // Nothing where there is none.
  const SourceEvent* find(std::uint32_t metric) const;

  bool isOfWholeFile = false;  // so that the file has none of any other metric

 private:
  bool mayKeep(std::uint32_t metric, const SourceEvent& event) const;

  std::map<std::uint32_t, SourceEvent> _events;
};

// Looks at the beginning of the recording, the first 4 MiB of its text. Nothing when that is not
// sound, or holds no event: then `error` says why. `firsts` gets the first events of it.
bool checkRecording(const std::string& path, EventOfMetric& firsts, SourceError& error);

// Plays the file from its beginning, again and again when it loops. What is wrong with it is told
// when it is reached, and ends it. A query is answered with the newest event of the metric that has
// passed, else with one of `firsts`.
class RecordingSequence final : public EventSequence {
 public:
  RecordingSequence(std::string path, bool loops, std::shared_ptr<const EventOfMetric> firsts);

  std::optional<SourceEvent> next() override;
  bool beginsAnew() const override { return _beginsAnew; }
  void passed(const SourceEvent& event) override { _newest.keepNewest(event); }
  SourceAnswer query(std::uint32_t metric) override;
  SourceCondition condition() const override;

 private:
  std::optional<SourceEvent> read();
  bool reopen();
  void endEarly(const RecordingFault& fault);

  const std::string _path;
  const bool _loops;
  const std::shared_ptr<const EventOfMetric> _firsts;
  std::unique_ptr<RecordingReader> _reader;  // none: it cannot be read any more
  EventOfMetric _newest;
  bool _beginsAnew = false;
  bool _ended = false;
  bool _cutOffTold = false;
  std::string _whyEarly;
};

}  // namespace qel::sources
