#include "history/Journal.h"

#include <algorithm>
#include <cstring>
#include <iterator>

#include "base/FatalError.h"

namespace qel {
namespace {

constexpr std::size_t kChunkBytes = 32 * 1024;

template <class Number>
Number take(const std::uint8_t* content, std::size_t& position) {
  Number number;
  std::memcpy(&number, content + position, sizeof number);
  position += sizeof number;
  return number;
}

}  // namespace

void Journal::addElsewhere(std::size_t number, ByteView payload) {
  const bool isLong = payload.size() >= kLongSize;
  const std::size_t size = kHeadBytes + (isLong ? kLongBytes : 0) + payload.size();
  if (!_newest || !_newest->hasRoom(_lastMs, size)) beginChunk(_lastMs, size);
  std::uint8_t* at = begin(number, isLong ? kLongSize : payload.size(), size - kHeadBytes);
  if (isLong) {
    const auto length = static_cast<std::uint32_t>(payload.size());
    std::memcpy(at, &length, kLongBytes);
    at += kLongBytes;
  }
  copy(payload, at);
}

std::size_t Journal::know(const DispatchRow& row) {
  auto found = std::ranges::find(_rows, &row);
  if (found == _rows.end()) {
    found = std::ranges::find(_rows, nullptr);
    if (found == _rows.end()) fatalError("a journal of more metrics than there are");
    *found = &row;
  }
  return static_cast<std::size_t>(found - _rows.begin());
}

std::optional<std::size_t> Journal::find(std::int64_t metric) const {
  for (std::size_t i = 0; i < kMostRows && _rows[i]; ++i) {
    if (_rows[i]->identifier == metric) return i;
  }
  return std::nullopt;
}

// Gives back the room that it did not fill, if that is worth it.
void Journal::closeNewest() {
  Chunk& chunk = _chunks.back();
  if (chunk.size > chunk.capacity / 8 * 7) return;
  auto exact = std::make_unique_for_overwrite<std::uint8_t[]>(chunk.size);
  std::memcpy(exact.get(), chunk.content.get(), chunk.size);
  _bytes -= chunk.capacity - chunk.size;
  chunk.capacity = chunk.size;
  chunk.content = std::move(exact);
}

void Journal::beginChunk(std::uint64_t receivedMs, std::size_t size) {
  if (_newest) closeNewest();
  const std::size_t capacity = std::max(kChunkBytes, size);
  const auto isOld = [&](const Chunk& chunk) {
    return _limits.ageMs > 0 && receivedMs - chunk.toMs > _limits.ageMs;
  };
  while (!_chunks.empty() && (isOld(_chunks.front()) || _bytes + capacity > _limits.bytes)) {
    dropOldest();
  }
  _bytes += capacity;
  _chunks.push_back({receivedMs, receivedMs, 0, 0, capacity,
                     std::make_unique_for_overwrite<std::uint8_t[]>(capacity)});
  _newest = &_chunks.back();
}

void Journal::dropOldest() {
  const Chunk& chunk = _chunks.front();
  std::uint32_t newestOf = chunk.rows;
  for (auto later = std::next(_chunks.begin()); later != _chunks.end(); ++later) {
    newestOf &= ~later->rows;
  }
  for (std::size_t position = 0; newestOf != 0 && position < chunk.size;) {
    const Place place = read(chunk, position);
    if ((newestOf >> place.row & 1U) == 0) continue;
    const auto* payload = chunk.content.get() + place.begin;
    _kept[place.row] = Kept{place.receivedMs, {payload, payload + place.size}};
  }
  _bytes -= chunk.capacity;
  _chunks.pop_front();
}

Journal::Place Journal::read(const Chunk& chunk, std::size_t& position) {
  const std::uint8_t* content = chunk.content.get();
  Place place;
  const auto head = take<std::uint32_t>(content, position);
  place.receivedMs = chunk.fromMs + (head & kLongestMs);
  place.row = head >> (kTimeBits + kSizeBits);
  place.size = head >> kTimeBits & kLongSize;
  if (place.size == kLongSize) place.size = take<std::uint32_t>(content, position);
  place.begin = position;
  position += place.size;
  return place;
}

std::vector<Journal::Place> Journal::placesOf(const Chunk& chunk, std::size_t row,
                                              std::uint64_t fromMs, std::uint64_t toMs) {
  std::vector<Place> places;
  if ((chunk.rows >> row & 1U) == 0) return places;
  for (std::size_t position = 0; position < chunk.size;) {
    const Place place = read(chunk, position);
    if (place.receivedMs > toMs) break;
    if (place.row == row && place.receivedMs >= fromMs) places.push_back(place);
  }
  return places;
}

JournalEntry Journal::entry(const Chunk& chunk, const Place& place) const {
  return {_rows[place.row], place.receivedMs, {chunk.content.get() + place.begin, place.size}};
}

std::size_t Journal::chunksUntil(std::uint64_t atMs) const {
  const auto after =
      std::ranges::upper_bound(_chunks, atMs, {}, [](const Chunk& chunk) { return chunk.fromMs; });
  return static_cast<std::size_t>(after - _chunks.begin());
}

std::vector<JournalEntry> Journal::of(std::int64_t metric, std::uint64_t fromMs,
                                      std::uint64_t toMs) const {
  std::vector<JournalEntry> entries;
  const auto row = find(metric);
  if (!row) return entries;
  const std::size_t end = chunksUntil(toMs);
  for (std::size_t i = 0; i < end; ++i) {
    if (_chunks[i].toMs < fromMs) continue;
    for (const Place& place : placesOf(_chunks[i], *row, fromMs, toMs)) {
      entries.push_back(entry(_chunks[i], place));
    }
  }
  return entries;
}

void Journal::visit(std::uint64_t fromMs, std::uint64_t toMs,
                    const std::function<void(const JournalEntry&)>& visit) const {
  const auto first =
      std::ranges::lower_bound(_chunks, fromMs, {}, [](const Chunk& chunk) { return chunk.toMs; });
  for (auto chunk = first; chunk != _chunks.end() && chunk->fromMs <= toMs; ++chunk) {
    for (std::size_t position = 0; position < chunk->size;) {
      const Place place = read(*chunk, position);
      if (place.receivedMs > toMs) return;
      if (place.receivedMs >= fromMs) visit(entry(*chunk, place));
    }
  }
}

std::vector<JournalEntry> Journal::newest(std::int64_t metric, std::uint64_t atMs,
                                          std::size_t most) const {
  std::vector<JournalEntry> entries;
  const auto row = find(metric);
  if (!row) return entries;
  for (std::size_t i = chunksUntil(atMs); i-- > 0 && entries.size() < most;) {
    const auto places = placesOf(_chunks[i], *row, 0, atMs);
    for (auto place = places.rbegin(); place != places.rend() && entries.size() < most; ++place) {
      entries.push_back(entry(_chunks[i], *place));
    }
  }
  const auto& kept = _kept[*row];
  if (entries.size() < most && kept && kept->receivedMs <= atMs) {
    entries.push_back({_rows[*row], kept->receivedMs, kept->payload});
  }
  return entries;
}

template <class Take>
void Journal::forTimes(const Chunk& chunk, std::size_t row, std::uint64_t atMs, Take take) {
  for (std::size_t position = 0; position < chunk.size;) {
    const Place place = read(chunk, position);
    if (place.receivedMs > atMs) return;
    if (place.row == row) take(place.receivedMs);
  }
}

std::size_t Journal::newestTimes(std::int64_t metric, std::uint64_t atMs,
                                 std::span<std::uint64_t> times) const {
  std::size_t found = 0;
  const auto row = find(metric);
  if (!row) return found;
  for (std::size_t i = chunksUntil(atMs); i-- > 0 && found < times.size();) {
    const Chunk& chunk = _chunks[i];
    if ((chunk.rows >> *row & 1U) == 0) continue;
    std::size_t left = 0;
    forTimes(chunk, *row, atMs, [&left](std::uint64_t) { ++left; });
    const std::size_t before = found;
    found = std::min(found + left, times.size());
    forTimes(chunk, *row, atMs, [&](std::uint64_t time) {
      const std::size_t place = before + --left;
      if (place < found) times[place] = time;
    });
  }
  const auto& kept = _kept[*row];
  if (found < times.size() && kept && kept->receivedMs <= atMs) times[found++] = kept->receivedMs;
  return found;
}

std::optional<JournalEntry> Journal::last(std::int64_t metric, std::uint64_t atMs) const {
  const auto entries = newest(metric, atMs, 1);
  return entries.empty() ? std::nullopt : std::optional(entries.front());
}

std::optional<std::uint64_t> Journal::lastMs(std::uint64_t atMs) const {
  std::optional<std::uint64_t> last;
  const std::size_t chunks = chunksUntil(atMs);
  if (chunks == 0) return last;
  const Chunk& chunk = _chunks[chunks - 1];
  for (std::size_t position = 0; position < chunk.size;) {
    const Place place = read(chunk, position);
    if (place.receivedMs <= atMs) last = place.receivedMs;
  }
  return last;
}

}  // namespace qel
