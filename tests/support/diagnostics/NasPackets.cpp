#include "support/diagnostics/NasPackets.h"

#include <algorithm>

#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {
namespace {

const Bytes kNetwork = {0x00, 0xF1, 0x10};  // 001/01

Bytes message(unsigned type, std::initializer_list<unsigned> mandatory,
              std::initializer_list<Bytes> elements) {
  BodyWriter writer;
  writer.u8(0x07).u8(type);
  for (const unsigned octet : mandatory) writer.u8(octet);
  for (const Bytes& element : elements) writer.bytes(element);
  return writer;
}

Bytes counted(const Bytes& value) { return BodyWriter().u8(value.size()).bytes(value); }

Bytes bigEndian(std::uint32_t value, unsigned bytes) {
  Bytes written;
  for (unsigned i = bytes; i > 0; --i) {
    written.push_back(static_cast<std::uint8_t>(value >> ((i - 1) * 8)));
  }
  return written;
}

}  // namespace

Bytes plainNas(const Bytes& message, unsigned version) {
  return BodyWriter().u8(version).u8(9).u8(5).u8(0).bytes(message);
}

Bytes emmState(unsigned state, unsigned substate, const std::optional<WrittenGuti>& guti) {
  BodyWriter body;
  body.u8(2).u8(state).u16(substate).bytes(kNetwork);
  if (!guti) return body.zeros(12);
  body.u8(1).u8(1).bytes(kNetwork);
  return body.u16(guti->group).u8(guti->entity).u32(guti->mTmsi);
}

Bytes gutiElement(const WrittenGuti& guti) {
  BodyWriter element;
  element.u8(0x50).u8(11).u8(0xF6).bytes(kNetwork).bytes(bigEndian(guti.group, 2));
  return element.u8(guti.entity).bytes(bigEndian(guti.mTmsi, 4));
}

Bytes equivalentsElement(std::initializer_list<std::uint32_t> networks) {
  BodyWriter element;
  element.u8(0x4A).u8(networks.size() * 3);
  for (const std::uint32_t network : networks) element.bytes(bigEndian(network, 3));
  return element;
}

Bytes featuresElement(bool voice, bool emergency) {
  return {0x64, 1, static_cast<std::uint8_t>((voice ? 1 : 0) | (emergency ? 2 : 0))};
}

Bytes areasValue(std::initializer_list<unsigned> codes) {
  BodyWriter value;
  value.u8(codes.size() - 1).bytes(kNetwork);
  for (const unsigned code : codes) value.bytes(bigEndian(code, 2));
  return value;
}

Bytes attachRequest(unsigned type) { return message(0x41, {0x70 | type, 0x0B}, {}); }

Bytes attachAccept(unsigned t3412, const Bytes& areas, std::initializer_list<Bytes> elements) {
  Bytes accept =
      message(0x42, {0x02, t3412}, {counted(areas), Bytes{0x00, 0x03, 0x52, 0x01, 0xC1}});
  for (const Bytes& element : elements) accept.insert(accept.end(), element.begin(), element.end());
  return accept;
}

Bytes attachReject(unsigned cause) { return message(0x44, {cause}, {}); }
Bytes updateRequest(unsigned type) { return message(0x48, {0x70 | type, 0x0B}, {}); }

Bytes updateAccept(std::initializer_list<Bytes> elements) { return message(0x49, {0}, elements); }

Bytes updateReject(unsigned cause) { return message(0x4B, {cause}, {}); }
Bytes serviceReject(unsigned cause) { return message(0x4E, {cause}, {}); }
Bytes serviceRequest() { return {0xC7, 0x25, 0x12, 0x34}; }
Bytes detachRequest(unsigned type) { return message(0x45, {0x70 | type}, {}); }

Bytes activateConnection(const WrittenConnection& connection) {
  Bytes name;
  std::string_view rest = connection.apn;
  while (!rest.empty()) {
    const auto label = rest.substr(0, rest.find('.'));
    name.push_back(static_cast<std::uint8_t>(label.size()));
    name.insert(name.end(), label.begin(), label.end());
    rest.remove_prefix(std::min(rest.size(), label.size() + 1));
  }
  Bytes address = {static_cast<std::uint8_t>(connection.type)};
  address.insert(address.end(), connection.address.begin(), connection.address.end());
  BodyWriter writer;
  writer.u8(connection.bearer << 4U | 2U).u8(1).u8(0xC1).bytes(Bytes{1, 9});
  writer.bytes(counted(name)).bytes(counted(address));
  if (connection.nameServers.empty()) return writer;
  BodyWriter options;
  options.u8(0x80);
  for (const Bytes& server : connection.nameServers) {
    options.u8(0).u8(server.size() == 4 ? 0x0D : 0x03).bytes(counted(server));
  }
  return writer.bytes(Bytes{0x58, 0x32}).u8(0x27).bytes(counted(options));
}

Bytes rejectActivation(unsigned bearer) {
  return {static_cast<std::uint8_t>(bearer << 4U | 2U), 1, 0xC3, 0x1A};
}

Bytes deactivateBearer(unsigned bearer) {
  return {static_cast<std::uint8_t>(bearer << 4U | 2U), 0, 0xCD, 0x24};
}

}  // namespace qel::diagnostics::test
