#include "tools/RecordingFeed.h"

#include <CLI/CLI.hpp>

#include "base/TerminalText.h"
#include "history/History.h"
#include "history/ToldHappening.h"
#include "metrics/MetricValidator.h"
#include "recording/RecordingReader.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

ToolError asError(const RecordingFault& fault) { return {fault.exitCode(), fault.message}; }

void feed(const RecordingOptions& options, RecordedClock& clock, History* history,
          const std::function<void()>& afterEach) {
  using BadLines = RecordingReader::BadLines;
  RecordingFault notOpened;
  const auto reader = RecordingReader::open(
      options.file, options.skipBad ? BadLines::skip : BadLines::fail, notOpened);
  if (!reader) throw asError(notOpened);
  MetricValidator& validator = *MetricValidator::shared();
  while (auto event = reader->next()) {
    clock.set(event->timeMs);
    if (auto told = history ? happeningToldBy(*event) : std::nullopt)
      history->add(std::move(*told));
    const std::optional dictionary = std::move(event->entries);
    if (event->kind == RecordedKind::metric) {
      validator.metricsDidUpdate(dictionary);
    } else {
      validator.eventsDidUpdate(dictionary);
    }
    if (afterEach) afterEach();
  }
  if (reader->fault()) throw asError(*reader->fault());
  if (reader->cutOff()) complain("qelctl", *reader->cutOff());
  if (reader->skippedLines() > 0) {
    complain("qelctl",
             options.file + ": bad lines skipped: " + std::to_string(reader->skippedLines()));
  }
}

// Ends with the feeding, whatever ends that.
class Observing {
 public:
  Observing(MetricObserver& observer, const Clock& clock) {
    MetricValidator::shared()->setObserver(&observer, clock);
  }
  ~Observing() { MetricValidator::shared()->setObserver(nullptr); }
  Observing(const Observing&) = delete;
  Observing& operator=(const Observing&) = delete;
};

}  // namespace

void addRecordingOptions(CLI::App& command, RecordingOptions& options) {
  command.add_option("FILE", options.file, "Recording (.jsonl or .jsonl.gz)")->required();
  command.add_flag("--skip-bad", options.skipBad, "Count and skip lines that are no event");
}

void feedRecording(const RecordingOptions& options, const std::function<void()>& afterEach) {
  RecordedClock clock;
  feed(options, clock, nullptr, afterEach);
}

void feedRecording(const RecordingOptions& options, History& history,
                   const std::function<void()>& afterEach) {
  RecordedClock clock;
  const Observing observing(history, clock);
  feed(options, clock, &history, afterEach);
}

}  // namespace qel::tools
