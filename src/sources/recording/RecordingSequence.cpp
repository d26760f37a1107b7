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

SourceEvent serviceEvent(RecordedEvent event) {
  const auto stream = event.kind == RecordedKind::metric ? tesk::kEventMetric : tesk::kEventTrigger;
  return {event.timeMs, stream, std::move(event.entries)};
}

// Of what answers queries, in bytes, roughly; a file may hold as much as it likes.
constexpr std::size_t kMostMetricsKept = 256;
constexpr std::size_t kLargestEventKept = 64 * 1024;

bool mayKeep(const EventOfMetric& kept, std::uint32_t metric, const SourceEvent& event) {
  return (kept.size() < kMostMetricsKept || kept.contains(metric)) &&
         weightOf(event.entries) <= kLargestEventKept;
}

SourceError errorOf(const RecordingFault& fault) { return {fault.exitCode(), fault.message}; }

}  // namespace

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
  bool any = false;
  while (auto recorded = reader->next()) {
    any = true;
    SourceEvent event = serviceEvent(std::move(*recorded));
    const auto metric = metricOf(event);
    if (metric && mayKeep(firsts, *metric, event)) firsts.try_emplace(*metric, std::move(event));
  }
  if (reader->fault()) {
    error = errorOf(*reader->fault());
    return false;
  }
  if (reader->cutOff()) systemLog().write(*reader->cutOff());
  if (!any) error = {EX_DATAERR, path + ": no event in it"};
  return any;
}

RecordingSequence::RecordingSequence(std::string path, bool loops,
                                     std::shared_ptr<const EventOfMetric> firsts)
    : _path(std::move(path)), _loops(loops), _firsts(std::move(firsts)) {
  reopen();
}

bool RecordingSequence::reopen() {
  RecordingFault fault;
  _reader = RecordingReader::open(_path, RecordingReader::BadLines::fail, fault);
  // It was sound when the source was made; that it no longer is ends the events.
  if (!_reader) systemLog().write(fault.message);
  return _reader != nullptr;
}

std::optional<SourceEvent> RecordingSequence::read() {
  if (!_reader) return std::nullopt;
  auto event = _reader->next();
  if (event) return serviceEvent(std::move(*event));
  if (_reader->fault()) {
    systemLog().write(_reader->fault()->message);
    _reader.reset();
  }
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
  return {"ended", "Recording has ended", _reader ? "" : "it cannot be read any more"};
}

void RecordingSequence::passed(const SourceEvent& event) {
  const auto metric = metricOf(event);
  if (metric && mayKeep(_newest, *metric, event)) _newest.insert_or_assign(*metric, event);
}

SourceAnswer RecordingSequence::query(std::uint32_t metric) {
  for (const EventOfMetric* events : {&std::as_const(_newest), _firsts.get()}) {
    const auto found = events->find(metric);
    if (found != events->end()) {
      return {true, "", found->second.timeMs, found->second.entries};
    }
  }
  return {false, "metric " + std::to_string(metric) + " is not in the recording", 0, {}};
}

}  // namespace qel::sources
