#include "sources/diagnostics/nas/EmmMessage.h"

#include <array>

#include "sources/diagnostics/nas/EpsElements.h"
#include "sources/diagnostics/nas/InformationElements.h"

namespace qel::diagnostics {
namespace {

constexpr std::uint8_t kMobilityManagement = 7;  // protocol discriminator

// Security headers (clause 9.3.1).
constexpr std::uint8_t kPlain = 0;
constexpr std::uint8_t kIntegrityProtected = 1;
constexpr std::uint8_t kNewIntegrityProtected = 3;
constexpr std::uint8_t kServiceRequestHeader = 12;
constexpr std::size_t kSecurityOctets = 6;

// Values of EmmProcedure.
constexpr std::int32_t kAttachAlone = 1;
constexpr std::int32_t kAttachCombined = 2;
constexpr std::int32_t kAttachEmergency = 3;
constexpr std::int32_t kUpdate = 4;
constexpr std::int32_t kUpdateCombined = 5;
constexpr std::int32_t kUpdatePeriodic = 6;
constexpr std::int32_t kService = 7;

// Elements without a length of their own, in attach and update accept and the rejects.
constexpr std::array kFixed = {
    FixedElement{0x13, 5}, FixedElement{0x17, 1}, FixedElement{0x53, 1},
    FixedElement{0x59, 1}, FixedElement{0x5A, 1}, FixedElement{0x5B, 1},
};

std::int32_t attachProcedure(std::uint8_t octet) {
  switch (octet & 7) {
    case 2:
      return kAttachCombined;
    case 6:
      return kAttachEmergency;
    default:
      return kAttachAlone;
  }
}

std::int32_t updateProcedure(std::uint8_t octet) {
  switch (octet & 7) {
    case 1:
    case 2:
      return kUpdateCombined;
    case 3:
      return kUpdatePeriodic;
    default:
      return kUpdate;
  }
}

template <class Value>
bool take(std::optional<Value>&& value, std::optional<Value>& field) {
  if (value) field = std::move(value);
  return field.has_value();
}

// False where the element is damaged.
bool takeElement(const Element& element, EmmMessage& message) {
  const ByteView value = element.value;
  switch (element.identifier) {
    case 0x4A:
      return take(networkList(value), message.equivalents);
    case 0x50:
      return take(temporaryIdentity(value), message.identity);
    case 0x53:
      message.cause = value[0];
      return true;
    case 0x54:
      return take(trackingAreas(value), message.areas);
    case 0x57:
      if (value.size() < 2) return false;
      message.activeBearers = std::uint32_t{value[1]} << 8 | value[0];
      return true;
    case 0x5A:
      message.t3412 = value[0];
      return true;
    case 0x5E:
      if (value.empty()) return false;
      message.longT3412 = value[0];
      return true;
    case 0x64:
      if (value.empty()) return false;
      message.voice = (value[0] & 1) != 0;
      message.emergency = (value[0] & 2) != 0;
      return true;
    default:
      return true;
  }
}

bool takeOptional(ByteView rest, EmmMessage& message) {
  OptionalElements elements(rest, Protocol::eps, kFixed);
  while (const auto element = elements.next()) {
    if (!takeElement(*element, message)) return false;
  }
  return !elements.failed();
}

bool readAttachAccept(ElementReader& reader, EmmMessage& message) {
  reader.octet();  // the result
  message.t3412 = reader.octet();
  const ByteView areas = reader.counted();
  reader.longCounted();  // a message of session management, which comes on its own too
  if (reader.failed() || !take(trackingAreas(areas), message.areas)) return false;
  return takeOptional(reader.rest(), message);
}

bool readIdentityCommand(ElementReader& reader, EmmMessage& message) {
  const ByteView identity = reader.counted();
  if (reader.failed() || !take(temporaryIdentity(identity), message.identity)) return false;
  return takeOptional(reader.rest(), message);
}

bool readBody(ElementReader& reader, EmmMessage& message) {
  switch (message.type) {
    case EmmType::attachRequest:
      message.procedure = attachProcedure(reader.octet());
      return !reader.failed();
    case EmmType::updateRequest:
      message.procedure = updateProcedure(reader.octet());
      return !reader.failed();
    case EmmType::detachRequest:
      message.detachType = reader.octet() & 7;
      return !reader.failed();
    case EmmType::extendedServiceRequest:
      message.procedure = kService;
      return true;
    case EmmType::attachAccept:
      return readAttachAccept(reader, message);
    case EmmType::updateAccept:
      reader.octet();  // the result
      return !reader.failed() && takeOptional(reader.rest(), message);
    case EmmType::attachReject:
    case EmmType::updateReject:
    case EmmType::serviceReject:
      message.cause = reader.octet();
      return !reader.failed();
    case EmmType::identityCommand:
      return readIdentityCommand(reader, message);
    default:
      return true;
  }
}

EmmType typeOf(std::uint8_t octet) {
  switch (static_cast<EmmType>(octet)) {
    case EmmType::attachRequest:
    case EmmType::attachAccept:
    case EmmType::attachReject:
    case EmmType::detachRequest:
    case EmmType::detachAccept:
    case EmmType::updateRequest:
    case EmmType::updateAccept:
    case EmmType::updateReject:
    case EmmType::extendedServiceRequest:
    case EmmType::serviceRequest:
    case EmmType::serviceReject:
    case EmmType::identityCommand:
      return static_cast<EmmType>(octet);
    default:
      return EmmType::other;
  }
}

}  // namespace

std::optional<EmmMessage> readEmmMessage(ByteView bytes) {
  if (bytes.empty() || (bytes[0] & 0xF) != kMobilityManagement) return std::nullopt;
  EmmMessage message;
  std::uint8_t security = bytes[0] >> 4;
  if (security >= kServiceRequestHeader) {
    message.type = EmmType::serviceRequest;
    message.procedure = kService;
    return message;
  }
  if (security == kIntegrityProtected || security == kNewIntegrityProtected) {
    if (bytes.size() <= kSecurityOctets) return std::nullopt;
    bytes = bytes.subspan(kSecurityOctets);
    if ((bytes[0] & 0xF) != kMobilityManagement) return message;  // session management's
    security = bytes[0] >> 4;
  }
  if (security != kPlain) return message;
  ElementReader reader(bytes.subspan(1));
  message.type = typeOf(reader.octet());
  if (reader.failed() || !readBody(reader, message)) return std::nullopt;
  return message;
}

}  // namespace qel::diagnostics
