#include "sources/recording/RecordingSequence.h"

#include <sys/stat.h>
#include <sysexits.h>

#include <optional>
#include <utility>

#include "base/LogSink.h"
#include "base/Weight.h"
#include "messages/catalogue/EventNames.h"

namespace qel::sources {
namespace {

// However large a file is, its first event does not wait for the rest of it.
constexpr std::uint64_t kLookedAt = std::uint64_t{4} * 1024 * 1024;

SourceEvent serviceEvent(RecordedEvent event) {
  const auto stream = event.kind == RecordedKind::metric ? tesk::kEventMetric : tesk::kEventTrigger;
  return {event.timeMs, stream, std::move(event.entries)};
}

SourceError errorOf(const RecordingFault& fault) { return {fault.exitCode(), fault.message}; }

}  // namespace

bool EventOfMetric::mayKeep(std::uint32_t metric, const SourceEvent& event) const {
  constexpr std::size_t kMostMetrics = 256;
  constexpr std::size_t kLargestEvent = 64 * 1024;  // bytes, roughly
  return (_events.size() < kMostMetrics || _events.contains(metric)) &&
         weightOf(event.entries) <= kLargestEvent;
}

void EventOfMetric::keepFirst(SourceEvent event) {
  const auto metric = metricOf(event);
  if (!metric || _events.contains(*metric) || !mayKeep(*metric, event)) return;
  _events.emplace(*metric, std::move(event));
}

void EventOfMetric::keepNewest(const SourceEvent& event) {
  const auto metric = metricOf(event);
  if (metric && mayKeep(*metric, event)) _events.insert_or_assign(*metric, event);
}

const SourceEvent* EventOfMetric::find(std::uint32_t metric) const {
  const auto found = _events.find(metric);
  return found == _events.end() ? nullptr : &found->second;
}

bool checkRecording(const std::string& path, EventOfMetric& firsts, SourceError& error) {
  struct stat status {};
  if (::stat(path.c_str(), &status) == 0 && !S_ISREG(status.st_mode)) {
    // It is read more than once.
    error = {EX_NOINPUT, path + ": not a regular file"};
    return false;
  }
  RecordingFault fault;
  const auto reader = RecordingReader::open(path, RecordingReader::BadLines::fail, fault);
  if (!reader) {
    error = errorOf(fault);
    return false;
  }
  auto recorded = reader->next();
  const bool any = recorded.has_value();
  while (recorded && reader->bytes() <= kLookedAt) {
    firsts.keepFirst(serviceEvent(std::move(*recorded)));
    recorded = reader->next();
  }
  if (reader->fault()) {
    error = errorOf(*reader->fault());
    return false;
  }
  firsts.isOfWholeFile = !recorded;
  if (!any) error = {EX_DATAERR, path + ": no event in it"};
  return any;
}

RecordingSequence::RecordingSequence(std::string path, bool loops,
                                     std::shared_ptr<const EventOfMetric> firsts)
    : _path(std::move(path)), _loops(loops), _firsts(std::move(firsts)) {
  reopen();
}

void RecordingSequence::endEarly(const RecordingFault& fault) {
  systemLog().write(fault.message);
  _whyEarly = fault.inFile.empty() ? "it cannot be read any more" : fault.inFile;
  _reader.reset();
}

bool RecordingSequence::reopen() {
  RecordingFault fault;
  _reader = RecordingReader::open(_path, RecordingReader::BadLines::fail, fault);
  if (!_reader) endEarly(fault);
  return _reader != nullptr;
}

std::optional<SourceEvent> RecordingSequence::read() {
  if (!_reader) return std::nullopt;
  auto event = _reader->next();
  if (event) return serviceEvent(std::move(*event));
  if (_reader->cutOff() && !std::exchange(_cutOffTold, true)) {
    systemLog().write(*_reader->cutOff());
  }
  if (_reader->fault()) endEarly(RecordingFault(*_reader->fault()));
  return std::nullopt;
}

std::optional<SourceEvent> RecordingSequence::next() {
  _beginsAnew = false;
  if (auto event = read()) return event;
  // One attempt: a file that has become empty must not be read for ever.
  _beginsAnew = _loops && _reader && reopen();
  auto first = _beginsAnew ? read() : std::nullopt;
  _ended = !first;
  return first;
}

SourceCondition RecordingSequence::condition() const {
  if (!_ended) return {"playing", "Recording is playing", ""};
  return {"ended", "Recording has ended", _whyEarly};
}

SourceAnswer RecordingSequence::query(std::uint32_t metric) {
  for (const EventOfMetric* events : {&std::as_const(_newest), _firsts.get()}) {
    if (const SourceEvent* found = events->find(metric)) {
      return {true, "", found->timeMs, found->entries};
    }
  }
  const bool isAllKnown = _firsts->isOfWholeFile || (_ended && _whyEarly.empty());
  const std::string none = "metric " + std::to_string(metric) + " is not in the recording";
  return {false, none + (isAllKnown ? "" : " so far"), 0, {}};
}

}  // namespace qel::sources
