#include "recording/LineSource.h"

#include <algorithm>
#include <utility>

#include "recording/LineLimits.h"

namespace qel {

std::unique_ptr<LineSource> LineSource::open(const std::string& path, std::string& error) {
  auto bytes = FileBytes::open(path, error);
  if (!bytes) return nullptr;
  return std::unique_ptr<LineSource>(new LineSource(std::move(bytes)));
}

bool LineSource::fill() {
  if (!_ended) _chunk = _bytes->next();
  _ended = _chunk.empty();
  _bytesRead += _chunk.size();
  return !_ended;
}

std::string LineSource::error() const {
  return errorIsDamage() ? "damaged gzip data" : _bytes->error();
}

LineSource::Outcome LineSource::next(std::string_view& line) {
  const std::size_t size = _chunk.find('\n');
  if (size > kLongestLineBytes) return nextOfSeveralChunks(line);
  line = _chunk.substr(0, size);
  _chunk.remove_prefix(size + 1);
  return Outcome::line;
}

LineSource::Outcome LineSource::nextOfSeveralChunks(std::string_view& line) {
  _parts.clear();
  bool tooLong = false;
  while (!_chunk.empty() || fill()) {
    const std::size_t size = std::min(_chunk.find('\n'), _chunk.size());
    tooLong = tooLong || _parts.size() + size > kLongestLineBytes;
    if (!tooLong) _parts.append(_chunk, 0, size);
    const bool isWhole = size < _chunk.size();
    _chunk.remove_prefix(size + (isWhole ? 1 : 0));
    if (!isWhole) continue;
    line = _parts;
    return tooLong ? Outcome::tooLong : Outcome::line;
  }
  line = _parts;
  const FileBytes::End why = _bytes->end();
  if (why == FileBytes::End::damaged || why == FileBytes::End::failed) return Outcome::failed;
  if (tooLong) return Outcome::tooLong;
  if (!line.empty()) return Outcome::unfinished;
  const bool isRest = why == FileBytes::End::notCompressed && !std::exchange(_restTold, true);
  return isRest ? Outcome::notCompressed : Outcome::end;
}

}  // namespace qel
