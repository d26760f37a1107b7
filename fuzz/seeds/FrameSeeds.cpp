#include "fuzz/seeds/FrameSeeds.h"

#include "fuzz/support/Seed.h"
#include "support/diagnostics/Packets.h"

namespace qel::fuzz {
namespace {

using namespace diagnostics::test;

constexpr std::size_t kPackets = 0;
constexpr std::size_t kStream = 1;

Bytes stream(const Bytes& bytes) {
  return Seed().byte(kStream).number(std::uint16_t{16}).rest(bytes).bytes;
}

}  // namespace

std::vector<Bytes> frameSeeds() {
  const Bytes log = logPacket(0xB0C2, Bytes(29, 3));
  const Bytes events = eventPacket({{1606, {4}}, {1611, Bytes(5), kSomeTimeMs + 1, true}});
  const Bytes answer{0x73, 0, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0};
  return {
      stream(joined({framed(log), framed(wrapped(1, log)), framed(log, 9), framed(events)})),
      stream(joined({Bytes{0x7E}, framed(log), Bytes{0x7D, 0x7E}, framed(answer)})),
      Seed().byte(kPackets).piece(log).piece(events).piece(wrapped(2, events)).piece(answer).bytes,
  };
}

}  // namespace qel::fuzz
