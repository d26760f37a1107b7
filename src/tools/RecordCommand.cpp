// qelctl record: live events into a recording.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstring>
#include <memory>
#include <optional>
#include <string>

#include "base/TimeAsleep.h"
#include "capture/RecordConnection.h"
#include "capture/Recorder.h"
#include "tesk/bus/BusConnector.h"
#include "tools/Commands.h"
#include "tools/MainLoop.h"
#include "tools/RecordProgress.h"
#include "tools/Service.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

using capture::RecordConnection;
using capture::Recorder;
using SteadyClock = MainLoop::Clock;
using Seconds = std::chrono::duration<double>;
using namespace std::chrono_literals;

struct RecordOptions {
  std::string file;
  std::string bus = "system";
  std::optional<double> durationS;
  std::optional<double> maxAgeS;
  std::optional<std::uint64_t> maxBytes;
  RecordingLimits limits;
  bool keepIdentities = false;
  bool force = false;
};

bool goesToStandardOutput(const RecordOptions& options) { return options.file == "-"; }

std::string nameOf(const RecordOptions& options) {
  return goesToStandardOutput(options) ? "standard output" : options.file;
}

RecordingLimits limitsOf(const RecordOptions& options) {
  RecordingLimits limits = options.limits;
  limits.fileBytes = options.maxBytes;
  if (options.maxAgeS) {
    limits.fileAge =
        std::chrono::duration_cast<std::chrono::milliseconds>(Seconds(*options.maxAgeS));
  }
  return limits;
}

std::unique_ptr<RotatingRecording> begin(const RecordOptions& options) {
  if (goesToStandardOutput(options)) {
    return RotatingRecording::onDescriptor(STDOUT_FILENO, nameOf(options));
  }
  using Existing = RotatingRecording::Existing;
  std::string error;
  auto recording = RotatingRecording::create(options.file, limitsOf(options),
                                             options.force ? Existing::replaced : Existing::refused,
                                             sleeplessNow(), error);
  if (recording) return recording;
  const bool isThere = error.ends_with(std::strerror(EEXIST));
  throw ToolError(EX_IOERR, error + (isThere ? " (--force replaces it)" : ""));
}

std::unique_ptr<IdentityHider> hiderOf(const RecordOptions& options) {
  if (options.keepIdentities) return nullptr;
  return std::make_unique<IdentityHider>(Pseudonyms::random());
}

std::string summary(const RecordOptions& options, const Recorder& recorder,
                    SteadyClock::duration duration, std::uint64_t lost) {
  const Recorder::Progress progress = recorder.progress();
  std::string text = nameOf(options) + ": " +
                     progressText(progress, std::chrono::floor<std::chrono::seconds>(duration));
  if (progress.filesFinished > 0) {
    text += ", " + std::to_string(progress.filesFinished) + " files finished before it";
  }
  if (progress.unrecordable > 0) {
    text += ", " + std::to_string(progress.unrecordable) + " undecodable events left out";
  }
  if (progress.stripped > 0) {
    text += ", " + std::to_string(progress.stripped) + " events without their unknown content";
  }
  if (lost > 0) {
    text += ", " + std::to_string(lost) + " events lost, which came faster than they were written";
  }
  return text + (options.keepIdentities ? ", identities kept" : ", identities hidden");
}

// Until the end that was asked for, or of what can be recorded.
void recordOn(const RecordOptions& options, MainLoop& loop, Recorder& recorder,
              RecordProgress& progress, SteadyClock::time_point start) {
  std::optional<SteadyClock::time_point> end;
  if (options.durationS) {
    end = start + std::chrono::duration_cast<SteadyClock::duration>(Seconds(*options.durationS));
  }
  SteadyClock::time_point nextLook = start;
  const auto turn = [&] {
    const auto next = end ? std::min(*end, nextLook) : nextLook;
    return SteadyClock::now() + (next - sleeplessNow());
  };
  while (loop.runOnce(turn())) {
    const auto now = sleeplessNow();
    if (end && now >= *end) return;
    if (now < nextLook) continue;
    nextLook = now + 1s;
    if (!recorder.tend()) return;
    progress.show(
        progressText(recorder.progress(), std::chrono::floor<std::chrono::seconds>(now - start)));
  }
}

void run(const RecordOptions& options) {
  MainLoop loop;
  if (goesToStandardOutput(options)) loop.watchStandardOutput();
  findResources();
  requireService(options.bus);
  Recorder recorder(begin(options), hiderOf(options));
  RecordProgress progress;
  const auto start = sleeplessNow();
  std::unique_ptr<RecordConnection> connection;
  const auto connector = tesk::bus::makeBusConnector(
      {options.bus},
      serviceObserver([&progress](const std::string& text) { progress.say(text); },
                      [&connection] { connection->begin(); }),
      loop.answerWaits());
  connection = std::make_unique<RecordConnection>(
      *connector, capture::kConsoleRecorder, options.bus, configuration(),
      [&recorder](std::string_view eventName, const tesk::Message& event) {
        recorder.take(eventName, event);
      });
  const auto begun = connection->begin();
  if (begun.code != 0) failWithoutService(begun.message);
  recordOn(options, loop, recorder, progress, start);
  const std::uint64_t lost = connection->end();
  connection.reset();
  const bool isWhole = recorder.close() && recorder.error().empty();
  if (recorder.errorNumber() == EPIPE) return;
  progress.say(summary(options, recorder, sleeplessNow() - start, lost));
  if (!isWhole) throw ToolError(EX_IOERR, recorder.error());
}

// A validator that leaves the help text to the option.
template <class Checked>
CLI::Validator silent(Checked validator) {
  return validator.description("");
}

void addLimitOptions(CLI::App& command, RecordOptions& options) {
  // Beyond any recording, and still a number of milliseconds.
  const auto seconds = silent(CLI::Range(0.001, 1e9));
  const auto bytes = silent(CLI::AsSizeValue(false));
  command.add_option("--duration", options.durationS, "End after this many seconds")
      ->type_name("SECONDS")
      ->check(seconds);
  command.add_option("--max-size", options.maxBytes, "Finish a file that has reached this size")
      ->type_name("BYTES|K|M|G")
      ->transform(bytes)
      ->check(silent(CLI::PositiveNumber));
  command.add_option("--max-age", options.maxAgeS, "Finish a file that is this old")
      ->type_name("SECONDS")
      ->check(seconds);
  command
      .add_option("--keep", options.limits.filesKept,
                  "Finished files that stay: FILE.1, the newest, to FILE.N")
      ->type_name("N")
      ->check(silent(CLI::Range(1, 9999)))
      ->capture_default_str();
  command
      .add_option("--min-free", options.limits.freeBytes,
                  "Stop when less is free on the disk; 64M unless given, 0 for no such limit")
      ->type_name("BYTES|K|M|G")
      ->transform(bytes);
}

}  // namespace

void addRecordCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("record", "Record live events, with identities hidden");
  command->footer(
      "Subscriber and temporary identities, SIM file contents and addresses are replaced by\n"
      "pseudonyms. Cells and areas stay: a recording tells where the phone was.\n"
      "It runs until SIGINT or SIGTERM, and goes on when the service comes back.");
  const auto options = std::make_shared<RecordOptions>();
  command
      ->add_option("FILE", options->file,
                   "Recording to write, compressed when it ends in .gz; - is standard output")
      ->required();
  addBusOption(*command, options->bus);
  command->add_flag("--keep-identities", options->keepIdentities, "Record them as they are");
  command->add_flag("--force", options->force, "Replace FILE and its finished files");
  addLimitOptions(*command, *options);
  command->callback([options, &chosen] {
    if (goesToStandardOutput(*options) && (options->maxBytes || options->maxAgeS)) {
      throw CLI::ValidationError("standard output has no size or age");
    }
    chosen = [options](Output&) { run(*options); };
  });
}

}  // namespace qel::tools
