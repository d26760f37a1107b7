// What comes from a diagnostics port, whatever calls itself a modem there: frames, and the packets
// in them.

#include <algorithm>
#include <vector>

#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "sources/diagnostics/packets/PacketReader.h"
#include "sources/diagnostics/port/FrameReader.h"
#include "support/diagnostics/Packets.h"

namespace qel::fuzz {
namespace {

using namespace diagnostics;

std::vector<Bytes> packetsOf(FrameReader& reader, ByteView stream, std::size_t piece) {
  std::vector<Bytes> packets;
  while (!stream.empty()) {
    const std::size_t length = std::min(piece, stream.size());
    // In memory that ends where the piece ends.
    const Bytes exact(stream.begin(), stream.begin() + static_cast<std::ptrdiff_t>(length));
    reader.add(exact, [&](ByteView packet) { packets.emplace_back(packet.begin(), packet.end()); });
    stream = stream.subspan(length);
  }
  return packets;
}

// What is handed over lies within the packet.
class Listener final : public PacketSink {
 public:
  void look(ByteView packet) {
    _packet = packet;
    _handed = 0;
    _reader.take(packet);
    const PacketReader::Counts& counts = _reader.counts();
    law(_handed > 0 || counts.damaged > _damaged, "a packet says something or is damaged");
    _damaged = counts.damaged;
  }

  void log(const LogPacket& packet) override {
    hand(packet.body);
    law(packet.body.size() + 16 <= _packet.size(), "a log has a head");
  }
  void event(const ModemEvent& event) override {
    hand(event.payload);
    law(event.id < 4096, "an event has a number of 12 bits");
    law(event.payload.size() < 256, "an event's payload has its length in a byte");
  }
  void answer(ByteView packet) override { hand(packet); }

 private:
  void hand(ByteView part) {
    ++_handed;
    const bool isWithin =
        part.empty() || (part.data() >= _packet.data() &&
                         part.data() + part.size() <= _packet.data() + _packet.size());
    law(isWithin, "what is handed over lies within the packet");
  }

  PacketReader _reader{*this};
  ByteView _packet;
  std::uint64_t _handed = 0;
  std::uint64_t _damaged = 0;
};

void tryPackets(const std::vector<Bytes>& packets) {
  Listener listener;
  for (const Bytes& packet : packets) listener.look(packet);
}

void tryStream(Input& input) {
  const std::size_t piece = 1 + input.number<std::uint16_t>();
  const Bytes stream = input.rest();
  FrameReader whole;
  FrameReader inPieces;
  const auto packets = packetsOf(whole, stream, stream.size());
  law(packets == packetsOf(inPieces, stream, piece), "it is all one how a stream is cut");
  whole.cut();
  inPieces.cut();
  law(whole.counts().frames == packets.size(), "every packet is counted");
  law(whole.counts().badFrames == inPieces.counts().badFrames, "so is every bad frame");
  for (const Bytes& packet : packets) {
    law(packet.size() + kCheckSumBytes <= FrameReader::kLongestFrame, "no packet is too long");
    FrameReader again;
    const Bytes frame = frameOf(packet);
    law(packetsOf(again, frame, frame.size()) == std::vector<Bytes>{packet},
        "what is framed comes back");
  }
  tryPackets(packets);
}

// With their check sums right.
void tryContents(Input& input) {
  std::vector<Bytes> packets;
  Bytes stream;
  while (!input.empty()) {
    const Bytes packet = input.piece();
    if (packet.empty()) continue;
    const Bytes frame = frameOf(packet);
    law(frame == test::framed(packet), "the quick check sum is that of the slow way");
    stream.insert(stream.end(), frame.begin(), frame.end());
    packets.push_back(packet);
  }
  FrameReader reader;
  law(packetsOf(reader, stream, stream.size()) == packets, "all that is framed comes back");
  tryPackets(packets);
}

}  // namespace

void tryInput(Input input) {
  if ((input.byte() & 1) != 0) {
    tryStream(input);
  } else {
    tryContents(input);
  }
}

}  // namespace qel::fuzz
