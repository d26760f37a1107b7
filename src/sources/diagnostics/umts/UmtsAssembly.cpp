#include "sources/diagnostics/umts/UmtsAssembly.h"

#include <cstdlib>

namespace qel::diagnostics {
namespace {

using rrc::umts::Segment;

constexpr unsigned kMasterBlock = 0;
constexpr unsigned kSfns = 2048;
constexpr int kBlockMs = 20;
// Between two segments of a block there are 32 frames at most (10.3.8.18, SIB_OFF).
constexpr unsigned kFurthest = 16;
// The modem stamps what it has read, which takes it more or less time.
constexpr std::int64_t kUnpunctualMs = 15;

void append(ByteView message, const Segment& segment, UmtsPart& part) {
  for (std::size_t i = segment.firstBit; i < segment.firstBit + segment.bits; ++i) {
    if (part.bits % 8 == 0) part.bytes.push_back(0);
    const unsigned bit = message[i / 8] >> (7 - i % 8) & 1U;
    part.bytes.back() |= static_cast<std::uint8_t>(bit << (7 - part.bits % 8));
    ++part.bits;
  }
}

bool follows(const UmtsPart& part, unsigned sfnPrime, std::uint64_t timeMs) {
  const unsigned blocks = (sfnPrime + kSfns - part.sfnPrime) % kSfns;
  if (blocks == 0 || blocks > kFurthest) return false;
  const auto passedMs = static_cast<std::int64_t>(timeMs - part.timeMs);
  return std::abs(passedMs - std::int64_t{kBlockMs} * blocks) <= kUnpunctualMs;
}

class Assembly {
 public:
  Assembly(ByteView message, unsigned sfnPrime, std::uint64_t timeMs, UmtsSegments& segments,
           const TakeUmtsBlock& take)
      : _message(message), _sfnPrime(sfnPrime), _timeMs(timeMs), _segments(segments), _take(take) {}

  void add(const Segment& segment) {
    auto& part = _segments.parts[segment.type];
    switch (segment.kind) {
      case Segment::Kind::whole:
        part = UmtsPart{};
        append(_message, segment, *part);
        return finish(segment.type);
      case Segment::Kind::first:
        part = UmtsPart{};
        part->count = segment.count;
        part->next = 1;
        append(_message, segment, *part);
        stamp(*part);
        return;
      case Segment::Kind::next:
      case Segment::Kind::last:
        return goOn(segment);
    }
  }

 private:
  void goOn(const Segment& segment) {
    auto& part = _segments.parts[segment.type];
    if (!part) return;
    const bool last = segment.kind == Segment::Kind::last;
    const bool inOrder = segment.index == part->next && last == (part->next + 1 == part->count);
    if (!inOrder || !follows(*part, _sfnPrime, _timeMs)) return part.reset();
    append(_message, segment, *part);
    stamp(*part);
    ++part->next;
    if (last) finish(segment.type);
  }

  void finish(unsigned type) {
    const Bytes block = std::move(_segments.parts[type]->bytes);
    _segments.parts[type].reset();
    if (type == kMasterBlock && block != _segments.master) {
      _segments.parts = {};
      _segments.master = block;
    }
    _take(type, block);
  }

  void stamp(UmtsPart& part) const {
    part.timeMs = _timeMs;
    part.sfnPrime = _sfnPrime;
  }

  ByteView _message;
  unsigned _sfnPrime;
  std::uint64_t _timeMs;
  UmtsSegments& _segments;
  const TakeUmtsBlock& _take;
};

}  // namespace

void assemble(const rrc::umts::BroadcastBlock& block, ByteView message, std::uint64_t timeMs,
              UmtsSegments& segments, const TakeUmtsBlock& take) {
  Assembly assembly(message, block.sfnPrime, timeMs, segments, take);
  for (const Segment& segment : block.segments) {
    if (segment.type < UmtsSegments::kTypes) assembly.add(segment);
  }
}

}  // namespace qel::diagnostics
