// qelctl import: what a diagnostics port sent, into a recording.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <cerrno>
#include <cstring>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "base/TerminalText.h"
#include "recording/RecordingWriter.h"
#include "recording/privacy/IdentityHider.h"
#include "sources/diagnostics/files/RawLogEvents.h"
#include "tools/Commands.h"
#include "tools/MetricThinning.h"
#include "tools/PacketList.h"
#include "tools/SameFile.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

using diagnostics::RawLog;
using diagnostics::RawLogEvents;

struct ImportOptions {
  std::string file;
  std::string out;
  std::optional<double> everyS;
  std::optional<unsigned> radio;
  bool inspect = false;
  bool json = false;
  bool keepIdentities = false;
  bool force = false;
};

std::unique_ptr<RawLogEvents> open(const ImportOptions& options) {
  sources::SourceError error;
  auto log = RawLog::open(options.file, error);
  if (!log) throw ToolError(error.exitCode, error.message);
  return std::make_unique<RawLogEvents>(std::move(log), options.radio);
}

// A log without a single good frame is something else.
void check(const RawLog& log) {
  const auto& fault = log.fault();
  if (!fault.message.empty()) throw ToolError(fault.exitCode, fault.message);
  if (log.frames().frames > 0) return;
  throw ToolError(EX_DATAERR, log.name(), "no frame of a diagnostics port in it");
}

std::unique_ptr<RecordingWriter> begin(const ImportOptions& options) {
  if (options.out == "-") return RecordingWriter::onDescriptor(STDOUT_FILENO, "standard output");
  if (isSameFile(options.file, options.out)) {
    throw ToolError(EX_USAGE, options.out, "is the raw log itself");
  }
  using Existing = RecordingWriter::Existing;
  std::string error;
  auto writer = RecordingWriter::create(options.out, error,
                                        options.force ? Existing::replaced : Existing::refused);
  if (writer) return writer;
  const bool isThere = error.ends_with(std::strerror(EEXIST));
  throw ToolError(EX_IOERR, error + (isThere ? " (--force replaces it)" : ""));
}

// False when the recording cannot be written on.
bool write(RawLogEvents& events, const ImportOptions& options, IdentityHider* hider,
           RecordingWriter& writer) {
  MetricThinning thinning(options.everyS);
  while (auto event = events.next()) {
    if (!thinning.lets(*event)) continue;
    RecordedEvent recorded{event->timeMs, RecordedKind::metric, std::move(event->entries)};
    if (hider && !hider->hide(recorded)) continue;
    if (!writer.write(recorded)) return false;
  }
  return true;
}

void summarize(const RawLogEvents& events, const ImportOptions& options,
               const RecordingWriter& writer) {
  for (const std::string& line : summaryOf(events)) complain("qelctl", line);
  complain("qelctl", (options.out == "-" ? "standard output" : options.out) + ": " +
                         std::to_string(writer.eventsWritten()) + " events, " +
                         (options.keepIdentities ? "identities kept" : "identities hidden"));
}

void import(const ImportOptions& options) {
  const auto events = open(options);
  const auto writer = begin(options);
  std::optional<IdentityHider> hider;
  if (!options.keepIdentities) hider.emplace(Pseudonyms::random());
  const bool isWritten = write(*events, options, hider ? &*hider : nullptr, *writer);
  const bool isWhole = writer->close() && isWritten;
  if (writer->errorNumber() == EPIPE) return;
  summarize(*events, options, *writer);
  if (!isWhole) throw ToolError(EX_IOERR, writer->error());
  check(events->log());
}

void inspect(const ImportOptions& options, Output& output) {
  const auto events = open(options);
  while (events->next()) {
  }
  if (options.json) {
    output.line(packetsAsJson(*events));
  } else {
    for (const std::string& line : packetsAsTable(*events)) output.line(line);
  }
  check(events->log());
}

}  // namespace

void addImportCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand(
      "import", "Make a recording of a modem's raw log (.qmdl, .mi2log), with identities hidden");
  command->footer(
      "Events bear the modem's time. Subscriber and temporary identities, SIM file contents and\n"
      "addresses are replaced by pseudonyms. Cells and areas stay: a recording tells where the\n"
      "phone was.");
  const auto options = std::make_shared<ImportOptions>();
  command->add_option("FILE", options->file, "Raw log, plain or gzip; - is standard input")
      ->required();
  command->add_option("OUT", options->out,
                      "Recording to write, compressed when it ends in .gz; - is standard output");
  command->add_flag("--inspect", options->inspect, "List the packets and write nothing");
  command->add_flag("--json", options->json, "With --inspect: as one JSON object");
  command->add_option("--every", options->everyS, "Of each metric one event in so many seconds")
      ->type_name("SECONDS")
      ->check(CLI::Range(0.001, 1e9).description(""));
  command->add_option("--radio", options->radio, "Of a modem with several radios this one alone")
      ->type_name("N")
      ->check(CLI::Range(1, 16).description(""));
  command->add_flag("--keep-identities", options->keepIdentities, "Write them as they are");
  command->add_flag("--force", options->force, "Replace OUT");
  command->callback([options, &chosen] {
    if (options->inspect != options->out.empty()) {
      throw CLI::ValidationError(options->inspect ? "--inspect writes no OUT"
                                                  : "OUT or --inspect is required");
    }
    if (options->json && !options->inspect) throw CLI::ValidationError("--json needs --inspect");
    chosen = [options](Output& output) {
      options->inspect ? inspect(*options, output) : import(*options);
    };
  });
}

}  // namespace qel::tools
