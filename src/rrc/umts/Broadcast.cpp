#include "rrc/umts/Broadcast.h"

#include <algorithm>
#include <array>

#include "rrc/reader/Walker.h"
#include "rrc/umts_schema.h"

namespace qel::rrc::umts {
namespace {

struct KindRow {
  Mark mark;
  Segment::Kind kind;
};
constexpr std::array kKinds = {
    KindRow{mark::firstSegment, Segment::Kind::first},
    KindRow{mark::subsequentSegment, Segment::Kind::next},
    KindRow{mark::lastSegment, Segment::Kind::last},
    KindRow{mark::lastSegmentShort, Segment::Kind::last},
    KindRow{mark::completeSIB, Segment::Kind::whole},
};

Segment segmentFrom(const Node& node, Segment::Kind kind) {
  Segment segment{.kind = kind};
  take(node[mark::sibType], segment.type);
  take(node[mark::segCount], segment.count);
  take(node[mark::segmentIndex], segment.index);
  const Node fixed = node[mark::sibDataFixed];
  const BitRange data = (fixed ? fixed : node[mark::sibDataVariable]).bits();
  segment.firstBit = data.first;
  segment.bits = data.count;
  return segment;
}

}  // namespace

std::optional<BroadcastBlock> readBroadcastBlock(ByteView pdu) {
  const auto reading = walk(schema(), type::BCCHBCHMessage, pdu);
  if (!reading) return std::nullopt;
  BroadcastBlock block;
  const Node top = reading->top();
  take(top[mark::sfnPrime], block.sfnPrime);
  top.each([&](const Node& node) {
    if (node.mark() == mark::completeSIBList) {
      node.each([&](const Node& whole) {
        block.segments.push_back(segmentFrom(whole, Segment::Kind::whole));
      });
      return;
    }
    const auto* row = std::ranges::find(kKinds, node.mark(), &KindRow::mark);
    if (row != kKinds.end()) block.segments.push_back(segmentFrom(node, row->kind));
  });
  return block;
}

}  // namespace qel::rrc::umts
