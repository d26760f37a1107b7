// Recordings as files: plain or compressed, whole or damaged.

#include <algorithm>

#include "base/Rendering.h"
#include "fuzz/support/Law.h"
#include "fuzz/support/MemoryFile.h"
#include "fuzz/support/Target.h"
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
  const bool isRaw = (input.byte() & 1) != 0;
  const MemoryFile file(isRaw ? input.rest() : damaged(input));
  const std::size_t strict = readAll(file.path(), RecordingReader::BadLines::fail);
  const std::size_t lenient = readAll(file.path(), RecordingReader::BadLines::skip);
  law(strict <= lenient, "skipping bad lines loses no good one");
}

}  // namespace qel::fuzz
