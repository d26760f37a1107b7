// Recordings as files: plain or compressed, whole or damaged.

#include <algorithm>

#include "base/Rendering.h"
#include "export/Exporter.h"
#include "fuzz/support/Law.h"
#include "fuzz/support/MemoryFile.h"
#include "fuzz/support/Target.h"
#include "history/recorded/RecordedHistory.h"
#include "recording/LineCompressor.h"
#include "recording/RecordingReader.h"

namespace qel::fuzz {
namespace {

void expectOneLine(const std::string& text) {
  law(text.find('\n') == std::string::npos, "a fault is one line");
}

// The events that can be read before the end or the first fault.
std::size_t readAll(const std::string& path, RecordingReader::BadLines badLines) {
  RecordingFault notOpened;
  const auto reader = RecordingReader::open(path, badLines, notOpened);
  law(reader != nullptr, "a file that is there can be opened");
  std::size_t events = 0;
  while (reader->next()) ++events;
  law(!reader->next(), "after the end comes nothing");
  if (reader->fault()) expectOneLine(reader->fault()->message);
  if (reader->cutOff()) expectOneLine(*reader->cutOff());
  if (badLines == RecordingReader::BadLines::fail) {
    law(reader->skippedLines() == 0, "nothing is skipped unasked");
  }
  return events;
}

// Looks at each row, and keeps none.
class LookingSink final : public TableSink {
 public:
  bool make(const Table&) override { return true; }
  bool put(const Table& table, const TableRow& row) override {
    law(row.size() == table.columns.size(), "a row has a cell for each column");
    law(row[0].asText().has_value(), "each row has a time");
    return true;
  }
  bool finish() override { return true; }
  const std::string& error() const override { return _none; }

 private:
  const std::string _none;
};

// As much as could be read, in tables.
void exportAll(const std::string& path) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(path, RecordingReader::BadLines::skip, fault);
  LookingSink sink;
  Exporter exporter(sink, nullptr);
  while (auto event = reader->next()) {
    const bool isMetric = event->kind == RecordedKind::metric;
    if (isMetric && !QuietDispatcher::isReadable(event->entries)) continue;
    law(exporter.take(std::move(*event)), "what can be decoded can be exported");
  }
  law(exporter.finish(), "an export comes to its end");
}

// As the viewer does, and to its moments.
void openAll(const std::string& path, std::size_t events) {
  RecordingFault fault;
  RecordedHistory::Limits limits;
  limits.eventsBetween = 2;
  limits.checkpoints = 3;
  const auto history = RecordedHistory::open(path, fault, limits);
  law(history != nullptr, "a file that is there can be opened");
  while (history->readOn(16)) {
  }
  law(history->events() <= events, "no more is opened than is there");
  law(history->beginMs() <= history->endMs(), "a recording ends after its beginning");
  history->storeAt(history->endMs());
  history->storeAt(history->beginMs());
  history->storeAt(history->beginMs() + (history->endMs() - history->beginMs()) / 2);
  for (const std::string& note : history->notes()) expectOneLine(note);
}

// A compressed text with some of its bytes replaced, and perhaps without its end.
Bytes damaged(Input& input) {
  Bytes file;
  const auto append = [&](const Bytes& part) { file.insert(file.end(), part.begin(), part.end()); };
  const std::size_t damages = input.below(4);
  Bytes places;
  for (std::size_t i = 0; i < 3 * damages; ++i) places.push_back(input.byte());
  const bool isCut = (input.byte() & 1) != 0;
  const std::size_t lost = input.number<std::uint16_t>();
  const Bytes text = input.rest();
  LineCompressor compressor;
  append(compressor.line(textOf(text)));
  append(compressor.end());
  for (std::size_t i = 0; i < damages; ++i) {
    const std::size_t place = places[3 * i] + 256U * places[3 * i + 1];
    file[place % file.size()] = places[3 * i + 2];
  }
  if (isCut) file.resize(file.size() - std::min(lost, file.size()));
  return file;
}

}  // namespace

void tryInput(Input input) {
  const std::uint8_t way = input.byte();
  const MemoryFile file((way & 1) != 0 ? input.rest() : damaged(input));
  const std::size_t strict = readAll(file.path(), RecordingReader::BadLines::fail);
  const std::size_t lenient = readAll(file.path(), RecordingReader::BadLines::skip);
  law(strict <= lenient, "skipping bad lines loses no good one");
  if ((way & 6) != 0) return;  // what follows takes a hundred times longer
  exportAll(file.path());
  openAll(file.path(), lenient);
}

}  // namespace qel::fuzz
