#include "sources/diagnostics/packets/PacketReader.h"

#include <vector>

#include "sources/diagnostics/packets/Bits.h"
#include "sources/diagnostics/packets/DeviceTime.h"

namespace qel::diagnostics {
namespace {

constexpr std::uint8_t kLog = 0x10;
constexpr std::uint8_t kEvents = 0x60;
constexpr std::uint8_t kWrapper = 0x98;

constexpr std::size_t kWrapperBytes = 8;  // command, version, 2 bytes, radio
constexpr std::size_t kRadioOffset = 4;
constexpr std::size_t kLogHeadBytes = 16;    // command, waiting, two lengths, code, stamp
constexpr std::size_t kEventsHeadBytes = 3;  // command, length of what follows

// A stamp of 16 bits stands for bits 8-23 of the whole one. Stamps do not go back.
std::uint64_t wholeStamp(std::uint64_t last, std::uint64_t shortStamp) {
  constexpr std::uint64_t kWrap = 1U << 24;
  const std::uint64_t stamp = last / kWrap * kWrap + (shortStamp << 8);
  return stamp < (last & ~std::uint64_t{0xFF}) ? stamp + kWrap : stamp;
}

// Events one after the other, each from its head of 16 bits on.
class EventCutter {
 public:
  EventCutter(ByteView bytes, std::optional<std::uint64_t> stamp) : _left(bytes), _stamp(stamp) {}

  bool atEnd() const { return _left.empty(); }
  std::optional<std::uint64_t> stamp() const { return _stamp; }

  // Nothing when what is left does not hold it.
  std::optional<ModemEvent> next() {
    const auto head = take(2);
    if (!head) return std::nullopt;
    const std::uint32_t word = u16At(*head, 0);
    const bool isShort = bits(word, 15, 1) != 0;
    const auto stamp = take(isShort ? 2 : 8);
    if (!stamp || (isShort && !_stamp)) return std::nullopt;
    _stamp = isShort ? wholeStamp(*_stamp, u16At(*stamp, 0)) : u64At(*stamp, 0);
    const auto payload = takePayload(bits(word, 13, 2));
    if (!payload) return std::nullopt;
    ModemEvent event;
    event.id = static_cast<std::uint16_t>(bits(word, 0, 12));
    event.timeMs = deviceTimeMs(*_stamp);
    event.payload = *payload;
    return event;
  }

 private:
  // 0 to 2 bytes, or as many as a byte in front says.
  std::optional<ByteView> takePayload(std::uint32_t form) {
    if (form < 3) return take(form);
    const auto length = take(1);
    return length ? take((*length)[0]) : std::nullopt;
  }

  std::optional<ByteView> take(std::size_t count) {
    if (count > _left.size()) return std::nullopt;
    const ByteView taken = _left.first(count);
    _left = _left.subspan(count);
    return taken;
  }

  ByteView _left;
  std::optional<std::uint64_t> _stamp;
};

}  // namespace

void PacketReader::take(ByteView packet) {
  if (packet.empty()) return;
  if (packet[0] != kWrapper) {
    takeInner(packet, 0);
  } else if (packet.size() > kWrapperBytes) {
    takeInner(packet.subspan(kWrapperBytes), u32At(packet, kRadioOffset));
  } else {
    ++_counts.damaged;
  }
}

void PacketReader::takeInner(ByteView packet, unsigned radio) {
  const std::uint8_t command = packet[0];
  if (command == kLog) {
    if (!takeLog(packet, radio)) ++_counts.damaged;
  } else if (command == kEvents && packet.size() > kEventsHeadBytes) {
    if (!takeEvents(packet, radio)) ++_counts.damaged;
  } else {
    ++_counts.others[command];
    _sink.answer(packet);
  }
}

bool PacketReader::takeLog(ByteView packet, unsigned radio) {
  if (packet.size() < kLogHeadBytes) return false;
  const std::uint32_t length = u16At(packet, 2);  // from the fourth byte on; stands there twice
  if (length != u16At(packet, 4) || packet.size() != 4 + length) return false;
  ++_counts.logs;
  LogPacket log;
  log.code = static_cast<std::uint16_t>(u16At(packet, 6));
  log.timeMs = deviceTimeMs(u64At(packet, 8));
  log.radio = radio;
  log.body = packet.subspan(kLogHeadBytes);
  _sink.log(log);
  return true;
}

bool PacketReader::takeEvents(ByteView packet, unsigned radio) {
  if (packet.size() != kEventsHeadBytes + u16At(packet, 1)) return false;
  EventCutter cutter(packet.subspan(kEventsHeadBytes), _eventStamp);
  std::vector<ModemEvent> events;
  while (!cutter.atEnd()) {
    auto event = cutter.next();
    if (!event) return false;
    event->radio = radio;
    events.push_back(*event);
  }
  _eventStamp = cutter.stamp();
  _counts.events += events.size();
  for (const ModemEvent& event : events) _sink.event(event);
  return true;
}

}  // namespace qel::diagnostics
