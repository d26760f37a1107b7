#include "support/diagnostics/CardTrace.h"

#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {

CardTrace& CardTrace::toCard(const Bytes& bytes) {
  for (const std::uint8_t byte : bytes) _items.insert(_items.end(), {0x10, byte});
  return *this;
}

CardTrace& CardTrace::fromCard(const Bytes& bytes) {
  for (const std::uint8_t byte : bytes) _items.insert(_items.end(), {0x80, byte});
  return *this;
}

CardTrace& CardTrace::time() {
  _items.insert(_items.end(), {0x01, 0x10, 0x80, 0xA4, 4, 5, 6, 7, 8});
  return *this;
}

CardTrace& CardTrace::answer(std::uint16_t status) {
  return fromCard(
      {static_cast<std::uint8_t>(status >> 8), static_cast<std::uint8_t>(status & 0xFF)});
}

CardTrace& CardTrace::reset() { return fromCard({0x3B, 0x9F, 0x96, 0x80, 0x1F, 0x3B, 0x00}); }

CardTrace& CardTrace::send(const Bytes& header, const Bytes& data, std::uint16_t status) {
  Bytes whole = header;
  whole.push_back(static_cast<std::uint8_t>(data.size()));
  return time().toCard(whole).fromCard({0x60, header[1]}).toCard(data).answer(status);
}

CardTrace& CardTrace::ask(Bytes header, const Bytes& data, std::uint16_t status) {
  header.push_back(static_cast<std::uint8_t>(data.size()));
  return time().toCard(header).fromCard({header[1]}).fromCard(data).answer(status);
}

CardTrace& CardTrace::select(std::uint16_t file, std::uint8_t kind) {
  return send({kind, 0xA4, 0x00, 0x04},
              {static_cast<std::uint8_t>(file >> 8), static_cast<std::uint8_t>(file & 0xFF)},
              0x6120);
}

CardTrace& CardTrace::selectUsim(std::uint8_t kind) {
  return send({kind, 0xA4, 0x04, 0x04},
              {0xA0, 0, 0, 0, 0x87, 0x10, 0x02, 0xFF, 0x49, 0xFF, 0x05, 0x89});
}

CardTrace& CardTrace::read(const Bytes& content, std::uint8_t kind, std::uint16_t offset) {
  return ask({kind, 0xB0, static_cast<std::uint8_t>(offset >> 8),
              static_cast<std::uint8_t>(offset & 0xFF)},
             content);
}

Bytes cardLog(const Bytes& items) { return BodyWriter().u8(items.size()).bytes(items); }

}  // namespace qel::diagnostics::test
