// The payloads of the last minutes, as they came.
#pragma once

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <vector>

#include "base/Bytes.h"
#include "metrics/DispatchTable.h"

namespace qel {

// One report. The payload is valid until the journal takes the next one.
struct JournalEntry {
  const DispatchRow* row = nullptr;
  std::uint64_t receivedMs = 0;
  ByteView payload;
};

// In the order in which they came; the oldest go when they are too old or too many. The newest of
// each metric stays, whatever its age. Times that go back are taken as the last one.
class Journal {
 public:
  struct Limits {
    std::uint64_t ageMs = 10 * 60 * 1000;  // 0: any
    std::size_t bytes = 4 * 1024 * 1024;   // of payloads and their places
  };

  Journal() = default;
  explicit Journal(const Limits& limits) : _limits(limits) {}
  Journal(const Journal&) = delete;
  Journal& operator=(const Journal&) = delete;

  // Makes a metric known and answers its number, from 0. No more than 32 different ones, whose rows
  // live as long as the journal.
  std::size_t know(const DispatchRow& row);
  void add(std::size_t number, std::uint64_t receivedMs, ByteView payload) {
    _lastMs = std::max(receivedMs, _lastMs);
    const bool isShort = payload.size() < kLongSize;
    if (!isShort || !_newest || !_newest->hasRoom(_lastMs, kHeadBytes + payload.size()))
        [[unlikely]] {
      return addElsewhere(number, payload);
    }
    copy(payload, begin(number, payload.size(), payload.size()));
  }
  void add(const DispatchRow& row, std::uint64_t receivedMs, ByteView payload) {
    add(know(row), receivedMs, payload);
  }

  // Those of one metric within both times, oldest first.
  std::vector<JournalEntry> of(std::int64_t metric, std::uint64_t fromMs, std::uint64_t toMs) const;
  // Calls `visit` for all within both times, oldest first.
  void visit(std::uint64_t fromMs, std::uint64_t toMs,
             const std::function<void(const JournalEntry&)>& visit) const;
  // The newest of one metric that is not after this time.
  std::optional<JournalEntry> last(std::int64_t metric, std::uint64_t atMs) const;
  // The newest of all that is not after this time.
  std::optional<std::uint64_t> lastMs(std::uint64_t atMs) const;
  // Up to `most` of one metric that are not after this time, newest first.
  std::vector<JournalEntry> newest(std::int64_t metric, std::uint64_t atMs, std::size_t most) const;
  // Only when they came, as many as there is room for; how many these are. Takes no memory.
  std::size_t newestTimes(std::int64_t metric, std::uint64_t atMs,
                          std::span<std::uint64_t> times) const;

  // What it holds, without the newest of metrics that are no more among the others.
  std::size_t bytes() const { return _bytes; }

 private:
  static constexpr std::size_t kMostRows = 32;
  // The head of an entry: milliseconds since the chunk's begin, size, row.
  static constexpr std::size_t kHeadBytes = 4;
  static constexpr unsigned kTimeBits = 16;
  static constexpr unsigned kSizeBits = 11;
  static constexpr std::uint64_t kLongestMs = (1U << kTimeBits) - 1;  // that a chunk covers
  static constexpr std::size_t kLongSize = (1U << kSizeBits) - 1;  // the size follows in four bytes
  static constexpr std::size_t kLongBytes = 4;

  // A run of entries: each a head of four bytes (and four more for a long payload) and its payload.
  struct Chunk {
    std::uint64_t fromMs = 0;
    std::uint64_t toMs = 0;
    std::uint32_t rows = 0;  // a bit for each that occurs
    std::size_t size = 0;
    std::size_t capacity = 0;
    std::unique_ptr<std::uint8_t[]> content;

    bool hasRoom(std::uint64_t atMs, std::size_t more) const {
      return atMs - fromMs <= kLongestMs && size + more <= capacity;
    }
  };
  // The last one of a row whose chunk has gone.
  struct Kept {
    std::uint64_t receivedMs = 0;
    std::vector<std::uint8_t> payload;
  };
  struct Place {
    std::size_t row = 0;
    std::size_t begin = 0;  // of the payload within the chunk
    std::size_t size = 0;
    std::uint64_t receivedMs = 0;
  };

  std::optional<std::size_t> find(std::int64_t metric) const;
  // Of the time that was set last.
  void addElsewhere(std::size_t number, ByteView payload);
  // The head of an entry, for which there is room; the place of the bytes that follow it.
  [[gnu::always_inline]] std::uint8_t* begin(std::size_t number, std::size_t size,
                                             std::size_t bytes) {
    Chunk& chunk = *_newest;
    const std::uint64_t what = number << kSizeBits | size;
    const auto head = static_cast<std::uint32_t>(what << kTimeBits | (_lastMs - chunk.fromMs));
    std::uint8_t* const at = chunk.content.get() + chunk.size;
    std::memcpy(at, &head, kHeadBytes);
    chunk.size += kHeadBytes + bytes;
    chunk.toMs = _lastMs;
    chunk.rows |= 1U << number;
    return at + kHeadBytes;
  }
  static void copy(ByteView bytes, std::uint8_t* to) {
    if (!bytes.empty()) std::memcpy(to, bytes.data(), bytes.size());
  }

  void beginChunk(std::uint64_t receivedMs, std::size_t size);
  void closeNewest();
  void dropOldest();
  static Place read(const Chunk& chunk, std::size_t& position);
  static std::vector<Place> placesOf(const Chunk& chunk, std::size_t row, std::uint64_t fromMs,
                                     std::uint64_t toMs);
  // Calls take(time) for each of the row's in the chunk that is not after this time.
  template <class Take>
  static void forTimes(const Chunk& chunk, std::size_t row, std::uint64_t atMs, Take take);
  JournalEntry entry(const Chunk& chunk, const Place& place) const;
  // How many of the chunks begin not after this time.
  std::size_t chunksUntil(std::uint64_t atMs) const;

  Limits _limits;
  std::array<const DispatchRow*, kMostRows> _rows{};
  std::array<std::optional<Kept>, kMostRows> _kept;
  std::deque<Chunk> _chunks;
  Chunk* _newest = nullptr;  // the last of them
  std::uint64_t _lastMs = 0;
  std::size_t _bytes = 0;
};

}  // namespace qel
