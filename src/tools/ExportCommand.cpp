// qelctl export: a recording as tables, for spreadsheets and databases.

#include <CLI/CLI.hpp>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstring>
#include <memory>
#include <optional>
#include <string>

#include "base/Amounts.h"
#include "export/CsvSink.h"
#include "export/Exporter.h"
#include "export/SqliteSink.h"
#include "recording/RecordingReader.h"
#include "tools/Commands.h"
#include "tools/RecordProgress.h"
#include "tools/RecordingFeed.h"
#include "tools/SameFile.h"
#include "tools/StopSignals.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

using std::chrono::steady_clock;

constexpr const char* kCsv = "csv";
constexpr const char* kSqlite = "sqlite";

struct ExportOptions {
  RecordingOptions recording;
  std::string format;
  std::string out;
  bool keepIdentities = false;
  bool force = false;
};

std::unique_ptr<TableSink> begin(const ExportOptions& options) {
  if (isSameFile(options.recording.file, options.out)) {
    throw ToolError(EX_USAGE, options.out, "is the recording itself");
  }
  std::string error;
  std::unique_ptr<TableSink> sink;
  if (options.format == kCsv) {
    sink = CsvSink::create(options.out, options.force, error);
  } else {
    sink = SqliteSink::create(options.out, options.force, error);
  }
  if (sink) return sink;
  const bool isThere =
      error.ends_with(std::strerror(EEXIST)) || error.ends_with(std::strerror(ENOTEMPTY));
  throw ToolError(EX_IOERR, error + (isThere ? " (--force replaces what is there)" : ""));
}

// One export, from the file to what is in its place.
class Run {
 public:
  explicit Run(const ExportOptions& options) : _options(options) {}

  // 0, or the signal that ended it.
  int all();

 private:
  std::unique_ptr<RecordingReader> open() const;
  void take(RecordedEvent event);
  void look();
  void summarize(const Exporter::Counts& counts);

  const ExportOptions& _options;
  RecordProgress _progress;
  const std::unique_ptr<RecordingReader> _reader = open();
  const StopSignals _signals{StopSignals::Waiting::fails};  // before anything is made
  const std::unique_ptr<TableSink> _sink = begin(_options);
  std::optional<IdentityHider> _hider;
  std::optional<Exporter> _exporter;
  steady_clock::time_point _shownAt = steady_clock::now();
  std::uint64_t _undecodable = 0;
};

std::unique_ptr<RecordingReader> Run::open() const {
  using BadLines = RecordingReader::BadLines;
  RecordingFault fault;
  auto reader = RecordingReader::open(
      _options.recording.file, _options.recording.skipBad ? BadLines::skip : BadLines::fail, fault);
  if (!reader) throw ToolError(fault.exitCode(), fault.message);
  return reader;
}

void Run::take(RecordedEvent event) {
  if (event.kind == RecordedKind::metric && !QuietDispatcher::isReadable(event.entries)) {
    ++_undecodable;
    if (_options.recording.skipBad) return;
    throw ToolError(EX_DATAERR,
                    _options.recording.file + ":" + std::to_string(_reader->lineNumber()),
                    "the payload of metric " +
                        std::to_string(*event.entries.find(kRecordedMetricKey)->asInt64()) +
                        " cannot be decoded (--skip-bad passes over it)");
  }
  if (!_exporter->take(std::move(event))) throw ToolError(EX_IOERR, _sink->error());
}

void Run::look() {
  constexpr auto kPause = std::chrono::milliseconds(250);
  const auto now = steady_clock::now();
  if (now < _shownAt + kPause) return;
  _shownAt = now;
  // Of a pipe nobody knows how long it is.
  const float share = _reader->share();
  _progress.show(_options.recording.file + ": " +
                 (share > 0 ? std::to_string(static_cast<int>(100 * share)) + " %"
                            : counted(_exporter->counts().events, "event")));
}

void Run::summarize(const Exporter::Counts& counts) {
  std::string text = _options.out + ": " + counted(counts.events, "event") + " in " +
                     counted(counts.tables, "table") + ", " +
                     counted(counts.happenings, "happening");
  if (counts.without > 0) {
    text += ", " + counted(counts.without, "event") + " without a message class left out";
  }
  // The one that hides knows more of them: of classes that the screens do not show.
  const std::uint64_t undecodable = _undecodable + (_hider ? _hider->undecodable() : 0);
  if (undecodable > 0) text += ", " + counted(undecodable, "undecodable event") + " left out";
  if (_reader->cutOff()) _progress.say(*_reader->cutOff());
  if (_reader->skippedLines() > 0) {
    _progress.say(_options.recording.file +
                  ": bad lines skipped: " + std::to_string(_reader->skippedLines()));
  }
  _progress.say(text + (_options.keepIdentities ? ", identities kept" : ", identities hidden"));
}

int Run::all() {
  if (!_options.keepIdentities) _hider.emplace(Pseudonyms::random());
  _exporter.emplace(*_sink, _hider ? &*_hider : nullptr);
  while (_signals.arrived() == 0) {
    auto event = _reader->next();
    if (!event) break;
    take(std::move(*event));
    look();
  }
  if (_signals.arrived() != 0) return _signals.arrived();
  if (_reader->fault()) throw ToolError(_reader->fault()->exitCode(), _reader->fault()->message);
  if (!_exporter->finish()) throw ToolError(EX_IOERR, _sink->error());
  summarize(_exporter->counts());
  return 0;
}

// A signal ends the program as it would have, but with nothing left behind.
void run(const ExportOptions& options) {
  const int signal = Run(options).all();
  if (signal != 0) std::raise(signal);
}

}  // namespace

void addExportCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand(
      "export", "Write a recording as tables (CSV or SQLite), with identities hidden");
  command->footer(
      "One file or table a message class, in the units of the screens, with times in UTC; an "
      "entry\n"
      "of a list is a row. Beside them \"happenings\". Subscriber and temporary identities, SIM "
      "file\n"
      "contents and addresses are replaced by pseudonyms; cells and areas stay.");
  const auto options = std::make_shared<ExportOptions>();
  addRecordingOptions(*command, options->recording);
  command->add_option("--format", options->format, "csv or sqlite")
      ->required()
      ->type_name("FORMAT")
      ->check(CLI::IsMember({kCsv, kSqlite}).description(""));
  command->add_option("--out", options->out, "Folder of the CSV files, or database")
      ->required()
      ->type_name("DIR|FILE");
  command->add_flag("--keep-identities", options->keepIdentities, "Write them as they are");
  command->add_flag("--force", options->force, "Replace the database, or the tables in the folder");
  command->callback([options, &chosen] { chosen = [options](Output&) { run(*options); }; });
}

}  // namespace qel::tools
