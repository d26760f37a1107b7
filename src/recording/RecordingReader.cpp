#include "recording/RecordingReader.h"

#include <sysexits.h>

#include <utility>

#include "recording/EventLine.h"

namespace qel {

int RecordingFault::exitCode() const {
  switch (kind) {
    case Kind::notOpened:
      return EX_NOINPUT;
    case Kind::badData:
      return EX_DATAERR;
    case Kind::notRead:
      return EX_IOERR;
  }
  return EX_SOFTWARE;
}

std::unique_ptr<RecordingReader> RecordingReader::open(const std::string& path, BadLines badLines,
                                                       RecordingFault& fault) {
  std::string error;
  auto lines = LineSource::open(path, error);
  if (!lines) {
    fault = {RecordingFault::Kind::notOpened, path + ": " + error};
    return nullptr;
  }
  return std::unique_ptr<RecordingReader>(new RecordingReader(path, badLines, std::move(lines)));
}

RecordingReader::RecordingReader(std::string path, BadLines badLines,
                                 std::unique_ptr<LineSource> lines)
    : _path(std::move(path)), _badLines(badLines), _lines(std::move(lines)) {}

std::string RecordingReader::at(const std::string& reason) const {
  return _path + ":" + std::to_string(_lineNumber) + ": " + reason;
}

void RecordingReader::reject(const std::string& reason) {
  if (_badLines == BadLines::skip) {
    ++_skippedLines;
    return;
  }
  fail(RecordingFault::Kind::badData, reason);
}

void RecordingReader::fail(RecordingFault::Kind kind, const std::string& reason) {
  _fault = RecordingFault{kind, at(reason), "line " + std::to_string(_lineNumber) + ": " + reason};
  _ended = true;
}

std::optional<RecordedEvent> RecordingReader::take(LineSource::Outcome outcome) {
  if (outcome == LineSource::Outcome::tooLong) {
    reject("line too long");
    return std::nullopt;
  }
  if (outcome == LineSource::Outcome::notCompressed) {
    reject("not compressed, as what comes before it is");
    return std::nullopt;
  }
  auto parsed = parseEventLine(_line);
  if (auto* event = std::get_if<RecordedEvent>(&parsed)) return std::move(*event);
  const LineFault& bad = std::get<LineFault>(parsed);
  if (outcome == LineSource::Outcome::unfinished && !bad.isJson) {
    _cutOff = at("last line cut off");
  } else {
    reject(bad.reason);
  }
  return std::nullopt;
}

std::optional<RecordedEvent> RecordingReader::next() {
  while (!_ended) {
    const LineSource::Outcome outcome = _lines->next(_line);
    if (outcome == LineSource::Outcome::failed) {
      using Kind = RecordingFault::Kind;
      ++_lineNumber;
      fail(_lines->errorIsDamage() ? Kind::badData : Kind::notRead, _lines->error());
      break;
    }
    if (outcome == LineSource::Outcome::end) {
      if (_lines->streamCutOff() && !_cutOff)
        _cutOff = at("compressed stream cut off after this line");
      _ended = true;
      break;
    }
    ++_lineNumber;
    if (auto event = take(outcome)) return event;
  }
  return std::nullopt;
}

}  // namespace qel
