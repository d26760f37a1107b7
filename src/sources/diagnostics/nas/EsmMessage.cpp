#include "sources/diagnostics/nas/EsmMessage.h"

#include <array>

#include "sources/diagnostics/nas/EpsElements.h"
#include "sources/diagnostics/nas/InformationElements.h"

namespace qel::diagnostics {
namespace {

constexpr std::uint8_t kSessionManagement = 2;  // protocol discriminator
constexpr std::uint32_t kFirstBearer = 5;

constexpr std::uint8_t kOptions = 0x27;
constexpr std::uint8_t kLongOptions = 0x7B;
constexpr std::array kFixed = {FixedElement{0x32, 1}, FixedElement{0x58, 1}};

bool takeOptional(ByteView rest, PacketConnection& connection) {
  OptionalElements elements(rest, Protocol::eps, kFixed);
  while (const auto element = elements.next()) {
    if (element->identifier != kOptions && element->identifier != kLongOptions) continue;
    const auto servers = nameServers(element->value);
    if (!servers) return false;
    connection.nameServers = *servers;
  }
  return !elements.failed();
}

bool readActivation(ElementReader& reader, PacketConnection& connection) {
  reader.counted();  // the quality of service
  const ByteView name = reader.counted();
  const ByteView address = reader.counted();
  if (reader.failed()) return false;
  const auto apn = accessPointName(name);
  const auto given = pdnAddress(address);
  if (!apn || !given) return false;
  connection.apn = *apn;
  connection.type = given->type;
  connection.address = given->address;
  return takeOptional(reader.rest(), connection);
}

}  // namespace

std::optional<EsmMessage> readEsmMessage(ByteView bytes) {
  ElementReader reader(bytes);
  const std::uint8_t head = reader.octet();
  reader.octet();  // the procedure's transaction
  const std::uint8_t type = reader.octet();
  if (reader.failed() || (head & 0xF) != kSessionManagement) return std::nullopt;
  EsmMessage message;
  message.bearer = head >> 4;
  switch (static_cast<EsmType>(type)) {
    case EsmType::activateRequest:
      message.connection.nsapi = message.bearer;
      if (!readActivation(reader, message.connection)) return std::nullopt;
      break;
    case EsmType::activateReject:
    case EsmType::deactivateRequest:
      break;
    default:
      return message;
  }
  if (message.bearer < kFirstBearer) return std::nullopt;
  message.type = static_cast<EsmType>(type);
  return message;
}

}  // namespace qel::diagnostics
