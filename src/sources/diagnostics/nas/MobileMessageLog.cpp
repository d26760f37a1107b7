// What network and phone say to each other about registration and connections (24.008).
#include <algorithm>

#include "sources/Metrics.h"
#include "sources/diagnostics/nas/MobileCodes.h"
#include "sources/diagnostics/nas/MobileLogs.h"
#include "sources/diagnostics/nas/MobileMessages.h"
#include "sources/diagnostics/nas/MobileRegistration.h"
#include "sources/diagnostics/nas/PacketContexts.h"
#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {
namespace {

enum Discriminator : std::uint8_t { kMobility = 5, kPacketMobility = 8, kSession = 10 };

struct Message {
  bool fromPhone = false;
  std::uint8_t discriminator = 0;
  std::uint8_t type = 0;
  std::uint32_t transaction = 0;  // of sessions: as the phone numbers it
  ByteView body;                  // behind the type
};

using Take = Outcome (*)(const Message& message, Picture& picture, Told& told);

// From what a reader gives to the picture.
template <auto read, auto apply>
Outcome take(const Message& message, Picture& picture, Told& told) {
  const auto value = read(message.body);
  if (!value) return Outcome::damaged;
  apply(*value, picture, told);
  return Outcome::understood;
}

template <auto apply>
Outcome takeTransaction(const Message& message, Picture& picture, Told& told) {
  apply(message.transaction, picture, told);
  return Outcome::understood;
}

template <auto apply>
Outcome takeAlone(const Message& /*message*/, Picture& picture, Told& told) {
  apply(picture, told);
  return Outcome::understood;
}

std::optional<std::uint8_t> firstOctet(ByteView body) {
  return body.empty() ? std::nullopt : std::optional(body[0]);
}

Outcome takeActivateRequest(const Message& message, Picture& picture, Told& /*told*/) {
  auto connection = readActivateRequest(message.body);
  if (!connection) return Outcome::damaged;
  askForContext(message.transaction, std::move(*connection), picture);
  return Outcome::understood;
}

Outcome takeActivateAccept(const Message& message, Picture& picture, Told& told) {
  auto accept = readActivateAccept(message.body);
  if (!accept) return Outcome::damaged;
  activateContext(message.transaction, std::move(*accept), picture, told);
  return Outcome::understood;
}

constexpr bool kPhone = true;
constexpr bool kNetwork = false;

struct MessageRow {
  std::uint8_t discriminator;
  std::uint8_t type;
  bool fromPhone;
  Take take;
};

// 24.008, tables 10.2, 10.4 and 10.4a.
constexpr MessageRow kMessages[] = {
    {kMobility, 0x01, kPhone, takeAlone<takeImsiDetach>},
    {kMobility, 0x02, kNetwork, take<readLocationAccept, takeLocationAccept>},
    {kMobility, 0x04, kNetwork, take<firstOctet, takeLocationReject>},
    {kMobility, 0x08, kPhone, takeAlone<takeLocationRequest>},
    {kMobility, 0x11, kNetwork, takeAlone<takeAuthenticationReject>},
    {kMobility, 0x1A, kNetwork, take<readNewTmsi, takeNewTmsi>},
    {kPacketMobility, 0x01, kPhone, take<readAttachType, takeAttachRequest>},
    {kPacketMobility, 0x02, kNetwork, take<readAttachAccept, takeAttachAccept>},
    {kPacketMobility, 0x04, kNetwork, take<firstOctet, takePacketReject>},
    {kPacketMobility, 0x05, kPhone, take<firstOctet, takePhonesDetach>},
    {kPacketMobility, 0x05, kNetwork, take<firstOctet, takeNetworksDetach>},
    {kPacketMobility, 0x08, kPhone, take<readUpdateType, takeUpdateRequest>},
    {kPacketMobility, 0x09, kNetwork, take<readUpdateAccept, takeUpdateAccept>},
    {kPacketMobility, 0x0B, kNetwork, take<firstOctet, takePacketReject>},
    {kPacketMobility, 0x0C, kPhone, takeAlone<takeServiceRequest>},
    {kPacketMobility, 0x0D, kNetwork, takeAlone<takeServiceAccept>},
    {kPacketMobility, 0x0E, kNetwork, take<firstOctet, takePacketReject>},
    {kPacketMobility, 0x14, kNetwork, takeAlone<takePacketAuthenticationReject>},
    {kSession, 0x41, kPhone, takeActivateRequest},
    {kSession, 0x42, kNetwork, takeActivateAccept},
    {kSession, 0x43, kNetwork, takeTransaction<endContext>},
    {kSession, 0x46, kPhone, takeTransaction<endContext>},
    {kSession, 0x46, kNetwork, takeTransaction<endContext>},
};

// Sessions have the number of their transaction beside the discriminator: with a flag for who
// receives what the other one numbered, and in an octet of its own from seven on (24.007, clause
// 11.2.3.1.3). Of transactions that the network numbers nothing is read.
bool readTransaction(Message& message, ByteView& bytes) {
  constexpr std::uint32_t kExtended = 7;
  const bool toItsOwner = (bytes[0] & 0x80) != 0;
  message.transaction = bytes[0] >> 4 & 7U;
  if (message.transaction == kExtended) {
    bytes = bytes.subspan(1);
    message.transaction = bytes[0] & 0x7FU;
  }
  return toItsOwner != message.fromPhone;
}

Outcome readMessage(ByteView bytes, bool fromPhone, Message& message) {
  constexpr std::size_t kMostHeadBytes = 3;
  if (bytes.size() < 2) return Outcome::damaged;
  message.fromPhone = fromPhone;
  message.discriminator = bytes[0] & 0xF;
  if (message.discriminator == kSession) {
    if (bytes.size() < kMostHeadBytes && (bytes[0] & 0x70) == 0x70) return Outcome::damaged;
    if (!readTransaction(message, bytes)) return Outcome::notOurs;
  } else if ((bytes[0] & 0xF0) != 0) {
    return Outcome::notOurs;  // to be skipped by whoever receives it
  }
  // The two highest bits of mobility's types count messages.
  message.type = message.discriminator == kMobility ? bytes[1] & 0x3F : bytes[1];
  message.body = bytes.subspan(2);
  return Outcome::understood;
}

}  // namespace

Outcome readMobileMessage(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kHeadBytes = 5;
  const ByteView body = packet.body;
  if (body.size() < kHeadBytes || body[0] > 1) return Outcome::damaged;
  if (u32At(body, 1) > body.size() - kHeadBytes) return Outcome::damaged;
  Message message;
  const Outcome head = readMessage(body.subspan(kHeadBytes, u32At(body, 1)), body[0] == 1, message);
  if (head != Outcome::understood) return head;
  const auto row = std::ranges::find_if(kMessages, [&](const MessageRow& candidate) {
    return candidate.discriminator == message.discriminator && candidate.type == message.type &&
           candidate.fromPhone == message.fromPhone;
  });
  return row == std::end(kMessages) ? Outcome::notOurs : row->take(message, picture, told);
}

}  // namespace qel::diagnostics
