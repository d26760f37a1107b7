// What the receivers' gain control and the transmitter do, frame by frame: 0x4176.
#include "sources/Metrics.h"
#include "sources/diagnostics/packets/Bits.h"
#include "sources/diagnostics/umts/UmtsReaders.h"

namespace qel::diagnostics {
namespace {

constexpr unsigned kEdition = 2;
constexpr std::size_t kHead = 10;
constexpr std::size_t kUncounted = 4;  // of the length that it says of itself
constexpr std::size_t kFrame = 55;     // of 10 ms

// Where a frame has what.
constexpr std::size_t kFlags = 0;
constexpr std::array<unsigned, UmtsSignal::kReceivers> kReceiving = {0, 4};  // bits of the flags
constexpr std::array<std::size_t, UmtsSignal::kReceivers> kReceived = {6, 14};
constexpr std::size_t kTransmitted = 22;

constexpr int kReceiverOff = -512;
constexpr int kNotSending = -1028;

double receivedDbm(double mean) { return (mean + 512) / 10 - 106; }
double transmittedDbm(double mean) { return mean / 10 - 17.8; }

class Mean {
 public:
  void add(int value) {
    _sum += value;
    ++_count;
  }
  explicit operator bool() const { return _count != 0; }
  double value() const { return static_cast<double>(_sum) / _count; }

 private:
  long _sum = 0;
  int _count = 0;
};

struct Levels {
  std::array<Mean, UmtsSignal::kReceivers> received;
  Mean transmitted;
};

void add(ByteView frame, Levels& levels) {
  for (std::size_t i = 0; i < kReceived.size(); ++i) {
    const int level = s16At(frame, kReceived[i]);
    const bool receiving = bits(frame[kFlags], kReceiving[i], 1) != 0;
    if (receiving && level != kReceiverOff) levels.received[i].add(level);
  }
  const int sent = s16At(frame, kTransmitted);
  if (sent != kNotSending) levels.transmitted.add(sent);
}

std::optional<Levels> levelsIn(ByteView body) {
  if (body.size() < kHead) return std::nullopt;
  const std::size_t frames = body[8];
  if (body.size() != kHead + frames * kFrame || u16At(body, 6) + kUncounted != body.size())
    return std::nullopt;
  Levels levels;
  for (std::size_t i = 0; i < frames; ++i) add(body.subspan(kHead + i * kFrame, kFrame), levels);
  return levels;
}

}  // namespace

// The levels of a packet's frames as their mean: it is logged when its frames are full.
Outcome readUmtsGainControl(const LogPacket& packet, Picture& picture, Told& told) {
  if (packet.body.empty()) return Outcome::damaged;
  if (packet.body[0] != kEdition) return Outcome::unknownVersion;
  const auto levels = levelsIn(packet.body);
  if (!levels) return Outcome::damaged;
  // A phone on another technology looks for cells here: what it hears then is no serving cell's.
  if (picture.technology && *picture.technology != Technology::umts) return Outcome::understood;
  UmtsPicture& umts = picture.umts;
  bool heard = false;
  for (std::size_t i = 0; i < levels->received.size(); ++i) {
    const Mean& mean = levels->received[i];
    if (!mean) continue;
    umts.signal.rssiDbm[i] = UmtsLevel{receivedDbm(mean.value()), packet.timeMs};
    heard = true;
  }
  if (heard) told.tell(metric::kUmtsServingMeasurement);
  if (levels->transmitted) {
    umts.transmitDbm = UmtsLevel{transmittedDbm(levels->transmitted.value()), packet.timeMs};
    told.tell(metric::kUmtsTxPower);
  }
  return Outcome::understood;
}

}  // namespace qel::diagnostics
